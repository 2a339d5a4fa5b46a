#include <algorithm>
#include <cstdint>
#include <memory>
#include <new>
#include <string>
#include <utility>

#include "cachebuilder/TargetDiscovery.h"
#include "qn/dsc/osdep/FileSystem.h"
#include "qn/dsc/osdep/path.h"

namespace zkhw {

using qn::dsc::osdep::FileIdentity;
using qn::dsc::osdep::FolderWalk;
using qn::dsc::osdep::GetFileSystem;
using qn::dsc::osdep::IsAbsolutePath;
using qn::dsc::osdep::JoinPath;
using qn::dsc::osdep::TimeStamp;
using qn::dsc::osdep::WayIn;

namespace {

// The walk over the folders. Running out of memory ends the folder where it happens and no other.
class ResourceFileWalk {
  public:
    virtual ~ResourceFileWalk() = default;

    void Run(const String& directory, const String& pattern) {
        bool isAbsolute = false;
        try {
            const String start = JoinPath(directory, String());
            if (GetFileSystem().BeginWalk(start.IsEmpty() ? String(u".") : start, pattern, walk) != 0) {
                return;
            }
            path = start.View();
            isAbsolute = IsAbsolutePath(start);
            levels.emplace_back();
        } catch (const std::bad_alloc&) {
            return;
        }
        VisitMatches();
        // Only an absolute path names a folder.
        if (!isAbsolute) {
            return;
        }
        while (!levels.empty() && !isDone) {
            if (EnterNext()) {
                VisitMatches();
            } else {
                Leave();
            }
        }
    }

  protected:
    // False if nothing more is to be visited. The folder's path ends in a separator.
    virtual bool Visit(FolderWalk& folders, size_t number, std::u16string_view folderPath) = 0;

  private:
    struct Level {
        // The first entry that was not looked at for folders.
        size_t next = 0;
        // Of the folder above.
        size_t pathLength = 0;
        WayIn way = WayIn::Direct;
        // Something on the path down to here is indirect.
        bool mayRepeat = false;
        bool wasAsked = false;
        bool isIdentified = false;
        FileIdentity identity;
    };

    void VisitMatches() {
        try {
            if (walk->List() == 0) {
                for (size_t number = 0; number < walk->EntryCount() && !isDone; ++number) {
                    isDone = walk->EntryAt(number).isMatch && !Visit(*walk, number, path);
                }
                return;
            }
        } catch (const std::bad_alloc&) {
        }
        levels.back().next = SIZE_MAX;
    }

    // Goes into the next folder of the present one; false if there is none.
    bool EnterNext() {
        while (levels.back().next < walk->EntryCount()) {
            const size_t number = levels.back().next++;
            if (walk->EntryAt(number).mayBeFolder && Enter(number)) {
                return true;
            }
        }
        return false;
    }

    bool Enter(size_t number) {
        const size_t depth = levels.size();
        const size_t pathLength = path.size();
        bool isEntered = false;
        try {
            levels.emplace_back();
            levels.back().pathLength = pathLength;
            path.append(walk->EntryAt(number).name).push_back(u'\\');
            isEntered = walk->Enter(number, levels.back().way) == 0;
            if (isEntered && !IsOnPathTwice()) {
                return true;
            }
        } catch (const std::bad_alloc&) {
        }
        if (isEntered) {
            walk->Leave();
        }
        levels.resize(depth);
        path.resize(pathLength);
        return false;
    }

    void Leave() {
        path.resize(levels.back().pathLength);
        levels.pop_back();
        if (!levels.empty()) {
            walk->Leave();
        }
    }

    // Whether the present folder is also one of those above. Asks the disk only behind something indirect; a folder
    // that can't be identified is none of the others. The length of a path bounds the levels, and so this search.
    bool IsOnPathTwice() {
        Level& present = levels.back();
        present.mayRepeat = present.way == WayIn::Indirect || levels[levels.size() - 2].mayRepeat;
        if (!present.mayRepeat) {
            return false;
        }
        for (size_t i = 0; i < levels.size(); ++i) {
            Level& level = levels[i];
            if (!level.wasAsked) {
                level.wasAsked = true;
                level.isIdentified = walk->ReadIdentity(i, level.identity) == 0;
            }
        }
        const auto isSame = [&present](const Level& level) {
            return level.isIdentified && level.identity == present.identity;
        };
        return present.isIdentified && std::any_of(levels.begin(), levels.end() - 1, isSame);
    }

    std::unique_ptr<FolderWalk> walk;
    // Of the present folder, with a separator at its end.
    std::u16string path;
    std::vector<Level> levels;
    bool isDone = false;
};

class FileCollection final : public ResourceFileWalk {
  public:
    explicit FileCollection(std::vector<String>& found) : files(found) {}

  private:
    bool Visit(FolderWalk& folders, size_t number, std::u16string_view folderPath) override {
        const std::u16string_view name = folders.EntryAt(number).name;
        String file;
        file.Reserve(static_cast<uint32_t>(folderPath.size() + name.size()));
        file.Append(folderPath);
        file.Append(name);
        files.push_back(std::move(file));
        return true;
    }

    std::vector<String>& files;
};

class SearchForNewer final : public ResourceFileWalk {
  public:
    explicit SearchForNewer(const TimeStamp& timeToBeat) : time(timeToBeat) {}

    bool HasFound() const { return hasFound; }

  private:
    bool Visit(FolderWalk& folders, size_t number, std::u16string_view) override {
        uint64_t ticks = 0;
        const bool isRead = folders.ReadWriteTime(number, ticks) == 0;
        hasFound = time < (isRead ? TimeStamp::FromFileTime(ticks) : TimeStamp());
        return !hasFound;
    }

    const TimeStamp time;
    bool hasFound = false;
};

}  // namespace

void FindResourceFiles(const String& directory, const String& pattern, std::vector<String>& files) {
    FileCollection(files).Run(directory, pattern);
}

bool IsAnyResourceFileNewer(const String& directory, const String& pattern, const TimeStamp& time) {
    SearchForNewer search(time);
    search.Run(directory, pattern);
    return search.HasFound();
}

}  // namespace zkhw
