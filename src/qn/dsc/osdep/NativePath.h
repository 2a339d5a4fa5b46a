#pragma once

// The two forms of a path on Linux, where one drive, "C:", holds everything:
//
//     C:\                     /
//     C:\opt\host\Targets     /opt/host/Targets
//     another drive, \\...    names nothing
//
// Names go through the rule of NativeText.h, and one exchange more: a backslash in a native name, which would be
// a separator in the system's form, is U+F05C there. (A native name that has U+F05C itself reads the same; it is found
// by the search for names of other letter case.) Nothing in this unit touches the disk but the working folder of a
// relative path.

#include <cstddef>
#include <string>
#include <string_view>

#include "qn/dsc/StringBase.h"

namespace qn::dsc::osdep {

// Appends the units of one native name.
void AppendNameUnits(std::string_view name, std::u16string& units);

// A native path, absolute or relative, in the system's form. Repeated slashes count as one; a slash at the end stays.
// A relative path that would read as one with a drive gets ".\" before it.
String SystemPathFromNative(std::string_view native);

// As many units as an NTFS path can have. A copy of a folder into itself by ways that can't be seen ends here.
inline constexpr size_t longestSystemPath = 32767;

struct NativePath {
    // Absolute, with neither "." nor ".." nor an empty name; no slash at the end, but for the root.
    std::string text;
    // The last part of the path as units, before it became bytes; for the pattern of a search. Empty for the root.
    std::u16string lastName;
    // The path was written with a separator at its end, so it can only name a folder. Not set for the root.
    bool endsInSeparator = false;
};

// The native form of a path in the system's form. Gives 0, ENOENT if the path can name nothing, ENAMETOOLONG, or why
// the working folder couldn't be read. A path ends at its first NUL. A forward slash is a separator. "." and ".." are
// folded as text, and ".." at the root stays there. "c:" is "C:"; "\a" is "C:\a"; a relative path, also one behind a
// bare "C:", starts at the working folder.
int MakeNativePath(const String& path, NativePath& native);

}  // namespace qn::dsc::osdep
