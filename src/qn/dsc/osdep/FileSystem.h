#pragma once

// What the foundation asks of the operating system's files: one interface, with one implementation per platform.
// path.h, FileFinder.h, BinaryFile.h, TextStream.h and _GetExeFullPath.h stand on it and are what the rest of the
// system uses.
//
// A path is text in the system's form, with backslashes. A forward slash is taken as a separator as well. "." and ".."
// are folded as text before the disk is asked. A relative path starts at the working directory. A path ends at its
// first NUL. A file's path with a separator at its end names nothing. Names match blind to letter case: the path as it
// stands wins; failing that, the first name in listing order that differs only in case. What is created takes such a
// name.
//
// Operations that can fail give 0 or an errno number; what they give by reference is then untouched. Nothing throws
// but std::bad_alloc. Any thread may call.

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>

#include "qn/dsc/StringBase.h"

namespace qn::dsc::osdep {

struct FileAttributes {
    bool isDirectory = false;
    // 100 ns ticks since 1601-01-01 00:00 UTC.
    uint64_t lastWriteTime = 0;
};

// Two paths name one file or folder exactly if both numbers are the same.
struct FileIdentity {
    uint64_t volume = 0;
    uint64_t file = 0;

    bool operator==(const FileIdentity& other) const = default;
};

// What a listing tells of a name.
struct WalkEntry {
    std::u16string_view name;
    // The name fits the pattern of the walk.
    bool isMatch = false;
    // False: it is no folder. True: it is one, or it takes an Enter to know.
    bool mayBeFolder = false;
};

// How a walk came into a folder.
enum class WayIn {
    // It stands in the folder that it was entered from. Where all of the present path was entered so, no folder is on
    // it twice.
    Direct,
    // By a link, or by something else that may lead anywhere.
    Indirect,
};

// A walk through a folder and those below it, one folder at a time: the last of the present path, which begins with the
// start of the walk, at level 0. Each folder is read once, and open files are few however deep it is. Folders of the
// present path are left in the reverse order; the destructor leaves them all.
class FolderWalk {
  public:
    virtual ~FolderWalk() = default;

    // Reads the names of the present folder: those that match, "." and ".." included, and those that may be folders,
    // "." and ".." not included. They are numbered in listing order, from 0, until the folder is left. A folder that
    // can't be read to its end has the names up to there; one that fails has none. n log n in what is kept.
    virtual int List() = 0;
    virtual size_t EntryCount() const = 0;
    // The name lives until the next Enter, List or Leave.
    virtual WalkEntry EntryAt(size_t number) const = 0;

    // Goes into a folder of the present one; the next List is of that. ENOTDIR if it is none after all. Nothing has
    // changed if it fails or throws.
    virtual int Enter(size_t number, WayIn& way) = 0;
    // Back to the folder that the present one was entered from. Not for level 0.
    virtual void Leave() = 0;

    // The last-write time of an entry, as in FileAttributes; of what a link leads to.
    virtual int ReadWriteTime(size_t number, uint64_t& time) = 0;
    // Which folder stands at a level of the present path.
    virtual int ReadIdentity(size_t level, FileIdentity& identity) = 0;
};

using FileHandle = intptr_t;
using SearchHandle = intptr_t;
inline constexpr FileHandle noFile = -1;
inline constexpr SearchHandle noSearch = -1;

// How a binary file is opened: BinaryMode::Create | BinaryMode::ReadWrite.
struct BinaryMode {
    enum Bits : uint32_t {
        Read = 1,       // Read-only open.
        Write = 2,      // Write-only open.
        ReadWrite = 4,  // Read and write open.
        Truncate = 8,   // Truncates on open.
        Create = 16,    // Creates the file if it is missing, with owner read and write permission.
    };
};

enum class TextMode {
    Reading,
    Writing,  // Creates the file, or empties it.
};

// Lives as long as files are made in one folder; see FileSystem::HoldFolder.
class FolderHold {
  public:
    virtual ~FolderHold() = default;
};

class FileSystem {
  public:
    virtual ~FileSystem() = default;

    // Links are followed, here and everywhere.
    virtual int ReadAttributes(const String& path, FileAttributes& attributes) = 0;
    virtual int ReadIdentity(const String& path, FileIdentity& identity) = 0;

    // Searches the folder of `pattern` for names that match its last part, blind to letter case; "*" stands for any
    // units, "?" for any one unit. "." and ".." are names like any other and come first; the others follow in ascending
    // order of their upper-cased units. `search` is to be given to EndSearch. A folder is read once, in n log n.
    // No match, no such folder or an unreadable one: ENOENT or another number, and nothing is to be ended.
    virtual int BeginSearch(const String& pattern, SearchHandle& search, String& firstName) = 0;
    // ENOENT when there is no further name.
    virtual int NextName(SearchHandle search, String& name) = 0;
    virtual void EndSearch(SearchHandle search) = 0;

    // Begins a walk at `folder`, an absolute path. `pattern` is that of BeginSearch for a name alone.
    virtual int BeginWalk(const String& folder, const String& pattern, std::unique_ptr<FolderWalk>& walk) = 0;

    // EEXIST if a folder or a file of that name stands.
    virtual int MakeFolder(const String& path) = 0;

    // `mode` is a sum of BinaryMode::Bits. EACCES for a folder; for reading also for anything that isn't a regular
    // file, such as a pipe, which is refused without waiting for its other end.
    virtual int OpenBinary(const String& path, uint32_t mode, FileHandle& file) = 0;
    // The same for text, with the platform's translation of line ends.
    virtual int OpenText(const String& path, TextMode mode, FileHandle& file) = 0;
    // `got` is less than `count` at the end of the file, and where the platform gives less at once; 0 only at the end.
    virtual int ReadBytes(FileHandle file, void* buffer, size_t count, size_t& got) = 0;
    // `put` may be less than `count`.
    virtual int WriteBytes(FileHandle file, const void* buffer, size_t count, size_t& put) = 0;
    // Makes a file that was opened for writing `length` bytes long, and its write time the present. The next byte is
    // read or written behind those.
    virtual int CutFile(FileHandle file, uint64_t length) = 0;
    // The handle is gone, whatever the result.
    virtual int CloseFile(FileHandle file) = 0;

    // Absolute, without a separator at its end unless it is a root.
    virtual int ReadWorkingFolder(String& path) = 0;
    virtual int ReadExecutablePath(String& path) = 0;

    // A promise that much will be made in `folder` while the result lives, on this thread: where the system itself
    // isn't blind to case, looking for a name of other letter case needs the folder's list, which is then read once and
    // kept up with what is made through this interface. Names of other letter case that others put there in the
    // meantime may go unnoticed. Null where nothing is to be gained. Holds of one thread end in the reverse order of
    // their making.
    virtual std::unique_ptr<FolderHold> HoldFolder(const String& folder) = 0;
};

// The one that everything uses: the operating system's own, unless SetFileSystem has put another in its place.
FileSystem& GetFileSystem();

// Puts `fileSystem`, which isn't owned, in the place of the current one, and gives the one that was there before.
// Null, in either direction, is the operating system's own. For tests; files and searches that are open stay with the
// file system that is there when they are next used, so change it only while none is open.
FileSystem* SetFileSystem(FileSystem* fileSystem);

// The operating system's own, for whoever wraps it. Lives to process exit.
FileSystem& GetNativeFileSystem();

}  // namespace qn::dsc::osdep
