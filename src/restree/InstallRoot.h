#pragma once

// The one thing that the tree asks of what stands above it; defined in cachebuilder/InstallRoot.cpp.

#include "qn/dsc/StringBase.h"

namespace zkhw {

// The folder that relative paths of resource files start from, in ":Include" elements and in the cache. In a host's
// process it is the folder of the executable, with a backslash at its end. For the tool it is the nearest folder, from
// its own upwards, that holds one of the host's executables, or else the root of the drive. It has a backslash at its
// end only where it is the tool's own folder or a root.
// Throws WinError if the system doesn't tell where the executable is. Reads the disk at the first call only.
qn::dsc::String GetInstallRoot();

}  // namespace zkhw
