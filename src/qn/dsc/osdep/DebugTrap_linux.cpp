#include "qn/dsc/osdep/DebugTrap.h"

#include <csignal>
#include <cstdlib>

#include <pthread.h>

namespace qn::dsc::osdep {

void DebugTrap() {
    // The default action, unblocked, so that the signal ends the process whatever was set up before.
    std::signal(SIGTRAP, SIG_DFL);
    sigset_t trap;
    sigemptyset(&trap);
    sigaddset(&trap, SIGTRAP);
    pthread_sigmask(SIG_UNBLOCK, &trap, nullptr);
    std::raise(SIGTRAP);
    // Reached only under a debugger that swallowed the signal.
    std::abort();
}

}  // namespace qn::dsc::osdep
