#include <cstdio>

#include "qn/dsc/osdep/FatalError.h"

namespace qn::dsc::osdep {

void ShowFatalMessage(const char* message) {
    std::fprintf(stderr, "Fatal Error: %s\n", message);
}

}  // namespace qn::dsc::osdep
