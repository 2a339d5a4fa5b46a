#include <iterator>
#include <new>
#include <utility>

#include "cachebuilder/TargetDiscovery.h"
#include "qn/dsc/osdep/FileFinder.h"
#include "qn/dsc/osdep/FileSystem.h"
#include "qn/dsc/osdep/path.h"

namespace zkhw {

using qn::dsc::osdep::Equal;
using qn::dsc::osdep::FileFinder;
using qn::dsc::osdep::FileIdentity;
using qn::dsc::osdep::GetFileSystem;
using qn::dsc::osdep::IsDirectory;
using qn::dsc::osdep::JoinPath;

namespace {

bool IsDotName(const String& path) {
    const std::u16string_view text = path.View();
    const std::u16string_view name = text.substr(text.rfind(u'\\') + 1);
    return Equal(name, u".") || Equal(name, u"..");
}

// The walk over the folders. Running out of memory ends the folder where it happens and no other.
class ResourceFileWalk {
  public:
    ResourceFileWalk(const String& filePattern, std::vector<String>& found) : pattern(filePattern), files(found) {}

    void Run(const String& directory) {
        Enter(directory);
        while (!path.empty()) {
            if (const String* folder = NextFolder()) {
                Enter(*folder);
            } else {
                path.pop_back();
            }
        }
    }

  private:
    struct Level {
        std::vector<String> entries;
        size_t next;  // The first entry that was not looked at.
        FileIdentity identity;
        bool isIdentified;
    };

    // Lists a folder and puts it on the path. `directory` may be a part of the path.
    void Enter(const String& directory) {
        try {
            FileIdentity identity;
            const bool isIdentified = GetFileSystem().ReadIdentity(directory, identity) == 0;
            if (isIdentified && IsOnPath(identity)) {
                return;
            }
            FileFinder finder;
            std::vector<String> matches = finder.ListFiles(JoinPath(directory, pattern));
            files.insert(files.end(), std::move_iterator(matches.begin()), std::move_iterator(matches.end()));
            path.push_back({finder.ListFiles(JoinPath(directory, u"*")), 0, identity, isIdentified});
        } catch (const std::bad_alloc&) {
        }
    }

    // The next folder of the topmost level; null if that level is done.
    const String* NextFolder() {
        Level& level = path.back();
        try {
            while (level.next < level.entries.size()) {
                const String& entry = level.entries[level.next++];
                if (!IsDotName(entry) && IsDirectory(entry)) {
                    return &entry;
                }
            }
        } catch (const std::bad_alloc&) {
        }
        return nullptr;
    }

    // The length of a path bounds the levels, and so this search.
    bool IsOnPath(const FileIdentity& identity) const {
        for (const Level& level : path) {
            if (level.isIdentified && level.identity == identity) {
                return true;
            }
        }
        return false;
    }

    const String& pattern;
    std::vector<String>& files;
    std::vector<Level> path;
};

}  // namespace

void FindResourceFiles(const String& directory, const String& pattern, std::vector<String>& files) {
    ResourceFileWalk(pattern, files).Run(directory);
}

}  // namespace zkhw
