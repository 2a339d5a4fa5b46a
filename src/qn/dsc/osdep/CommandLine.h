#pragma once

// Paths that come from outside, as arguments of the program or from a host.

#include "qn/dsc/StringBase.h"

namespace qn::dsc::osdep {

// The path of `argument` in the system's form. Null and empty give the empty path.
//
// On Linux the bytes are read as those of file names are (NativeText.h), and the text is taken
// - as a native path if it begins with a slash: "/opt/host" is "C:\opt\host". A backslash is then part of a name;
// - otherwise, if it holds a backslash, as being in the system's form already, and as it stands: "C:\opt\host",
//   "Targets\QN", also "Targets\QN/FPGA";
// - otherwise as a native relative path: "Targets/QN/" is "Targets\QN\", "." and ".." are themselves. A first folder
//   that would read as a drive is kept apart from one: "c:/x" is ".\c:\x". "C:" without a slash stays a bare drive.
// Repeated slashes of a native path count as one. Nothing is folded, and the disk isn't touched.
// On Windows the argument is in the system's form as it comes.
String PathFromArgument(const char* argument);

}  // namespace qn::dsc::osdep
