#pragma once

// Walks on Windows: by paths, which get longer and shorter by one name.

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/FileSystem.h"
#include "qn/dsc/osdep/FolderList_windows.h"

namespace qn::dsc::osdep {

class NativeFolderWalk final : public FolderWalk {
  public:
    explicit NativeFolderWalk(const String& namePattern);

    // To be called once, before anything else. 0 or an errno number; the walk is then of no use.
    int Begin(const String& folder);

    int List() override;
    size_t EntryCount() const override { return levels.back().names.Count(); }
    WalkEntry EntryAt(size_t number) const override;
    int Enter(size_t number, WayIn& way) override;
    void Leave() override;
    int ReadWriteTime(size_t number, uint64_t& time) override;
    int ReadIdentity(size_t level, FileIdentity& identity) override;

  private:
    struct Level {
        FolderList names;
        // Of this folder's path within `path`.
        size_t pathLength;
    };

    // In the system's form, as the walk was told and behind that the names; a separator at the end.
    std::u16string PathOf(size_t number) const;

    std::u16string upperPattern;
    std::u16string path;
    // The present path.
    std::vector<Level> levels;
};

}  // namespace qn::dsc::osdep
