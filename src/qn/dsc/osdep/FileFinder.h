#pragma once

// Searches of a folder by pattern.

#include <vector>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/FileSystem.h"

namespace qn::dsc::osdep {

// Owns the search that it has open.
class FileFinder {
  public:
    FileFinder() = default;
    ~FileFinder();

    FileFinder(const FileFinder&) = delete;
    FileFinder& operator=(const FileFinder&) = delete;

    // The files and folders that match `pattern`: a folder's path and behind it a name in which "*" stands for any
    // units and "?" for any one. Each is given as the text of `pattern` up to its last separator and the name as it is
    // on the disk. "." and ".." come first, if they match, then the others in ascending order of their upper-cased
    // units. Empty if there is no such folder or it can't be read. Throws std::bad_alloc only; the search is then left
    // open until the next one or the destructor. n log n in the names of the folder, which is read once.
    std::vector<String> ListFiles(const String& pattern);

  private:
    void CloseSearch();

    // noSearch: no search is open.
    SearchHandle search = noSearch;
};

}  // namespace qn::dsc::osdep
