#pragma once

// Paths of files and folders. A path is a plain String with the backslash as separator. It is absolute if it begins
// with two backslashes (a network path), or with one or two ASCII letters, a colon and a backslash. The forward slash
// is no separator in any of the textual operations.
//
// The first group is pure text, linear in the path. The second touches the disk, through FileSystem.h; its operations
// throw what they say and std::bad_alloc.

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/TimeStamp.h"

namespace qn::dsc::osdep {

bool IsAbsolutePath(const String& path);

// `part` behind `base`, with one backslash between unless `base` ends in one; `part` alone if it is absolute or `base`
// is empty. So an empty `part` gives `base` with a backslash at its end.
String JoinPath(const String& base, const String& part);

// The same in place, so that a path of many parts takes time in proportion to its text. `part` is another text.
void AppendPathPart(String& base, const String& part);

// What stands behind the last backslash: nothing for a path that ends in one, and for a bare drive ("C:").
String GetFileName(const String& path);

// The path without its last part and without the backslashes before that part. A backslash at the end counts as the
// separator of an empty last part: "C:\a\b\" gives "C:\a\b". What has no further folder (a root, a bare drive, the
// empty path) is given as it is; "a" gives "".
String GetDirectoryName(const String& path);

// Appends a backslash unless the path ends in one. InvalidArgument if it is empty.
void AppendSeparator(String& path);

// `path` with "." and ".." folded away, as text. Empty for a path that isn't absolute, holds a part "...", or climbs
// past its root. A path without any "." is given as it is. Whether there is a backslash at the end stays as it was, but
// for a root, which always has one.
String NormalizePath(const String& path);

// `path` behind the working directory unless it is absolute; the working directory itself if `path` is empty.
String MakeAbsolutePath(const String& path);

// The working directory; empty if the system can't tell (it may have been removed).
String GetCurrentDirectoryPath();

// Whether `path` is absolute and names a folder. False for anything odd, no memory included; never throws.
bool IsDirectory(const String& path) noexcept;

// Whether `path` names something that is no folder. InvalidArgument if it isn't absolute.
bool IsExistingFile(const String& path);

// The last-write time of a file or folder; zero if it can't be read.
TimeStamp GetFileModificationTime(const String& path);

// Copies the bytes of one file, in blocks of 4096. A file that stands at `destination` is overwritten or, if
// `overwrite` is false, refused. Overwriting begins at the first block that differs, so that a copy which is there
// already is only read, and gets the present as its write time. At any moment `destination` holds its old bytes or a
// beginning of the new ones. Equal paths (by Compare), and two names of one file: the bytes stay. InvalidArgument: a
// path isn't absolute. FileAlreadyExists: refused. PosixError: one of the two can't be opened. FileReadFailed,
// FileWriteFailed: the copy broke off, at the end of what `destination` then holds.
void CopyFileTo(const String& source, const String& destination, bool overwrite);

// Creates the folders of `path` that are missing, from the top. What stands behind the last backslash is not created.
// InvalidArgument: the path isn't absolute, has no backslash behind the server of a network path, or reaches a folder
// whose name ends in "."; the folders above that one are made. Otherwise as CreateOneDirectory.
void CreateDirectoryPath(const String& path);

// Creates one folder. ObjectAlreadyExists: a folder or file of that name stands. AccessDenied with the path: any other
// failure, such as a missing parent.
void CreateOneDirectory(const String& path);

// Copies what is in the folder `source` into the folder `destination`, which is created if need be, folders with all
// that is in them. Entries are taken in listing order, the content of a folder when it is met. Files that stand are
// overwritten, others left alone. A folder that is being copied further up the path, or copied into, is not entered, so
// links that lead back end the copy there.
// InvalidArgument: a path isn't absolute. NonexistentException: `source` is no folder. Otherwise as CreateDirectoryPath
// and CopyFileTo; the copies made so far stay.
// Uses no stack for the depth of the tree.
void CopyDirectoryTree(const String& source, const String& destination);

}  // namespace qn::dsc::osdep
