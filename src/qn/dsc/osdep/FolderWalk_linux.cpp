#include "qn/dsc/osdep/FolderWalk_linux.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <string_view>
#include <utility>

#include "qn/dsc/osdep/NativeFolder_linux.h"
#include "qn/dsc/osdep/NativePath.h"

namespace qn::dsc::osdep {

namespace {

// Folders of the present path that are open, the deepest ones: more only matters where a walk goes up from far below.
constexpr size_t mostOpen = 16;

constexpr size_t listingSize = 32768;

constexpr int folderFlags = O_RDONLY | O_DIRECTORY | O_CLOEXEC;

// U+F05C, which the bytes of a name come back from as a backslash.
constexpr std::string_view ownBackslashUnit = "\xEF\x81\x9C";

bool IsDotName(const char* name) {
    return name[0] == '.' && (name[1] == '\0' || (name[1] == '.' && name[2] == '\0'));
}

// Whether an open folder is the root of a mount. True where the system can't tell.
bool IsMountRoot(int folder) {
    struct statx status;
    if (statx(folder, "", AT_EMPTY_PATH, 0, &status) != 0 ||
        (status.stx_attributes_mask & STATX_ATTR_MOUNT_ROOT) == 0) {
        return true;
    }
    return (status.stx_attributes & STATX_ATTR_MOUNT_ROOT) != 0;
}

// Opens a folder that stands in `folder` itself, neither behind a link nor on another mount, so that it can't be one
// that leads to `folder`. Refuses any other. One call (openat2) could do both, but not every system has it, and tools
// that watch a host from below don't know it.
int OpenDirect(int folder, const char* name, int& descriptor) {
    descriptor = OpenAt(folder, name, folderFlags | O_NOFOLLOW);
    if (descriptor < 0) {
        return errno;
    }
    if (IsMountRoot(descriptor)) {
        close(std::exchange(descriptor, -1));
        return EXDEV;
    }
    return 0;
}

int OpenByPath(const std::string& path, int& descriptor) {
    const PathStart start(path);
    if (start.Error() != 0) {
        return start.Error();
    }
    descriptor = OpenAt(start.Folder(), start.Rest(), folderFlags);
    return descriptor < 0 ? errno : 0;
}

int ReadStatusByPath(const std::string& path, struct stat& status) {
    const PathStart start(path);
    if (start.Error() != 0) {
        return start.Error();
    }
    return fstatat(start.Folder(), start.Rest(), &status, 0) != 0 ? errno : 0;
}

// getdents64, begun anew where a signal interrupts it.
ssize_t ReadListing(int folder, char* listing, size_t size) {
    ssize_t got = 0;
    do {
        got = getdents64(folder, listing, size);
    } while (got < 0 && errno == EINTR);
    return got;
}

// Cuts a path that was made longer, unless it is to be kept so.
class PathGuard {
  public:
    PathGuard(std::string& guardedPath, size_t lengthAtEnd) : path(guardedPath), length(lengthAtEnd) {}
    ~PathGuard() { path.resize(length); }

    PathGuard(const PathGuard&) = delete;
    PathGuard& operator=(const PathGuard&) = delete;

    void Keep() { length = path.size(); }

  private:
    std::string& path;
    size_t length;
};

}  // namespace

NativeFolderWalk::NativeFolderWalk(const String& namePattern)
    : pattern(namePattern.View()), listing(std::make_unique_for_overwrite<char[]>(listingSize)) {}

NativeFolderWalk::~NativeFolderWalk() {
    CloseAll();
}

int NativeFolderWalk::Begin(const String& folder) {
    NativePath native;
    int error = MakeNativePath(folder, native);
    if (error != 0) {
        return error;
    }
    levels.emplace_back();
    Level& start = levels.back();
    error = OpenByPath(native.text, start.descriptor);
    FolderNames* held = nullptr;
    if (error == ENOENT && FindOtherCase(native.text, held) == Standing::Whole) {
        error = OpenByPath(native.text, start.descriptor);
    }
    if (error != 0) {
        return error;
    }
    depth = 1;
    path = native.text == "/" ? std::string() : std::move(native.text);
    start.pathLength = path.size();
    const std::u16string_view system = folder.View().substr(0, folder.View().find(u'\0'));
    start.systemLength = system.size() + (system.back() == u'\\' ? 0 : 1);
    return 0;
}

int NativeFolderWalk::List() {
    Present().names.Clear();
    const int error = EnsureOpen(Present());
    return error != 0 ? error : ReadNames();
}

int NativeFolderWalk::ReadNames() {
    NameList& names = Present().names;
    names.Add(".", pattern, false);
    names.Add("..", pattern, false);
    const size_t firstToSort = names.Count();
    ssize_t size = 0;
    while ((size = ReadListing(Present().descriptor, listing.get(), listingSize)) > 0) {
        for (const char* at = listing.get(); at != listing.get() + size;) {
            const auto* const entry = reinterpret_cast<const dirent64*>(at);
            if (!IsDotName(entry->d_name)) {
                const bool mayBeFolder =
                    entry->d_type == DT_DIR || entry->d_type == DT_LNK || entry->d_type == DT_UNKNOWN;
                names.Add(entry->d_name, pattern, mayBeFolder);
            }
            at += entry->d_reclen;
        }
    }
    names.Sort(firstToSort);
    return 0;
}

WalkEntry NativeFolderWalk::EntryAt(size_t number) const {
    const NameList::Name& name = Present().names.At(number);
    // Where the path leaves no room for the pattern, a search finds nothing.
    const bool isMatch = name.isMatch && Present().systemLength + pattern.Upper().size() <= longestSystemPath;
    return {Present().names.TextOf(name), isMatch, name.isKept};
}

int NativeFolderWalk::Enter(size_t number, WayIn& way) {
    if (depth == levels.size()) {
        levels.emplace_back();
    }
    const char* name = nullptr;
    int error = NativeNameOf(number, name);
    if (error != 0) {
        return error;
    }
    PathGuard guard(path, path.size());
    path.append(1, '/').append(name);
    int descriptor = -1;
    error = OpenEntry(name, descriptor, way);
    if (error != 0) {
        return error;
    }
    guard.Keep();
    Level& below = levels[depth];
    below.descriptor = descriptor;
    below.pathLength = path.size();
    below.systemLength = Present().systemLength + Present().names.At(number).length + 1;
    below.names.Clear();
    ++depth;
    if (depth > mostOpen) {
        Level& farthest = levels[depth - 1 - mostOpen];
        if (farthest.descriptor >= 0) {
            close(std::exchange(farthest.descriptor, -1));
        }
    }
    return 0;
}

void NativeFolderWalk::Leave() {
    if (Present().descriptor >= 0) {
        close(std::exchange(Present().descriptor, -1));
    }
    --depth;
    path.resize(Present().pathLength);
}

int NativeFolderWalk::ReadWriteTime(size_t number, uint64_t& time) {
    const char* name = nullptr;
    int error = NativeNameOf(number, name);
    struct stat status;
    if (error == 0 && Present().names.At(number).isKept) {
        // It may be a link: see OpenEntry.
        error = ReadStatusByPath(path + '/' + name, status);
    } else if (error == 0) {
        error = EnsureOpen(Present());
        if (error == 0 && fstatat(Present().descriptor, name, &status, 0) != 0) {
            error = errno;
        }
    }
    if (error == 0) {
        time = NativeFileTime(status.st_mtim);
    }
    return error;
}

int NativeFolderWalk::ReadIdentity(size_t level, FileIdentity& identity) {
    struct stat status;
    int error = 0;
    if (levels[level].descriptor < 0) {
        error = ReadStatusByPath(PathOf(levels[level]), status);
    } else if (fstat(levels[level].descriptor, &status) != 0) {
        error = errno;
    }
    if (error == 0) {
        identity = {status.st_dev, status.st_ino};
    }
    return error;
}

std::string NativeFolderWalk::PathOf(const Level& level) const {
    return level.pathLength == 0 ? "/" : path.substr(0, level.pathLength);
}

int NativeFolderWalk::OpenEntry(const char* name, int& descriptor, WayIn& way) {
    int error = EnsureOpen(Present());
    if (error == 0) {
        way = WayIn::Direct;
        error = OpenDirect(Present().descriptor, name, descriptor);
    }
    if (error == EMFILE || error == ENFILE) {
        // What is missing may be held here.
        CloseAll();
    }
    if (error != 0) {
        // By its whole path, so that the system's limit to links in a path counts those above as well.
        way = WayIn::Indirect;
        error = OpenByPath(path, descriptor);
    }
    return error;
}

int NativeFolderWalk::EnsureOpen(Level& level) {
    return level.descriptor >= 0 ? 0 : OpenByPath(PathOf(level), level.descriptor);
}

void NativeFolderWalk::CloseAll() {
    for (size_t level = 0; level < depth; ++level) {
        if (levels[level].descriptor >= 0) {
            close(std::exchange(levels[level].descriptor, -1));
        }
    }
}

int NativeFolderWalk::NativeNameOf(size_t number, const char*& name) {
    const NameList& names = Present().names;
    const NameList::Name& entry = names.At(number);
    if (Present().systemLength + entry.length > longestSystemPath) {
        return ENAMETOOLONG;
    }
    name = names.NativeOf(entry);
    const std::string_view bytes = name;
    size_t at = bytes.find(ownBackslashUnit);
    if (at == std::string_view::npos) {
        return 0;
    }
    // The same text as that of a name with a backslash, which comes before this one.
    std::string wanted = path + '/';
    const size_t start = wanted.size();
    wanted += bytes;
    for (at += start; at != std::string::npos; at = wanted.find(ownBackslashUnit, at)) {
        wanted.replace(at, ownBackslashUnit.size(), 1, '\\');
    }
    FolderNames* held = nullptr;
    if (FindOtherCase(wanted, held) != Standing::Whole) {
        return ENOENT;
    }
    foundName = wanted.substr(wanted.rfind('/') + 1);
    name = foundName.c_str();
    return 0;
}

}  // namespace qn::dsc::osdep
