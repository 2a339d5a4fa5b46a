#pragma once

namespace qn::dsc::osdep {

// Tells the user and ends the process on the spot with exit code 1; nothing is taken down.
[[noreturn]] void FatalError(const char* message);

// How FatalError tells the user. On Linux the message is one line on the error stream, "Fatal Error: " and the text; on
// Windows a message box with the title "Fatal Error", which waits for the user. What is linked to tests has another
// definition of this one function there, which waits for nobody.
void ShowFatalMessage(const char* message);

}  // namespace qn::dsc::osdep
