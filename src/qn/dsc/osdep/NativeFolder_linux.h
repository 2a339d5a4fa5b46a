#pragma once

// Folders on Linux: paths longer than a system call takes, and names that are to match blind to letter case.
// Paths here are native: absolute, folded, without a slash at the end but for the root (NativePath.h).

#include <dirent.h>
#include <sys/types.h>

#include <cstdint>
#include <ctime>
#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>

#include "qn/dsc/osdep/FileSystem.h"

namespace qn::dsc::osdep {

// Where a system call can start to reach a path of any length: it takes fewer than 4096 bytes, so the folders above the
// last of them are opened in between.
class PathStart {
  public:
    // `path` must outlive this.
    explicit PathStart(const std::string& path);
    ~PathStart();

    PathStart(const PathStart&) = delete;
    PathStart& operator=(const PathStart&) = delete;

    // 0, or the number with which a folder above couldn't be opened; the others then mean nothing.
    int Error() const { return error; }
    // For the "at" calls, with Rest() as the path.
    int Folder() const { return folder; }
    const char* Rest() const { return rest; }

  private:
    // Delegated to, so that the destructor closes what was opened before the memory gave out.
    PathStart();

    int folder;
    const char* rest = nullptr;
    int error = 0;
};

// openat, begun anew where a signal interrupts it, as it can on a file system that a network or a program serves.
int OpenAt(int folder, const char* path, int flags, mode_t permissions = 0);

struct FolderCloser {
    void operator()(DIR* folder) const { closedir(folder); }
};
using OpenFolder = std::unique_ptr<DIR, FolderCloser>;

// Each gives 0 or an errno number.
int OpenNativeFolder(const std::string& path, OpenFolder& folder);
int ReadNativeIdentity(const std::string& path, FileIdentity& identity);
int ReadNativeWorkingFolder(std::string& path);

// 100 ns ticks since 1601. Times that file times can't express become the nearest that they can.
uint64_t NativeFileTime(const timespec& time);

// The next name but "." and ".."; null at the end.
const char* NextNativeName(DIR* folder);

// The names of one folder, read once, for as long as much is made in it. Kept up by whoever makes something.
class FolderNames final : public FolderHold {
  public:
    FolderNames(std::string folderPath, const FileIdentity& folderIdentity);
    ~FolderNames() override;

    FolderNames(const FolderNames&) = delete;
    FolderNames& operator=(const FolderNames&) = delete;

    // As FindNameOfOtherCase. The first call reads the folder; an unreadable one is taken as empty.
    bool Find(std::string_view name, std::string& found);
    void Add(std::string_view name);

    // The one that stands for the folder on this thread; null if there is none.
    static FolderNames* Held(const std::string& path);

  private:
    void Read();

    std::string path;
    FileIdentity identity;
    bool isRead = false;
    // From the upper case of a name to the first name in listing order that has it.
    std::unordered_map<std::u16string, std::string> names;
};

// The first name in listing order, in the folder `path`, that differs from `name` only in letter case or not at all.
// `held` becomes the folder's FolderNames, if it has one. Reads the folder otherwise: linear in its names.
bool FindNameOfOtherCase(const std::string& path, std::string_view name, std::string& found, FolderNames*& held);

// How much of a path stands.
enum class Standing {
    Whole,
    AllButLast,  // The folder does, the name in it doesn't.
    Less,
};

// Looks for `path` component by component, each as it is written first and else by FindNameOfOtherCase, and puts the
// names that are found into `path`. Links count as standing wherever they lead. `held` is that of the last folder when
// the result is AllButLast. One call for each of log n prefixes, and one reading of a folder per component that is
// written otherwise.
Standing FindOtherCase(std::string& path, FolderNames*& held);

}  // namespace qn::dsc::osdep
