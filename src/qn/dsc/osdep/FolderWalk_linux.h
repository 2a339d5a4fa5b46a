#pragma once

// Walks on Linux. A folder is opened relative to the one above it and read by one listing, which tells the kind of each
// name; what stands in it is asked for its time relative to it.

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/FileSystem.h"
#include "qn/dsc/osdep/NameList_linux.h"

namespace qn::dsc::osdep {

class NativeFolderWalk final : public FolderWalk {
  public:
    explicit NativeFolderWalk(const String& namePattern);
    ~NativeFolderWalk() override;

    NativeFolderWalk(const NativeFolderWalk&) = delete;
    NativeFolderWalk& operator=(const NativeFolderWalk&) = delete;

    // To be called once, before anything else. 0 or an errno number; the walk is then of no use.
    int Begin(const String& folder);

    int List() override;
    size_t EntryCount() const override { return Present().names.Count(); }
    WalkEntry EntryAt(size_t number) const override;
    int Enter(size_t number, WayIn& way) override;
    void Leave() override;
    int ReadWriteTime(size_t number, uint64_t& time) override;
    int ReadIdentity(size_t level, FileIdentity& identity) override;

  private:
    struct Level {
        // -1: closed, to be opened by its path when it is needed.
        int descriptor = -1;
        // How much of `path` leads here.
        size_t pathLength = 0;
        // Units of the path in the system's form, with the separator at its end.
        size_t systemLength = 0;
        NameList names;
    };

    Level& Present() { return levels[depth - 1]; }
    const Level& Present() const { return levels[depth - 1]; }
    std::string PathOf(const Level& level) const;

    int ReadNames();
    // Opens an entry of the present folder, whose path is `path` already.
    int OpenEntry(const char* name, int& descriptor, WayIn& way);
    int EnsureOpen(Level& level);
    void CloseAll();
    // The name to be used in calls, which lives as long as that of the entry, or until this is called again. 0, ENOENT,
    // or ENAMETOOLONG if the path of the entry is too long in the system's form.
    int NativeNameOf(size_t number, const char*& name);

    const NamePattern pattern;
    // Of the present folder; empty for the root of the system, as every name brings its slash.
    std::string path;
    // The first `depth` are the present path. The others keep their memory for the folders to come.
    std::vector<Level> levels;
    size_t depth = 0;
    // The last name that had to be looked for.
    std::string foundName;
    const std::unique_ptr<char[]> listing;
};

}  // namespace qn::dsc::osdep
