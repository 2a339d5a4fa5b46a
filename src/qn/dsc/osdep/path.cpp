#include "qn/dsc/osdep/path.h"

#include <string_view>
#include <vector>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/Compare.h"

// What is pure text; path_disk.cpp and CopyDirectoryTree.cpp have the rest of path.h.

namespace qn::dsc::osdep {

namespace {

constexpr char16_t separator = u'\\';

bool IsLetter(char16_t unit) {
    return (unit >= u'a' && unit <= u'z') || (unit >= u'A' && unit <= u'Z');
}

// The length of "C:" or "AB:" at the start; 0 if there is none.
size_t DriveLength(std::u16string_view path) {
    size_t letters = 0;
    while (letters < path.size() && letters < 2 && IsLetter(path[letters])) {
        ++letters;
    }
    return letters > 0 && letters < path.size() && path[letters] == u':' ? letters + 1 : 0;
}

bool IsNetworkPath(std::u16string_view path) {
    return path.size() >= 2 && path[0] == separator && path[1] == separator;
}

bool IsAbsolute(std::u16string_view path) {
    const size_t drive = DriveLength(path);
    return IsNetworkPath(path) || (drive != 0 && drive < path.size() && path[drive] == separator);
}

bool EndsInSeparator(std::u16string_view path) {
    return !path.empty() && path.back() == separator;
}

std::u16string_view DirectoryPart(std::u16string_view path) {
    const size_t start = path.find_first_not_of(separator, DriveLength(path));
    if (start == std::u16string_view::npos) {
        return path;
    }
    size_t end = path.rfind(separator);
    if (end == std::u16string_view::npos || end < start) {
        return path.substr(0, start);
    }
    while (path[end - 1] == separator) {
        --end;
    }
    return path.substr(0, end);
}

// The pieces of `path`, each of which has a backslash behind it; of the two in front of a network path the first
// belongs to the first piece.
std::vector<std::u16string_view> SplitPieces(std::u16string_view path) {
    std::vector<std::u16string_view> pieces;
    size_t start = 0;
    size_t end = path.find(separator, IsNetworkPath(path) ? 1 : 0);
    while (end != std::u16string_view::npos) {
        pieces.push_back(path.substr(start, end - start));
        start = end + 1;
        end = path.find(separator, start);
    }
    return pieces;
}

// Leaves the pieces that stand when "." and ".." are folded away, the last one first. False: there is no such path.
bool FoldPieces(const std::vector<std::u16string_view>& pieces, std::vector<std::u16string_view>& kept) {
    size_t pending = 0;
    for (size_t i = pieces.size(); i-- > 0;) {
        const std::u16string_view piece = pieces[i];
        if (Equal(piece, u"...")) {
            return false;
        }
        if (Equal(piece, u"..")) {
            ++pending;
        } else if (Equal(piece, u".")) {
            continue;
        } else if (pending == 0) {
            kept.push_back(piece);
        } else if (i == 0) {
            return false;
        } else {
            --pending;
        }
    }
    return true;
}

}  // namespace

bool IsAbsolutePath(const String& path) {
    return IsAbsolute(path.View());
}

String JoinPath(const String& base, const String& part) {
    if (base.IsEmpty() || IsAbsolute(part.View())) {
        return part;
    }
    return EndsInSeparator(base.View()) ? String::Concat(base, part)
                                        : String::Concat({base.View(), u"\\", part.View()});
}

void AppendPathPart(String& base, const String& part) {
    if (base.IsEmpty() || IsAbsolute(part.View())) {
        base = part;
        return;
    }
    AppendSeparator(base);
    base.Append(part);
}

String GetFileName(const String& path) {
    const std::u16string_view view = path.View();
    const size_t last = view.rfind(separator);
    if (last != std::u16string_view::npos) {
        return String(view.substr(last + 1));
    }
    return !view.empty() && DriveLength(view) == view.size() ? String() : path;
}

String GetDirectoryName(const String& path) {
    return String(DirectoryPart(path.View()));
}

void AppendSeparator(String& path) {
    if (path.IsEmpty()) {
        exception::ThrowAt(exception::InvalidArgument(), "qn/dsc/osdep/path", __LINE__);
    }
    if (!EndsInSeparator(path.View())) {
        path.Append(1, separator);
    }
}

String NormalizePath(const String& path) {
    if (!IsAbsolute(path.View())) {
        return String();
    }
    if (path.Find(u'.') == String::npos) {
        return path;
    }
    String closed = path;
    AppendSeparator(closed);
    std::vector<std::u16string_view> kept;
    if (!FoldPieces(SplitPieces(closed.View()), kept)) {
        return String();
    }
    String result;
    result.Reserve(closed.Length());
    for (auto piece = kept.rbegin(); piece != kept.rend(); ++piece) {
        result.Append(*piece);
        result.Append(1, separator);
    }
    return EndsInSeparator(path.View()) ? result : GetDirectoryName(result);
}

String MakeAbsolutePath(const String& path) {
    if (IsAbsolute(path.View())) {
        return path;
    }
    return path.IsEmpty() ? GetCurrentDirectoryPath() : JoinPath(GetCurrentDirectoryPath(), path);
}

}  // namespace qn::dsc::osdep
