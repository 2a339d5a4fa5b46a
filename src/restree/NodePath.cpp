#include "restree/NodePath.h"

#include <string_view>
#include <vector>

#include "qn/dsc/osdep/Compare.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

using qn::dsc::osdep::Equal;

constexpr std::u16string_view separator = u"/";

// Whether two components, as they stand in their paths, are the same.
bool IsSameComponent(const PieceReader& a, const PieceReader& b) {
    if (!a.MayHaveEscapes() && !b.MayHaveEscapes()) {
        return Equal(a.Raw(), b.Raw());
    }
    return UnescapeText(a.Raw(), separator) == UnescapeText(b.Raw(), separator);
}

}  // namespace

String JoinEscapedPath(TextArgument parentPath, TextArgument name) {
    if (Equal(parentPath.View(), separator)) {
        return JoinList(u"", name, separator, false, true);
    }
    return JoinList(parentPath, name, separator, false, true);
}

String JoinDisplayPath(TextArgument parentPath, TextArgument name, const String* displayName) {
    if (displayName == nullptr) {
        return JoinEscapedPath(parentPath, name);
    }
    return displayName->IsEmpty() ? String(parentPath.View()) : JoinEscapedPath(parentPath, *displayName);
}

String MakeRelativeNodePath(TextArgument target, TextArgument base) {
    PieceReader targetReader(target.View(), separator, false);
    PieceReader baseReader(base.View(), separator, false);
    bool hasTarget = targetReader.Next();
    bool hasBase = baseReader.Next();
    while (hasTarget && hasBase && IsSameComponent(targetReader, baseReader)) {
        hasTarget = targetReader.Next();
        hasBase = baseReader.Next();
    }
    String result;
    if (hasBase) {
        result.Append(u"..");
        while (baseReader.Next()) {
            result.Append(u"/..");
        }
    } else if (hasTarget) {
        result = UnescapeText(targetReader.Raw(), separator);
        hasTarget = targetReader.Next();
    }
    for (; hasTarget; hasTarget = targetReader.Next()) {
        // The component takes the escapes that EscapeText gives it, which need not be those that it has here: a
        // backslash before any other unit stands for itself and gets another one.
        result.Append(separator);
        result.Append(EscapeText(UnescapeText(targetReader.Raw(), separator), separator));
    }
    return result;
}

String RebaseListPaths(TextArgument list, TextArgument base) {
    std::vector<String> pieces;
    SplitList(list, u',', pieces, true);
    for (String& piece : pieces) {
        if (piece.View().starts_with(u'/')) {
            piece = MakeRelativeNodePath(piece, base);
        }
    }
    return JoinAll(pieces, u',', true);
}

}  // namespace zkhw
