#include <memory>
#include <optional>
#include <set>
#include <utility>
#include <vector>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/FileFinder.h"
#include "qn/dsc/osdep/FileSystem.h"
#include "qn/dsc/osdep/path.h"

namespace qn::dsc::osdep {

namespace {

using exception::ThrowAt;

constexpr char module[] = "qn/dsc/osdep/path";

// Nothing if it can't be read.
using KnownIdentity = std::optional<FileIdentity>;

KnownIdentity IdentityOf(const String& path) {
    FileIdentity identity;
    return GetFileSystem().ReadIdentity(path, identity) == 0 ? KnownIdentity(identity) : std::nullopt;
}

// Folders of the present path, each as often as it is there. One of unknown identity is none of them.
class FolderSet {
  public:
    void Add(const KnownIdentity& folder) {
        if (folder) {
            folders.insert(KeyOf(*folder));
        }
    }
    void Remove(const KnownIdentity& folder) {
        if (folder) {
            folders.erase(folders.find(KeyOf(*folder)));
        }
    }
    bool Holds(const KnownIdentity& folder) const { return folder && folders.count(KeyOf(*folder)) != 0; }

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
    KnownIdentity sourceIdentity;
    KnownIdentity destinationIdentity;
    // The folder may get many new files.
    std::unique_ptr<FolderHold> hold;
};

// Invariant: `levels` are the folders that are being copied, the deepest last; everything before each `next` is copied.
class TreeCopy {
  public:
    void Run(const String& source, const String& destination) {
        if (!IsDirectory(destination)) {
            CreateDirectoryPath(destination);
        }
        Enter(source, IdentityOf(source), destination);
        while (!levels.empty()) {
            CopyLevel& level = levels.back();
            if (level.next == level.entries.size()) {
                Leave();
            } else {
                const String entry = std::move(level.entries[level.next]);
                ++level.next;
                CopyEntry(entry, JoinPath(level.destination, GetFileName(entry)));
            }
        }
    }

  private:
    void CopyEntry(const String& entry, String target) {
        const String name = GetFileName(entry);
        if (name.View() == u"." || name.View() == u"..") {
            return;
        }
        if (!IsDirectory(entry)) {
            CopyFileTo(entry, target, true);
            return;
        }
        const KnownIdentity identity = IdentityOf(entry);
        // To copy a folder into itself would never end, so one that is copied into counts as well.
        if (sources.Holds(identity) || destinations.Holds(identity)) {
            return;
        }
        EnsureFolder(target);
        AppendSeparator(target);
        Enter(entry, identity, target);
    }

    // CreateDirectoryPath for a folder in one that stands.
    static void EnsureFolder(const String& target) {
        if (IsDirectory(target)) {
            return;
        }
        if (target.View().back() == u'.') {
            ThrowAt(exception::InvalidArgument(), module, __LINE__);
        }
        CreateOneDirectory(target);
    }

    void Enter(const String& source, const KnownIdentity& sourceIdentity, const String& destination) {
        CopyLevel level;
        level.destination = destination;
        level.sourceIdentity = sourceIdentity;
        level.destinationIdentity = IdentityOf(destination);
        level.hold = GetFileSystem().HoldFolder(destination);
        level.entries = FileFinder().ListFiles(JoinPath(source, u"*"));
        levels.push_back(std::move(level));
        sources.Add(levels.back().sourceIdentity);
        destinations.Add(levels.back().destinationIdentity);
    }

    void Leave() {
        sources.Remove(levels.back().sourceIdentity);
        destinations.Remove(levels.back().destinationIdentity);
        levels.pop_back();
    }

    std::vector<CopyLevel> levels;
    FolderSet sources;
    FolderSet destinations;
};

}  // namespace

void CopyDirectoryTree(const String& source, const String& destination) {
    if (!IsAbsolutePath(source) || !IsAbsolutePath(destination)) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
    if (!IsDirectory(source)) {
        ThrowAt(exception::NonexistentException(), module, __LINE__);
    }
    TreeCopy().Run(source, destination);
}

}  // namespace qn::dsc::osdep
