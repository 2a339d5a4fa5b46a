#include "qn/dsc/osdep/FatalError.h"

#include <cstdlib>

namespace qn::dsc::osdep {

void FatalError(const char* message) {
    ShowFatalMessage(message);
    std::_Exit(1);
}

}  // namespace qn::dsc::osdep
