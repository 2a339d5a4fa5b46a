#include "restree/NodePath.h"

#include <algorithm>
#include <string_view>
#include <vector>

#include "qn/dsc/FindUnit.h"
#include "qn/dsc/TextBuilder.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

using qn::dsc::TextBuilder;
using qn::dsc::osdep::Equal;

constexpr std::u16string_view separator = u"/";

// Whether two components, as they stand in their paths, are the same.
bool IsSameComponent(const PieceReader& a, const PieceReader& b) {
    if (!a.MayHaveEscapes() && !b.MayHaveEscapes()) {
        return Equal(a.Raw(), b.Raw());
    }
    return UnescapeText(a.Raw(), separator) == UnescapeText(b.Raw(), separator);
}

bool HasBackslash(std::u16string_view text) {
    return qn::dsc::FindUnit(text, u'\\') != text.size();
}

// Appends the components of a path from that of `reader` on; `isFirst` if nothing of the path stands in front of them.
void AppendComponents(TextBuilder& result, PieceReader& reader, bool isFirst) {
    if (!isFirst) {
        result.Append(separator);
    }
    if (!HasBackslash(reader.RawToTheEnd())) {
        // As nearly always: the components stand as they are, with the separators between them.
        result.Append(reader.RawToTheEnd());
        return;
    }
    const String first = UnescapeText(reader.Raw(), separator);
    result.Append(isFirst ? first.View() : EscapeText(first, separator).View());
    while (reader.Next()) {
        // The component takes the escapes that EscapeText gives it, which need not be those that it has here: a
        // backslash before any other unit stands for itself and gets another one.
        result.Append(separator);
        result.Append(EscapeText(UnescapeText(reader.Raw(), separator), separator).View());
    }
}

// How many components follow that of `reader`.
size_t CountFurther(PieceReader& reader) {
    const std::u16string_view rest = reader.RawToTheEnd();
    if (!HasBackslash(rest)) {
        return static_cast<size_t>(std::count(rest.begin(), rest.end(), u'/'));
    }
    size_t count = 0;
    while (reader.Next()) {
        ++count;
    }
    return count;
}

// The length of the components that both paths begin with, unit by unit alike and without escapes, with the separator
// behind them. Something is left of both.
size_t SharedLength(std::u16string_view a, std::u16string_view b) {
    const size_t length = std::min(a.size(), b.size());
    size_t shared = 0;
    for (size_t at = 0; at + 1 < length && a[at] == b[at] && a[at] != u'\\'; ++at) {
        shared = a[at] == u'/' ? at + 1 : shared;
    }
    return shared;
}

// Appends what MakeRelativeNodePath gives.
void AppendRelativePath(TextBuilder& result, std::u16string_view target, std::u16string_view base) {
    // Nearly all that there is to compare.
    const size_t shared = SharedLength(target, base);
    target.remove_prefix(shared);
    base.remove_prefix(shared);
    PieceReader targetReader(target, separator, false);
    PieceReader baseReader(base, separator, false);
    bool hasTarget = targetReader.Next();
    bool hasBase = baseReader.Next();
    while (hasTarget && hasBase && IsSameComponent(targetReader, baseReader)) {
        hasTarget = targetReader.Next();
        hasBase = baseReader.Next();
    }
    if (hasBase) {
        result.Append(u"..");
        for (size_t count = CountFurther(baseReader); count > 0; --count) {
            result.Append(u"/..");
        }
    }
    if (hasTarget) {
        AppendComponents(result, targetReader, !hasBase);
    }
}

// RebaseListPaths for a list without backslashes: there is nothing to take the escapes out of, and nothing that a piece
// of the result needs them for. `base` may have them, but none of it gets into the result.
String RebasePlainList(std::u16string_view list, std::u16string_view base) {
    TextBuilder result;
    size_t end = 0;
    for (size_t begin = 0; begin <= list.size() && !list.empty(); begin = end + 1) {
        end = qn::dsc::FindUnit(list, u',', begin);
        const std::u16string_view piece = TrimmedPart(list.substr(begin, end - begin));
        if (begin != 0) {
            result.Append(u',');
        }
        if (piece.starts_with(u'/')) {
            AppendRelativePath(result, piece, base);
        } else {
            result.Append(piece);
        }
    }
    return result.Text();
}

}  // namespace

String JoinEscapedPath(TextArgument parentPath, TextArgument name) {
    if (Equal(parentPath.View(), separator)) {
        return JoinList(u"", name, separator, false, true);
    }
    return JoinList(parentPath, name, separator, false, true);
}

String JoinDisplayPath(TextArgument parentPath, TextArgument name, std::optional<std::u16string_view> displayName) {
    if (!displayName) {
        return JoinEscapedPath(parentPath, name);
    }
    return displayName->empty() ? String(parentPath.View()) : JoinEscapedPath(parentPath, *displayName);
}

String MakeRelativeNodePath(TextArgument target, TextArgument base) {
    TextBuilder result;
    AppendRelativePath(result, target.View(), base.View());
    return result.Text();
}

String RebaseListPaths(TextArgument list, TextArgument base) {
    if (!HasBackslash(list.View())) {
        return RebasePlainList(list.View(), base.View());
    }
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
