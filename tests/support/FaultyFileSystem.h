#pragma once

// A file system for tests whose calls fail when and where the test says so. It hands everything on to another one,
// counts the calls, and answers with an error number in the place of a call that is to fail. So a full disk, a lack of
// permission or a broken disk can be had anywhere, also as root.
//
//     FaultyFileSystem files;                             // over the operating system's own
//     FileSystemScope scope(files);                       // everything goes through `files` to the end of the scope
//     files.Fail(FileCall::WriteBytes, 3, ENOSPC);        // the third write from here on fails, the fourth doesn't
//     files.FailFromThenOn(FileCall::Any, 1, EIO);        // every call fails
//     files.FailOnPath(FileCall::BeginSearch, u"C:\\a\\*", EACCES);
//
// To fail every call of a run in turn: count the calls of a sound run with Count(FileCall::Any), then repeat the run
// with Fail(FileCall::Any, n, EIO) for each n up to that count.
//
// The ReadIdentity of a walk is one like any other. EndSearch, HoldFolder and the way out of a folder can't fail and
// aren't counted. CloseFile closes, also where it reports a failure.

#include <array>
#include <cstddef>
#include <cstdint>
#include <vector>

#include "qn/dsc/osdep/FileSystem.h"

namespace qn::dsc::osdep {

enum class FileCall {
    Any,  // Each of the others.
    ReadAttributes,
    ReadIdentity,
    BeginSearch,
    NextName,
    BeginWalk,      // With the path of the folder.
    ListFolder,     // Of a walk, with the path of the folder.
    EnterFolder,    // Of a walk, with the path of what is entered; also with that of its folder and "\\*".
    ReadWriteTime,  // Of a walk, with the path of the file.
    MakeFolder,
    OpenBinary,
    OpenText,
    ReadBytes,
    WriteBytes,
    CutFile,
    CloseFile,
    ReadWorkingFolder,
    ReadExecutablePath,
};

class FaultyFileSystem : public FileSystem {
  public:
    // `innerFileSystem` isn't owned.
    explicit FaultyFileSystem(FileSystem& innerFileSystem = GetNativeFileSystem()) : inner(innerFileSystem) {}

    // The `nth` call of `kind` from here on fails with `error`, once; 1 is the next. Any number of these can stand at a
    // time.
    void Fail(FileCall kind, uint64_t nth, int error);
    // That call and all of `kind` behind it.
    void FailFromThenOn(FileCall kind, uint64_t nth, int error);
    // Every call of `kind` with this very path (or pattern), blind to letter case.
    void FailOnPath(FileCall kind, const String& path, int error);
    // Reads and writes take at most `bytes` at once, as slow disks and full ones do.
    void LimitTransfer(size_t bytes) { transferLimit = bytes; }
    // What the working folder and the executable are, in the place of the truth.
    void SetWorkingFolder(const String& path) { workingFolder = path; }
    void SetExecutablePath(const String& path) { executablePath = path; }
    // Takes all of the above back. The counts stay.
    void Clear();

    // How many calls of `kind` there were, the failed ones included.
    uint64_t Count(FileCall kind) const { return counts[static_cast<size_t>(kind)]; }
    // Handles that were opened and not yet closed or ended.
    int64_t OpenFiles() const { return openFiles; }
    int64_t OpenSearches() const { return openSearches; }
    int64_t OpenWalks() const { return openWalks; }

    int ReadAttributes(const String& path, FileAttributes& attributes) override;
    int ReadIdentity(const String& path, FileIdentity& identity) override;
    int BeginSearch(const String& pattern, SearchHandle& search, String& firstName) override;
    int NextName(SearchHandle search, String& name) override;
    void EndSearch(SearchHandle search) override;
    int BeginWalk(const String& folder, const String& pattern, std::unique_ptr<FolderWalk>& walk) override;
    int MakeFolder(const String& path) override;
    int OpenBinary(const String& path, uint32_t mode, FileHandle& file) override;
    int OpenText(const String& path, TextMode mode, FileHandle& file) override;
    int ReadBytes(FileHandle file, void* buffer, size_t count, size_t& got) override;
    int WriteBytes(FileHandle file, const void* buffer, size_t count, size_t& put) override;
    int CutFile(FileHandle file, uint64_t length) override;
    int CloseFile(FileHandle file) override;
    int ReadWorkingFolder(String& path) override;
    int ReadExecutablePath(String& path) override;
    std::unique_ptr<FolderHold> HoldFolder(const String& folder) override;

  private:
    friend class FaultyFolderWalk;

    struct Fault {
        FileCall kind;
        // Counted as Count counts.
        uint64_t first;
        uint64_t last;
        int error;
    };
    struct PathFault {
        FileCall kind;
        String path;
        int error;
    };

    // Counts the call and gives the number it is to fail with; 0 for none. A null `path` is one that the call has not.
    int Enter(FileCall kind, const String* path);
    // The number with which calls of `kind` with this path are to fail.
    int PathFaultFor(FileCall kind, const String& path) const;

    FileSystem& inner;
    std::array<uint64_t, static_cast<size_t>(FileCall::ReadExecutablePath) + 1> counts{};
    std::vector<Fault> faults;
    std::vector<PathFault> pathFaults;
    size_t transferLimit = SIZE_MAX;
    // Empty: the inner file system's.
    String workingFolder;
    String executablePath;
    int64_t openFiles = 0;
    int64_t openSearches = 0;
    int64_t openWalks = 0;
};

// Puts a file system in the place of the current one, and the old one back at its end.
class FileSystemScope {
  public:
    explicit FileSystemScope(FileSystem& fileSystem) : before(SetFileSystem(&fileSystem)) {}
    ~FileSystemScope() { SetFileSystem(before); }

    FileSystemScope(const FileSystemScope&) = delete;
    FileSystemScope& operator=(const FileSystemScope&) = delete;

  private:
    FileSystem* before;
};

}  // namespace qn::dsc::osdep
