#include "qn/dsc/osdep/FileFinder.h"

#include <utility>

namespace qn::dsc::osdep {

namespace {

// The drive and the folder of a path, with the separator behind them.
String FolderPartOf(const String& path) {
    const uint32_t last = std::u16string_view::npos == path.View().find_last_of(u"\\/")
                              ? 0
                              : static_cast<uint32_t>(path.View().find_last_of(u"\\/") + 1);
    const bool isBareDrive = last == 0 && path.Length() >= 2 && path.At(1) == u':';
    return String(path.CStr(), isBareDrive ? 2 : last);
}

}  // namespace

FileFinder::~FileFinder() {
    CloseSearch();
}

std::vector<String> FileFinder::ListFiles(const String& pattern) {
    CloseSearch();
    std::vector<String> found;
    const String folder = FolderPartOf(pattern);
    String name;
    FileSystem& fileSystem = GetFileSystem();
    if (fileSystem.BeginSearch(pattern, search, name) != 0) {
        return found;
    }
    do {
        found.push_back(folder + name);
    } while (fileSystem.NextName(search, name) == 0);
    CloseSearch();
    return found;
}

void FileFinder::CloseSearch() {
    if (search != noSearch) {
        GetFileSystem().EndSearch(std::exchange(search, noSearch));
    }
}

}  // namespace qn::dsc::osdep
