#include "qn/dsc/osdep/NativeFolder_linux.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <cstdlib>
#include <utility>
#include <vector>

#include "qn/dsc/osdep/NameOrder.h"
#include "qn/dsc/osdep/NativePath.h"

namespace qn::dsc::osdep {

namespace {

// The system's limit is 4096 with the NUL.
constexpr size_t longestCall = 4095;

// Those of this thread, in the order of their making.
thread_local std::vector<FolderNames*> heldFolders;

std::u16string UnitsOf(std::string_view name) {
    std::u16string units;
    AppendNameUnits(name, units);
    return units;
}

std::u16string UpperOf(std::string_view name) {
    std::u16string upper;
    AppendUpper(UnitsOf(name), upper);
    return upper;
}

bool IsAscii(std::string_view text) {
    return std::all_of(text.begin(), text.end(), [](char byte) { return static_cast<unsigned char>(byte) < 0x80; });
}

bool EqualAsciiUpper(std::string_view a, std::string_view b) {
    const auto isSame = [](char x, char y) {
        return UpperUnit(static_cast<unsigned char>(x)) == UpperUnit(static_cast<unsigned char>(y));
    };
    return std::equal(a.begin(), a.end(), b.begin(), b.end(), isSame);
}

// Tells whether names differ from one name in letter case at most, without a conversion where that is ASCII.
class CaseBlindName {
  public:
    explicit CaseBlindName(std::string_view wantedName)
        // A native backslash is U+F05C among units, and equals that.
        : name(wantedName), isPlain(IsAscii(wantedName) && wantedName.find('\\') == std::string_view::npos) {
        if (!isPlain) {
            upper = UpperOf(name);
        }
    }

    bool Matches(std::string_view other) const {
        return isPlain ? EqualAsciiUpper(name, other) : UpperOf(other) == upper;
    }

  private:
    std::string_view name;
    bool isPlain;
    std::u16string upper;
};

// Whether `a` is listed before `b`, where both have the same upper case.
bool IsListedFirst(std::string_view a, std::string_view b) {
    return UnitsOf(a) < UnitsOf(b);
}

bool ReadFolderFor(const std::string& path, std::string_view name, std::string& found) {
    OpenFolder folder;
    if (OpenNativeFolder(path, folder) != 0) {
        return false;
    }
    const CaseBlindName wanted(name);
    bool isFound = false;
    while (const char* other = NextNativeName(folder.get())) {
        if (wanted.Matches(other) && (!isFound || IsListedFirst(other, found))) {
            found = other;
            isFound = true;
        }
    }
    return isFound;
}

bool StandsAsWritten(const std::string& path) {
    const PathStart start(path);
    struct stat status;
    return start.Error() == 0 && fstatat(start.Folder(), start.Rest(), &status, AT_SYMLINK_NOFOLLOW) == 0;
}

// The end of the longest run of components, from the root, that stands as written; `known` is the end of one that does.
size_t EndOfStanding(const std::string& path, size_t known) {
    // In nearly all cases only the last name is missing.
    if (StandsAsWritten(path)) {
        return path.size();
    }
    size_t end = path.rfind('/');
    std::vector<size_t> ends;
    while (end > known && end != std::string::npos) {
        ends.push_back(end);
        end = path.rfind('/', end - 1);
    }
    if (ends.empty() || StandsAsWritten(path.substr(0, ends.front()))) {
        return ends.empty() ? known : ends.front();
    }
    // What stands only gets shorter from there on.
    const auto firstStanding = std::partition_point(ends.begin() + 1, ends.end(), [&path](size_t candidate) {
        return !StandsAsWritten(path.substr(0, candidate));
    });
    return firstStanding == ends.end() ? known : *firstStanding;
}

}  // namespace

PathStart::PathStart() : folder(AT_FDCWD) {}

PathStart::PathStart(const std::string& path) : PathStart() {
    rest = path.c_str();
    const char* const end = path.data() + path.size();
    while (error == 0 && static_cast<size_t>(end - rest) > longestCall) {
        const std::string_view reach(rest, longestCall);
        const size_t slash = reach.rfind('/');
        if (slash == std::string_view::npos || slash == 0) {
            error = ENAMETOOLONG;
            break;
        }
        const std::string upper(reach.substr(0, slash));
        const int next = OpenAt(folder, upper.c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC);
        error = next < 0 ? errno : 0;
        if (folder != AT_FDCWD) {
            close(folder);
        }
        folder = next < 0 ? AT_FDCWD : next;
        rest += slash + 1;
    }
}

PathStart::~PathStart() {
    if (folder != AT_FDCWD) {
        close(folder);
    }
}

int OpenAt(int folder, const char* path, int flags, mode_t permissions) {
    int descriptor = -1;
    do {
        descriptor = openat(folder, path, flags, permissions);
    } while (descriptor < 0 && errno == EINTR);
    return descriptor;
}

int OpenNativeFolder(const std::string& path, OpenFolder& folder) {
    const PathStart start(path);
    if (start.Error() != 0) {
        return start.Error();
    }
    const int descriptor = OpenAt(start.Folder(), start.Rest(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (descriptor < 0) {
        return errno;
    }
    folder.reset(fdopendir(descriptor));
    if (folder == nullptr) {
        const int error = errno;
        close(descriptor);
        return error;
    }
    return 0;
}

int ReadNativeIdentity(const std::string& path, FileIdentity& identity) {
    const PathStart start(path);
    if (start.Error() != 0) {
        return start.Error();
    }
    struct stat status;
    if (fstatat(start.Folder(), start.Rest(), &status, 0) != 0) {
        return errno;
    }
    identity = {status.st_dev, status.st_ino};
    return 0;
}

uint64_t NativeFileTime(const timespec& time) {
    constexpr int64_t secondsTo1970 = 11644473600;
    constexpr int64_t ticksPerSecond = 10000000;
    constexpr int64_t lastSecond = INT64_MAX / ticksPerSecond - 1;
    const int64_t seconds = std::clamp<int64_t>(time.tv_sec, -secondsTo1970, lastSecond - secondsTo1970);
    if (seconds != time.tv_sec) {
        return seconds < 0 ? 0 : static_cast<uint64_t>(INT64_MAX);
    }
    return static_cast<uint64_t>((seconds + secondsTo1970) * ticksPerSecond + time.tv_nsec / 100);
}

int ReadNativeWorkingFolder(std::string& path) {
    const std::unique_ptr<char, decltype(&std::free)> text(getcwd(nullptr, 0), &std::free);
    if (text == nullptr) {
        return errno;
    }
    // "(unreachable)" stands before a folder outside the root of the process.
    if (*text != '/') {
        return ENOENT;
    }
    path = text.get();
    return 0;
}

const char* NextNativeName(DIR* folder) {
    for (;;) {
        errno = 0;
        const dirent* const entry = readdir(folder);
        if (entry == nullptr && errno != EINTR) {
            return nullptr;
        }
        if (entry != nullptr && std::string_view(entry->d_name) != "." && std::string_view(entry->d_name) != "..") {
            return entry->d_name;
        }
    }
}

FolderNames::FolderNames(std::string folderPath, const FileIdentity& folderIdentity)
    : path(std::move(folderPath)), identity(folderIdentity) {
    heldFolders.push_back(this);
}

FolderNames::~FolderNames() {
    std::erase(heldFolders, this);
}

bool FolderNames::Find(std::string_view name, std::string& found) {
    if (!isRead) {
        Read();
    }
    const auto position = names.find(UpperOf(name));
    if (position == names.end()) {
        return false;
    }
    found = position->second;
    return true;
}

void FolderNames::Add(std::string_view name) {
    std::string& first = names[UpperOf(name)];
    if (first.empty() || IsListedFirst(name, first)) {
        first = name;
    }
}

FolderNames* FolderNames::Held(const std::string& path) {
    FileIdentity identity;
    if (heldFolders.empty() || ReadNativeIdentity(path, identity) != 0) {
        return nullptr;
    }
    const auto position = std::find_if(heldFolders.rbegin(), heldFolders.rend(),
                                       [&identity](const FolderNames* held) { return held->identity == identity; });
    return position == heldFolders.rend() ? nullptr : *position;
}

void FolderNames::Read() {
    OpenFolder folder;
    if (OpenNativeFolder(path, folder) == 0) {
        while (const char* name = NextNativeName(folder.get())) {
            Add(name);
        }
    }
    isRead = true;
}

bool FindNameOfOtherCase(const std::string& path, std::string_view name, std::string& found, FolderNames*& held) {
    held = FolderNames::Held(path);
    return held != nullptr ? held->Find(name, found) : ReadFolderFor(path, name, found);
}

Standing FindOtherCase(std::string& path, FolderNames*& held) {
    held = nullptr;
    size_t known = 0;
    for (;;) {
        const size_t end = EndOfStanding(path, known);
        if (end >= path.size()) {
            return Standing::Whole;
        }
        const std::string folder = end == 0 ? "/" : path.substr(0, end);
        const size_t nameEnd = std::min(path.find('/', end + 1), path.size());
        const std::string name = path.substr(end + 1, nameEnd - end - 1);
        std::string found;
        if (!FindNameOfOtherCase(folder, name, found, held)) {
            return nameEnd == path.size() ? Standing::AllButLast : Standing::Less;
        }
        path.replace(end + 1, name.size(), found);
        known = end + 1 + found.size();
    }
}

}  // namespace qn::dsc::osdep
