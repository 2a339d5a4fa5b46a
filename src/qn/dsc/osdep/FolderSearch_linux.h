#pragma once

// One search of a folder: its matching names, read at once and put in order.

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "qn/dsc/StringBase.h"

namespace qn::dsc::osdep {

class FolderSearch {
  public:
    // Reads the names in the native folder `path` that match `pattern`. 0 or an errno number. A folder that can't be
    // read to its end gives the names up to there.
    int Read(const std::string& path, std::u16string_view pattern);

    // False when there is no further name.
    bool Next(String& name);

  private:
    struct Name {
        // The first four units of the upper case, first unit highest: this decides most comparisons without the text.
        uint64_t start;
        // Where the name begins in `names`, and its upper case in `upperNames`.
        size_t offset;
        size_t length;
    };

    std::u16string_view TextOf(const Name& name) const {
        return std::u16string_view(names).substr(name.offset, name.length);
    }
    std::u16string_view UpperOf(const Name& name) const {
        return std::u16string_view(upperNames).substr(name.offset, name.length);
    }
    bool IsBefore(const Name& left, const Name& right) const;
    void Add(std::string_view name, std::u16string_view upperPattern);

    // All names one behind the other, and their upper case; both have the same offsets.
    std::u16string names;
    std::u16string upperNames;
    std::vector<Name> order;
    size_t next = 0;
};

}  // namespace qn::dsc::osdep
