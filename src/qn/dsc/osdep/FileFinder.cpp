#include "qn/dsc/osdep/FileFinder.h"

#include <utility>

namespace qn::dsc::osdep {

namespace {

// The drive and the folder of a path, with the separator behind them.
String FolderPartOf(const String& path) {
    const size_t last = path.View().find_last_of(u"\\/");
    if (last != std::u16string_view::npos) {
        return path.Substring(0, static_cast<uint32_t>(last) + 1);
    }
    const bool hasDrive = path.Length() >= 2 && path.At(1) == u':';
    return path.Substring(0, hasDrive ? 2 : 0);
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
