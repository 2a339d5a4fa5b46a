#include "qn/dsc/osdep/DebugTrap.h"

#include <windows.h>

namespace qn::dsc::osdep {

void DebugTrap() {
    // No handler that was set up before may turn it into anything else than the end.
    SetUnhandledExceptionFilter(nullptr);
    DebugBreak();
    // Reached only under a debugger that went on.
    TerminateProcess(GetCurrentProcess(), static_cast<UINT>(EXCEPTION_BREAKPOINT));
    __builtin_unreachable();
}

}  // namespace qn::dsc::osdep
