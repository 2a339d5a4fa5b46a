#pragma once

// A walk through the folders of a file system that has no better one: by its searches and attributes.

#include <algorithm>
#include <cerrno>
#include <string>
#include <vector>

#include "qn/dsc/osdep/FileSystem.h"

namespace fuzz {

class SearchingFolderWalk : public qn::dsc::osdep::FolderWalk {
  public:
    using String = qn::dsc::String;

    SearchingFolderWalk(qn::dsc::osdep::FileSystem& files, std::u16string_view start, std::u16string_view pattern)
        : files(files), pattern(pattern) {
        levels.push_back({std::u16string(start), {}});
    }

    int List() override {
        Level& level = levels.back();
        const std::vector<std::u16string> matches = Search(level.path, pattern);
        level.entries.clear();
        for (const std::u16string& name : Search(level.path, u"*")) {
            const bool isMatch = std::find(matches.begin(), matches.end(), name) != matches.end();
            const bool mayBeFolder = name != u"." && name != u".." && IsFolder(Below(level, name));
            if (isMatch || mayBeFolder) {
                level.entries.push_back({name, isMatch, mayBeFolder});
            }
        }
        return 0;
    }

    size_t EntryCount() const override { return levels.back().entries.size(); }

    qn::dsc::osdep::WalkEntry EntryAt(size_t number) const override {
        const Entry& entry = levels.back().entries[number];
        return {entry.name, entry.isMatch, entry.mayBeFolder};
    }

    int Enter(size_t number, qn::dsc::osdep::WayIn& way) override {
        const std::u16string path = Below(levels.back(), levels.back().entries[number].name);
        if (!IsFolder(path)) {
            return ENOTDIR;
        }
        way = qn::dsc::osdep::WayIn::Direct;
        levels.push_back({path, {}});
        return 0;
    }

    void Leave() override { levels.pop_back(); }

    int ReadWriteTime(size_t number, uint64_t& time) override {
        qn::dsc::osdep::FileAttributes attributes;
        const int error =
            files.ReadAttributes(String(Below(levels.back(), levels.back().entries[number].name)), attributes);
        time = attributes.lastWriteTime;
        return error;
    }

    int ReadIdentity(size_t level, qn::dsc::osdep::FileIdentity& identity) override {
        return files.ReadIdentity(String(levels[level].path), identity);
    }

  private:
    struct Entry {
        std::u16string name;
        bool isMatch;
        bool mayBeFolder;
    };
    struct Level {
        std::u16string path;
        std::vector<Entry> entries;
    };

    static std::u16string Below(const Level& level, const std::u16string& name) {
        return level.path.ends_with(u'\\') ? level.path + name : level.path + u'\\' + name;
    }

    bool IsFolder(const std::u16string& path) {
        qn::dsc::osdep::FileAttributes attributes;
        return files.ReadAttributes(String(path), attributes) == 0 && attributes.isDirectory;
    }

    std::vector<std::u16string> Search(const std::u16string& folder, const std::u16string& wanted) {
        std::vector<std::u16string> names;
        qn::dsc::osdep::SearchHandle search;
        String name;
        const String text(Below({folder, {}}, wanted));
        for (int error = files.BeginSearch(text, search, name); error == 0; error = files.NextName(search, name)) {
            names.emplace_back(name.View());
        }
        return names;
    }

    qn::dsc::osdep::FileSystem& files;
    std::u16string pattern;
    std::vector<Level> levels;
};

}  // namespace fuzz
