#include "restree/TextList.h"

#include <algorithm>
#include <cstdint>
#include <limits>
#include <optional>
#include <utility>

#include "qn/dsc/FindUnit.h"
#include "qn/dsc/TextBuilder.h"
#include "qn/dsc/osdep/Compare.h"

namespace zkhw {

namespace {

using qn::dsc::FindEither;
using qn::dsc::FindUnit;
using qn::dsc::TextBuilder;
using qn::dsc::osdep::Equal;

// The length of the delimiter at the front of `text`, 0 if it doesn't stand there.
size_t LengthAtFront(std::u16string_view text, std::u16string_view delimiter) {
    return text.starts_with(delimiter) ? delimiter.size() : 0;
}

// Calls `take` for the stretches of `text` that each get a backslash in front, but for the first, which gets none and
// may be empty. `delimiterAt` gives the length of the delimiter at the front of a text that isn't empty, or 0.
template <typename DelimiterAt, typename Take>
void ForEachEscaped(std::u16string_view text, DelimiterAt delimiterAt, Take take) {
    size_t begin = 0;
    size_t at = 0;
    while (at < text.size()) {
        const size_t length = delimiterAt(text.substr(at));
        if (length != 0 || text[at] == u'\\') {
            take(text.substr(begin, at - begin));
            begin = at;
        }
        at += std::max<size_t>(length, 1);
    }
    take(text.substr(begin));
}

template <typename DelimiterAt>
String EscapeBy(std::u16string_view text, DelimiterAt delimiterAt) {
    size_t stretches = 0;
    ForEachEscaped(text, delimiterAt, [&](std::u16string_view) { ++stretches; });
    if (stretches == 1) {
        return String(text);
    }
    String result;
    // A length that a String can't have is left to Append, which refuses it.
    result.Reserve(
        static_cast<uint32_t>(std::min<size_t>(text.size() + stretches - 1, std::numeric_limits<int32_t>::max())));
    bool isFirst = true;
    ForEachEscaped(text, delimiterAt, [&](std::u16string_view stretch) {
        if (!isFirst) {
            result.Append(1, u'\\');
        }
        result.Append(stretch);
        isFirst = false;
    });
    return result;
}

// Whether EscapeText would change the text.
bool NeedsEscapes(std::u16string_view text, std::u16string_view delimiter) {
    if (delimiter.size() == 1) {
        return FindEither(text, delimiter.front(), u'\\') != text.size();
    }
    return FindUnit(text, u'\\') != text.size() || (!delimiter.empty() && text.find(delimiter) != text.npos);
}

// A part of a list with its escapes put in if that is wanted and makes a difference.
class ListPart {
  public:
    ListPart(std::u16string_view text, std::u16string_view separator, bool escape) : view(text) {
        if (escape && NeedsEscapes(text, separator)) {
            escaped.emplace(EscapeText(text, separator));
            view = escaped->View();
        }
    }
    ListPart(const ListPart&) = delete;
    ListPart& operator=(const ListPart&) = delete;

    std::u16string_view View() const { return view; }

  private:
    std::optional<String> escaped;
    std::u16string_view view;
};

// Hands each piece of a list, without its escapes, to `add`.
template <typename Add>
void ForEachPiece(std::u16string_view text, std::u16string_view separator, bool trim, Add add) {
    PieceReader reader(text, separator, trim);
    while (reader.Next()) {
        add(reader.MayHaveEscapes() ? UnescapeText(reader.Raw(), separator) : String(reader.Raw()));
    }
}

}  // namespace

PieceReader::PieceReader(std::u16string_view text, std::u16string_view listSeparator, bool trim)
    : rest(text), separator(listSeparator), trims(trim), isAtEnd(text.empty()) {}

bool PieceReader::Next() {
    if (isAtEnd) {
        return false;
    }
    const size_t end = FindSeparator();
    piece = rest.substr(0, end);
    isAtEnd = end == std::u16string_view::npos;
    rest.remove_prefix(isAtEnd ? rest.size() : end + separator.size());
    if (trims) {
        piece = TrimmedPart(piece);
    }
    return true;
}

// The offset of the next separator in `rest` that isn't escaped, or npos; and notes whether a backslash goes by.
size_t PieceReader::FindSeparator() {
    if (separator.size() == 1 && separator.front() != u'\\') {
        return FindSeparatorUnit();
    }
    const size_t end = FindLongSeparator();
    hasBackslash = FindUnit(rest.substr(0, end), u'\\') != std::min(end, rest.size());
    return end;
}

// For a separator of one unit that is no backslash, which nearly all are: goes from backslash to backslash.
size_t PieceReader::FindSeparatorUnit() {
    const char16_t unit = separator.front();
    hasBackslash = false;
    size_t at = 0;
    while ((at = FindEither(rest, unit, u'\\', at)) < rest.size()) {
        if (rest[at] == unit) {
            return at;
        }
        hasBackslash = true;
        // Two backslashes leave what follows them as it is; one takes a separator along.
        ++at;
        if (at < rest.size() && (rest[at] == u'\\' || rest[at] == unit)) {
            ++at;
        }
    }
    return std::u16string_view::npos;
}

size_t PieceReader::FindLongSeparator() {
    // The run of backslashes is counted as it goes by: looking back from each separator would count a long run anew
    // for every separator that holds a backslash itself.
    size_t backslashes = backslashesBefore;
    size_t at = 0;
    while (at < rest.size()) {
        const bool isSeparator =
            !separator.empty() && rest[at] == separator.front() && rest.substr(at, separator.size()) == separator;
        if (!isSeparator) {
            backslashes = rest[at] == u'\\' ? backslashes + 1 : 0;
            ++at;
            continue;
        }
        const bool isEscaped = backslashes % 2 != 0;
        const size_t last = separator.find_last_not_of(u'\\');
        backslashes = last == separator.npos ? backslashes + separator.size() : separator.size() - 1 - last;
        if (!isEscaped) {
            backslashesBefore = backslashes;
            return at;
        }
        at += separator.size();
    }
    return std::u16string_view::npos;
}

void SplitList(TextArgument text, TextArgument separator, std::vector<String>& list, bool trim) {
    ForEachPiece(text.View(), separator.View(), trim, [&](String&& piece) { list.push_back(std::move(piece)); });
}

void SplitList(TextArgument text, TextArgument separator, std::set<String>& list, bool trim) {
    ForEachPiece(text.View(), separator.View(), trim, [&](String&& piece) { list.insert(std::move(piece)); });
}

String JoinList(TextArgument a, TextArgument b, TextArgument separator, bool escapeA, bool escapeB) {
    const ListPart partA(a.View(), separator.View(), escapeA);
    const ListPart partB(b.View(), separator.View(), escapeB);
    return String::Concat({partA.View(), separator.View(), partB.View()});
}

String JoinAll(const std::vector<String>& list, TextArgument separator, bool escape) {
    TextBuilder result;
    bool isFirst = true;
    for (const String& piece : list) {
        if (!isFirst) {
            result.Append(separator.View());
        }
        result.Append(ListPart(piece.View(), separator.View(), escape).View());
        isFirst = false;
    }
    return result.Text();
}

String EscapeText(TextArgument text, TextArgument delimiter) {
    if (!NeedsEscapes(text.View(), delimiter.View())) {
        return String(text.View());
    }
    return EscapeBy(text.View(),
                    [view = delimiter.View()](std::u16string_view rest) { return LengthAtFront(rest, view); });
}

String EscapeText(TextArgument text, std::initializer_list<std::u16string_view> delimiters) {
    return EscapeBy(text.View(), [&](std::u16string_view rest) {
        size_t length = 0;
        for (std::u16string_view delimiter : delimiters) {
            length = length != 0 ? length : LengthAtFront(rest, delimiter);
        }
        return length;
    });
}

String EscapeText(TextArgument text, CharacterSet delimiters) {
    return EscapeBy(text.View(), [&](std::u16string_view rest) {
        return delimiters.units.find(rest.front()) == std::u16string_view::npos ? size_t{0} : size_t{1};
    });
}

String UnescapeText(TextArgument text, TextArgument delimiter) {
    const std::u16string_view source = text.View();
    TextBuilder result;
    size_t copied = 0;
    size_t at = FindUnit(source, u'\\');
    while (at < source.size()) {
        const std::u16string_view behind = source.substr(at + 1);
        const size_t escaped = behind.starts_with(u'\\') ? 1 : LengthAtFront(behind, delimiter.View());
        if (escaped != 0) {
            // What is copied next begins with the escaped text; its backslash is left out.
            result.Append(source.substr(copied, at - copied));
            copied = at + 1;
        }
        at = FindUnit(source, u'\\', at + 1 + escaped);
    }
    result.Append(source.substr(copied));
    return result.Text();
}

bool EndsWith(TextArgument text, TextArgument literal) {
    const std::u16string_view whole = text.View();
    const std::u16string_view wanted = literal.View();
    return whole.size() >= wanted.size() && Equal(whole.substr(whole.size() - wanted.size()), wanted);
}

String TrimWhitespace(TextArgument text) {
    return String(TrimmedPart(text.View()));
}

bool ParseBool(TextArgument text) {
    for (std::u16string_view word : {u"true", u"yes", u"1", u"on", u"enable"}) {
        if (Equal(text.View(), word)) {
            return true;
        }
    }
    return false;
}

}  // namespace zkhw
