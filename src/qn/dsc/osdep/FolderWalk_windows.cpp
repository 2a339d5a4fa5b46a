#include "qn/dsc/osdep/FolderWalk_windows.h"

#include <cerrno>

#include "qn/dsc/osdep/NameOrder.h"
#include "qn/dsc/osdep/NativeFile_windows.h"

namespace qn::dsc::osdep {

NativeFolderWalk::NativeFolderWalk(const String& namePattern) {
    AppendUpper(namePattern.View(), upperPattern);
}

int NativeFolderWalk::Begin(const String& folder) {
    path = folder.View().substr(0, folder.View().find(u'\0'));
    if (!path.empty() && path.back() != u'\\' && path.back() != u'/') {
        path.push_back(u'\\');
    }
    CallPath call;
    int error = MakeCallPath(path, call);
    FileAttributes attributes;
    if (error == 0) {
        error = ReadCallAttributes(call.text, attributes);
    }
    if (error == 0 && !attributes.isDirectory) {
        error = ENOTDIR;
    }
    if (error == 0) {
        levels.push_back({FolderList(), path.size()});
    }
    return error;
}

int NativeFolderWalk::List() {
    levels.back().names.Clear();
    CallPath call;
    const int error = MakeCallPath(path, call);
    return error != 0 ? error : levels.back().names.Read(call.text, upperPattern, true);
}

WalkEntry NativeFolderWalk::EntryAt(size_t number) const {
    const FolderList::Name& name = levels.back().names.At(number);
    return {name.text, name.isMatch, name.isFolder};
}

int NativeFolderWalk::Enter(size_t number, WayIn& way) {
    const FolderList::Name& name = levels.back().names.At(number);
    CallPath call;
    const std::u16string below = PathOf(number);
    int error = MakeCallPath(below, call);
    if (error == 0 && (!name.isFolder || name.isLink)) {
        FileAttributes attributes;
        error = ReadCallAttributes(call.text, attributes);
        error = error == 0 && !attributes.isDirectory ? ENOTDIR : error;
    }
    if (error != 0) {
        return error;
    }
    const bool isLink = name.isLink;
    levels.push_back({FolderList(), below.size() + 1});
    path = below;
    path.push_back(u'\\');
    way = isLink ? WayIn::Indirect : WayIn::Direct;
    return 0;
}

void NativeFolderWalk::Leave() {
    levels.pop_back();
    path.resize(levels.back().pathLength);
}

int NativeFolderWalk::ReadWriteTime(size_t number, uint64_t& time) {
    CallPath call;
    int error = MakeCallPath(PathOf(number), call);
    FileAttributes attributes;
    if (error == 0) {
        error = ReadCallAttributes(call.text, attributes);
    }
    if (error == 0) {
        time = attributes.lastWriteTime;
    }
    return error;
}

int NativeFolderWalk::ReadIdentity(size_t level, FileIdentity& identity) {
    CallPath call;
    const int error = MakeCallPath(std::u16string_view(path).substr(0, levels[level].pathLength), call);
    return error != 0 ? error : ReadCallIdentity(call, identity);
}

std::u16string NativeFolderWalk::PathOf(size_t number) const {
    return path + levels.back().names.At(number).text;
}

}  // namespace qn::dsc::osdep
