#pragma once

// Where the program's own file stands. Every operation throws WinError if the system doesn't tell.

#include "qn/dsc/StringBase.h"

namespace qn::dsc::osdep {

// The absolute path of the executable. In a library it is that of the host's executable.
String _GetExeFullPath();

// Its folder, absolute, with a backslash at the end.
String GetExecutableDir();

// Its file name up to the last "."; all of it if it has none.
String GetExecutableBaseName();

}  // namespace qn::dsc::osdep
