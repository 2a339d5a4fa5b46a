#include "qn/dsc/osdep/path.h"

#include <cerrno>
#include <memory>
#include <new>
#include <set>
#include <string_view>
#include <utility>
#include <vector>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/BinaryFile.h"
#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/FileFinder.h"
#include "qn/dsc/osdep/FileSystem.h"

namespace qn::dsc::osdep {

namespace {

using exception::ThrowAt;

constexpr char module[] = "qn/dsc/osdep/path";
constexpr char16_t separator = u'\\';

bool IsLetter(char16_t unit) {
    return (unit >= u'a' && unit <= u'z') || (unit >= u'A' && unit <= u'Z');
}

// The length of "C:" or "AB:" at the start; 0 if there is none.
size_t DriveLength(std::u16string_view path) {
    size_t letters = 0;
    while (letters < path.size() && letters < 2 && IsLetter(path[letters])) {
        ++letters;
    }
    return letters > 0 && letters < path.size() && path[letters] == u':' ? letters + 1 : 0;
}

bool IsNetworkPath(std::u16string_view path) {
    return path.size() >= 2 && path[0] == separator && path[1] == separator;
}

bool IsAbsolute(std::u16string_view path) {
    const size_t drive = DriveLength(path);
    return IsNetworkPath(path) || (drive != 0 && drive < path.size() && path[drive] == separator);
}

bool EndsInSeparator(std::u16string_view path) {
    return !path.empty() && path.back() == separator;
}

std::u16string_view DirectoryPart(std::u16string_view path) {
    const size_t start = path.find_first_not_of(separator, DriveLength(path));
    if (start == std::u16string_view::npos) {
        return path;
    }
    size_t end = path.rfind(separator);
    if (end == std::u16string_view::npos || end < start) {
        return path.substr(0, start);
    }
    while (path[end - 1] == separator) {
        --end;
    }
    return path.substr(0, end);
}

// The pieces of `path`, each of which has a backslash behind it; of the two in front of a network path the first
// belongs to the first piece.
std::vector<std::u16string_view> SplitPieces(std::u16string_view path) {
    std::vector<std::u16string_view> pieces;
    size_t start = 0;
    size_t end = path.find(separator, IsNetworkPath(path) ? 1 : 0);
    while (end != std::u16string_view::npos) {
        pieces.push_back(path.substr(start, end - start));
        start = end + 1;
        end = path.find(separator, start);
    }
    return pieces;
}

// Leaves the pieces that stand when "." and ".." are folded away, the last one first. False: there is no such path.
bool FoldPieces(const std::vector<std::u16string_view>& pieces, std::vector<std::u16string_view>& kept) {
    size_t pending = 0;
    for (size_t i = pieces.size(); i-- > 0;) {
        const std::u16string_view piece = pieces[i];
        if (Equal(piece, u"...")) {
            return false;
        }
        if (Equal(piece, u"..")) {
            ++pending;
        } else if (Equal(piece, u".")) {
            continue;
        } else if (pending == 0) {
            kept.push_back(piece);
        } else if (i == 0) {
            return false;
        } else {
            --pending;
        }
    }
    return true;
}

bool ReadIsDirectory(const String& path) {
    FileAttributes attributes;
    return IsAbsolute(path.View()) && GetFileSystem().ReadAttributes(path, attributes) == 0 && attributes.isDirectory;
}

// The folders that a path asks for, from the top, as lengths of its start. Ends before a name that ends in ".";
// `isSound` is then false.
std::vector<uint32_t> LevelsOf(std::u16string_view path, bool& isSound) {
    std::vector<uint32_t> levels;
    size_t start = DriveLength(path) + 1;
    if (IsNetworkPath(path)) {
        const size_t serverEnd = path.find(separator, 2);
        if (serverEnd == std::u16string_view::npos) {
            ThrowAt(exception::InvalidArgument(), module, __LINE__);
        }
        start = serverEnd + 1;
    } else {
        levels.push_back(static_cast<uint32_t>(start));
    }
    isSound = true;
    for (size_t end = path.find(separator, start); end != std::u16string_view::npos;
         end = path.find(separator, start)) {
        if (end > start && path[end - 1] == u'.') {
            isSound = false;
            break;
        }
        if (end > start) {
            levels.push_back(static_cast<uint32_t>(end));
        }
        start = end + 1;
    }
    return levels;
}

// CreateDirectoryPath for an absolute path. With `isLastMissing` the last folder is known not to stand.
void CreateMissingFolders(const String& path, bool isLastMissing) {
    bool isSound = true;
    const std::vector<uint32_t> levels = LevelsOf(path.View(), isSound);
    // A folder that stands has all above it standing, so the first missing one is found from below, in one step for
    // a new folder in an old one.
    size_t missing = levels.size();
    if (isLastMissing && isSound && missing > 0) {
        --missing;
    }
    while (missing > 0 && !IsDirectory(path.Substring(0, levels[missing - 1]))) {
        --missing;
    }
    for (; missing < levels.size(); ++missing) {
        CreateOneDirectory(path.Substring(0, levels[missing]));
    }
    if (!isSound) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
}

// Set of folders that can be on a path more than once.
class FolderSet {
  public:
    void Add(const FileIdentity& folder) { folders.insert(KeyOf(folder)); }
    void Remove(const FileIdentity& folder) { folders.erase(folders.find(KeyOf(folder))); }
    bool Holds(const FileIdentity& folder) const { return folders.find(KeyOf(folder)) != folders.end(); }

  private:
    using Key = std::pair<uint64_t, uint64_t>;
    static Key KeyOf(const FileIdentity& folder) { return {folder.volume, folder.file}; }

    std::multiset<Key> folders;
};

// A folder whose copy was begun.
struct CopyLevel {
    // What is left to copy begins at `next`.
    std::vector<String> entries;
    size_t next = 0;
    String destination;
    // What was noted of the two folders, to be taken back when the copy leaves them.
    bool hasIdentities = false;
    FileIdentity sourceIdentity;
    FileIdentity destinationIdentity;
    std::unique_ptr<FolderHold> hold;
};

// Invariant: `levels` are the folders that are being copied, the deepest last; everything before each `next` is copied.
class TreeCopy {
  public:
    void Run(const String& source, const String& destination) {
        Enter(source, destination);
        while (!levels.empty()) {
            CopyLevel& level = levels.back();
            if (level.next == level.entries.size()) {
                Leave();
            } else {
                // Taken out first: a deeper level moves this one.
                const String entry = std::move(level.entries[level.next]);
                ++level.next;
                CopyEntry(entry, level.destination);
            }
        }
    }

  private:
    void CopyEntry(const String& entry, const String& destination) {
        const String name = GetFileName(entry);
        if (name.View() == u"." || name.View() == u"..") {
            return;
        }
        String target = JoinPath(destination, name);
        if (!IsDirectory(entry)) {
            CopyFileTo(entry, target, true);
            return;
        }
        AppendSeparator(target);
        Enter(entry, target);
    }

    // Begins the copy of a folder, unless it is on the present path already.
    void Enter(const String& source, const String& destination) {
        CopyLevel level;
        level.destination = destination;
        FileSystem& fileSystem = GetFileSystem();
        const bool isKnown = fileSystem.ReadIdentity(source, level.sourceIdentity) == 0;
        // To copy a folder into itself would never end, so one that is copied into counts as well.
        if (isKnown && (sources.Holds(level.sourceIdentity) || destinations.Holds(level.sourceIdentity))) {
            return;
        }
        if (!IsDirectory(destination)) {
            CreateMissingFolders(destination, EndsInSeparator(destination.View()));
        }
        level.hasIdentities = isKnown && fileSystem.ReadIdentity(destination, level.destinationIdentity) == 0;
        level.hold = fileSystem.HoldFolder(destination);
        level.entries = FileFinder().ListFiles(JoinPath(source, u"*"));
        if (level.hasIdentities) {
            sources.Add(level.sourceIdentity);
            destinations.Add(level.destinationIdentity);
        }
        levels.push_back(std::move(level));
    }

    void Leave() {
        const CopyLevel& level = levels.back();
        if (level.hasIdentities) {
            sources.Remove(level.sourceIdentity);
            destinations.Remove(level.destinationIdentity);
        }
        levels.pop_back();
    }

    std::vector<CopyLevel> levels;
    FolderSet sources;
    FolderSet destinations;
};

}  // namespace

bool IsAbsolutePath(const String& path) {
    return IsAbsolute(path.View());
}

String JoinPath(const String& base, const String& part) {
    if (base.IsEmpty() || IsAbsolute(part.View())) {
        return part;
    }
    return EndsInSeparator(base.View()) ? String::Concat(base, part)
                                        : String::Concat({base.View(), u"\\", part.View()});
}

String GetFileName(const String& path) {
    const std::u16string_view view = path.View();
    const size_t last = view.rfind(separator);
    if (last != std::u16string_view::npos) {
        return String(view.substr(last + 1));
    }
    return !view.empty() && DriveLength(view) == view.size() ? String() : path;
}

String GetDirectoryName(const String& path) {
    return String(DirectoryPart(path.View()));
}

void AppendSeparator(String& path) {
    if (path.IsEmpty()) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
    if (!EndsInSeparator(path.View())) {
        path.Append(1, separator);
    }
}

String NormalizePath(const String& path) {
    if (!IsAbsolute(path.View())) {
        return String();
    }
    if (path.Find(u'.') == String::npos) {
        return path;
    }
    String closed = path;
    AppendSeparator(closed);
    std::vector<std::u16string_view> kept;
    if (!FoldPieces(SplitPieces(closed.View()), kept)) {
        return String();
    }
    String result;
    result.Reserve(closed.Length());
    for (auto piece = kept.rbegin(); piece != kept.rend(); ++piece) {
        result.Append(*piece);
        result.Append(1, separator);
    }
    return EndsInSeparator(path.View()) ? result : GetDirectoryName(result);
}

String MakeAbsolutePath(const String& path) {
    if (IsAbsolute(path.View())) {
        return path;
    }
    return path.IsEmpty() ? GetCurrentDirectoryPath() : JoinPath(GetCurrentDirectoryPath(), path);
}

String GetCurrentDirectoryPath() {
    String path;
    return GetFileSystem().ReadWorkingFolder(path) == 0 ? path : String();
}

bool IsDirectory(const String& path) noexcept {
    try {
        return ReadIsDirectory(path);
    } catch (const std::bad_alloc&) {
        return false;
    }
}

bool IsExistingFile(const String& path) {
    if (!IsAbsolute(path.View())) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
    FileAttributes attributes;
    return GetFileSystem().ReadAttributes(path, attributes) == 0 && !attributes.isDirectory;
}

TimeStamp GetFileModificationTime(const String& path) {
    FileAttributes attributes;
    return GetFileSystem().ReadAttributes(path, attributes) == 0 ? TimeStamp::FromFileTime(attributes.lastWriteTime)
                                                                 : TimeStamp();
}

void CopyFileTo(const String& source, const String& destination, bool overwrite) {
    if (!IsAbsolute(source.View()) || !IsAbsolute(destination.View())) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
    if (!overwrite && IsExistingFile(destination)) {
        ThrowAt(exception::FileAlreadyExists(), module, __LINE__);
    }
    if (Equal(source.View(), destination.View())) {
        return;
    }
    BinaryFile from(source, BinaryMode::Read);
    BinaryFile to(destination,
                  BinaryMode::Create | BinaryMode::ReadWrite | (overwrite ? BinaryMode::Truncate : uint32_t{0}));
    char block[4096];
    int32_t got = from.Read(block, sizeof block);
    while (got > 0) {
        if (to.Write(block, static_cast<uint32_t>(got)) < got) {
            ThrowAt(exception::FileWriteFailed(), module, __LINE__);
        }
        got = from.Read(block, sizeof block);
    }
    if (got < 0) {
        ThrowAt(exception::FileReadFailed(), module, __LINE__);
    }
}

void CreateDirectoryPath(const String& path) {
    if (!IsAbsolute(path.View())) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
    CreateMissingFolders(path, false);
}

void CreateOneDirectory(const String& path) {
    const int error = GetFileSystem().MakeFolder(path);
    if (error == EEXIST) {
        ThrowAt(exception::ObjectAlreadyExists(), module, __LINE__);
    }
    if (error != 0) {
        ThrowAt(exception::AccessDenied(path), module, __LINE__);
    }
}

void CopyDirectoryTree(const String& source, const String& destination) {
    if (!IsAbsolute(source.View()) || !IsAbsolute(destination.View())) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
    if (!IsDirectory(source)) {
        ThrowAt(exception::NonexistentException(), module, __LINE__);
    }
    TreeCopy().Run(source, destination);
}

}  // namespace qn::dsc::osdep
