// What tests have in the place of the message box, which would wait for somebody to click: the line that Linux prints.

#include <io.h>

#include <string>

#include "qn/dsc/osdep/FatalError.h"

namespace qn::dsc::osdep {

void ShowFatalMessage(const char* message) {
    const std::string line = std::string("Fatal Error: ") + message + "\n";
    _write(2, line.data(), static_cast<unsigned int>(line.size()));
}

}  // namespace qn::dsc::osdep
