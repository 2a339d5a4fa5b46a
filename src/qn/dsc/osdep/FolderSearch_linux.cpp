#include "qn/dsc/osdep/FolderSearch_linux.h"

#include "qn/dsc/osdep/NativeFolder_linux.h"

namespace qn::dsc::osdep {

int FolderSearch::Read(const std::string& path, std::u16string_view pattern) {
    OpenFolder folder;
    const int error = OpenNativeFolder(path, folder);
    if (error != 0) {
        return error;
    }
    const NamePattern wanted(pattern);
    names.Add(".", wanted, false);
    names.Add("..", wanted, false);
    const size_t firstToSort = names.Count();
    while (const char* name = NextNativeName(folder.get())) {
        names.Add(name, wanted, false);
    }
    names.Sort(firstToSort);
    return 0;
}

bool FolderSearch::Next(String& name) {
    if (next == names.Count()) {
        return false;
    }
    name.Assign(names.TextOf(names.At(next)));
    ++next;
    return true;
}

}  // namespace qn::dsc::osdep
