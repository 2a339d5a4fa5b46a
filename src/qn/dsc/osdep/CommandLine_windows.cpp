#include "qn/dsc/osdep/CommandLine.h"

namespace qn::dsc::osdep {

String PathFromArgument(const char* argument) {
    return String(argument);
}

}  // namespace qn::dsc::osdep
