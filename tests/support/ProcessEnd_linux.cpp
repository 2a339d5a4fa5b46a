#include <csignal>

#include <sys/wait.h>

#include "support/ProcessEnd.h"

namespace qn::dsc::osdep {

std::string EndWithResult(uint32_t result) {
    return "exit " + std::to_string(result & 0xFF);
}

bool EndsByTrap(int status) {
    return WIFSIGNALED(status) && WTERMSIG(status) == SIGTRAP;
}

}  // namespace qn::dsc::osdep
