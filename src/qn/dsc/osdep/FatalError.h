#pragma once

namespace qn::dsc::osdep {

// Tells the user and ends the process on the spot with exit code 1; nothing is taken down. On Linux the message is one
// line on the error stream, "Fatal Error: " and the text; on Windows a message box with the title "Fatal Error".
[[noreturn]] void FatalError(const char* message);

}  // namespace qn::dsc::osdep
