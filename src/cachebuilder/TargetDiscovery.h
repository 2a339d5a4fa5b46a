#pragma once

// Finding the resource files of an installation, and the paths that are noted for them.

#include <cstdint>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/TimeStamp.h"
#include "restree/InstallRoot.h"

namespace zkhw {

using qn::dsc::String;

// Appends the full paths of all files below `directory` whose names match `pattern` ("*resource.xml"): a folder's own
// matches first, then each of its folders in listing order with all that is below. A folder whose own name matches
// counts as a file too. A folder that is already on the present path (a link that leads back up) is not entered.
// `pattern` is for a name: no separators. The folders of a `directory` that isn't absolute are not entered.
// A folder that can't be listed is passed over. So is the rest of a folder for which the memory gives out; what was
// found stays. Each folder is listed once. Uses no stack for the depth of the folders.
void FindResourceFiles(const String& directory, const String& pattern, std::vector<String>& files);

// Whether one of those files was written after `time`. A file whose time can't be read counts as zero. Asks each for
// its time as it is found, and ends with the first that is newer.
bool IsAnyResourceFileNewer(const String& directory, const String& pattern, const qn::dsc::osdep::TimeStamp& time);

// Whether `path` ends in "Targets\QN\FPGA\hosts_resource.xml", in any letter case.
bool IsHostsResourceFile(const String& path);

// The path that leads from the folder `base` to `target`, as text: "..\" for each folder to leave, then the rest.
// Where the two have no drive in common it is all of `target`; so it is for a `base` with a backslash at its end that
// is more than a root. 0, or 0x80070057 if one of the two isn't absolute; `result` is then untouched.
int32_t MakeRelativePath(String base, String target, String& result);

}  // namespace zkhw
