#pragma once

// What the parts of the file system on Windows have in common: paths as its calls take them, and its errors.

#include <windows.h>

#include <cstdint>
#include <string>
#include <string_view>

#include "qn/dsc/osdep/FileSystem.h"

namespace qn::dsc::osdep {

// A path as it is handed to the system.
struct CallPath {
    std::u16string text;
    // It was written with a separator at its end, so it can only name a folder.
    bool endsInSeparator = false;
};

// The absolute form of `path` up to its first NUL, folded, and with the prefix that makes the system take it as it
// stands: without it the system drops full stops and blanks at the end of names, takes "con" or "aux.xml" for devices
// and has a limit of 260 units. 0; ENOENT for the empty path and for paths that can name no file, such as "\.\pipe";
// or why the start of a relative path can't be had.
int MakeCallPath(std::u16string_view path, CallPath& call);

// The errno number for one of the system's; EIO if there is no better one.
int ErrnoOf(DWORD number);
int LastErrno();

bool IsFolder(DWORD attributes);
bool IsLink(DWORD attributes);
uint64_t TicksOf(const FILETIME& time);

// Of a folder or a file; links are followed. 0 or an errno number.
int ReadFileInformation(const std::u16string& path, BY_HANDLE_FILE_INFORMATION& information);
int ReadCallAttributes(const std::u16string& path, FileAttributes& attributes);
int ReadCallIdentity(const CallPath& call, FileIdentity& identity);

}  // namespace qn::dsc::osdep
