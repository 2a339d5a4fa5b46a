#include "qn/dsc/osdep/FolderList_windows.h"

#include <windows.h>

#include <algorithm>
#include <memory>
#include <tuple>

#include "qn/dsc/osdep/NameOrder.h"
#include "qn/dsc/osdep/NativeFile_windows.h"

namespace qn::dsc::osdep {

namespace {

struct SearchCloser {
    using pointer = HANDLE;
    void operator()(HANDLE search) const {
        if (search != INVALID_HANDLE_VALUE) {
            FindClose(search);
        }
    }
};
using Search = std::unique_ptr<HANDLE, SearchCloser>;

bool IsDotName(std::u16string_view name) {
    return name == u"." || name == u"..";
}

}  // namespace

int FolderList::Read(const std::u16string& folder, std::u16string_view upperPattern, bool keepsFolders) {
    names.clear();
    std::u16string everything = folder;
    if (everything.back() != u'\\' && everything.back() != u'/') {
        everything += u'\\';
    }
    everything += u'*';
    WIN32_FIND_DATAW found;
    const Search search(
        FindFirstFileExW(everything.c_str(), FindExInfoBasic, &found, FindExSearchNameMatch, nullptr, 0));
    if (search.get() == INVALID_HANDLE_VALUE) {
        return LastErrno();
    }
    do {
        Name name{found.cFileName, {}, false, IsFolder(found.dwFileAttributes), IsLink(found.dwFileAttributes)};
        AppendUpper(name.text, name.upper);
        name.isMatch = MatchesPattern(upperPattern, name.upper);
        name.isFolder = name.isFolder && !IsDotName(name.text);
        if (name.isMatch || (keepsFolders && name.isFolder)) {
            names.push_back(std::move(name));
        }
    } while (FindNextFileW(search.get(), &found) != 0);
    Sort();
    return 0;
}

void FolderList::Sort() {
    // Volumes of other kinds than NTFS give the order in which the names were made.
    std::sort(names.begin(), names.end(), [](const Name& left, const Name& right) {
        return std::forward_as_tuple(!IsDotName(left.text), left.upper, left.text) <
               std::forward_as_tuple(!IsDotName(right.text), right.upper, right.text);
    });
}

}  // namespace qn::dsc::osdep
