#include <windows.h>

#include "qn/dsc/osdep/FatalError.h"

namespace qn::dsc::osdep {

void ShowFatalMessage(const char* message) {
    static_assert((MB_TASKMODAL | MB_ICONSTOP | MB_OK) == 0x2010);
    MessageBoxA(nullptr, message, "Fatal Error", MB_TASKMODAL | MB_ICONSTOP | MB_OK);
}

}  // namespace qn::dsc::osdep
