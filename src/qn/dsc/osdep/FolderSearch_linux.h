#pragma once

// One search of a folder: its matching names, read at once and put in order.

#include <cstddef>
#include <string>
#include <string_view>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/NameList_linux.h"

namespace qn::dsc::osdep {

class FolderSearch {
  public:
    // Reads the names in the native folder `path` that match `pattern`. 0 or an errno number. A folder that can't be
    // read to its end gives the names up to there.
    int Read(const std::string& path, std::u16string_view pattern);

    // False when there is no further name.
    bool Next(String& name);

  private:
    NameList names;
    size_t next = 0;
};

}  // namespace qn::dsc::osdep
