#pragma once

// The names of one folder, chosen by a pattern and put in listing order.

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace qn::dsc::osdep {

class FolderList {
  public:
    struct Name {
        std::u16string text;
        std::u16string upper;
        bool isMatch;
        bool isFolder;
        // A link, or another way to somewhere else.
        bool isLink;
    };

    // Reads the names in `folder`, a path as calls take it, that match `upperPattern`, and with `keepsFolders` all
    // folders but "." and ".." too. 0 or an errno number; a folder that can't be read to its end gives the names up to
    // there. Only full names count: the short ones that some volumes keep beside them would let "*.xml" find "a.xmlx".
    int Read(const std::u16string& folder, std::u16string_view upperPattern, bool keepsFolders);
    void Clear() { names.clear(); }

    size_t Count() const { return names.size(); }
    const Name& At(size_t number) const { return names[number]; }

  private:
    void Sort();

    std::vector<Name> names;
};

}  // namespace qn::dsc::osdep
