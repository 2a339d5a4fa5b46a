#include "qn/dsc/osdep/FatalError.h"

#include <cstdio>
#include <cstdlib>

namespace qn::dsc::osdep {

void FatalError(const char* message) {
    std::fprintf(stderr, "Fatal Error: %s\n", message);
    std::_Exit(1);
}

}  // namespace qn::dsc::osdep
