#include <windows.h>

#include <cstdio>

#include "support/ProcessEnd.h"

namespace qn::dsc::osdep {

std::string EndWithResult(uint32_t result) {
    char text[32];
    std::snprintf(text, sizeof text, result < 256 ? "exit %lu" : "exit 0x%08lX", static_cast<unsigned long>(result));
    return text;
}

bool EndsByTrap(int status) {
    return static_cast<DWORD>(status) == static_cast<DWORD>(EXCEPTION_BREAKPOINT);
}

}  // namespace qn::dsc::osdep
