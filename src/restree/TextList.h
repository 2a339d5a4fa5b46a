#pragma once

// Texts that hold lists: pieces with a separator between them and a backslash before each separator or backslash that
// belongs to a piece. Node paths, "Protocols", "Reserves", the cache and localised values are all such texts.
// A text goes in as a String, a literal, a range or one unit, and is only read. Everything is pure: no state, no files.
// std::bad_alloc if there is no memory; a list keeps what was added to it before. All of it is linear in the texts for
// separators and delimiters of one unit; longer ones count once more for each of their units.

#include <cstddef>
#include <initializer_list>
#include <set>
#include <string_view>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/TextArgument.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::TextArgument;

// The pieces of a list one by one, as they stand in the text, without a copy.
class PieceReader {
  public:
    // Both texts must outlive the reader. With `trim` blanks, tabs, returns and line feeds at both ends of each piece
    // are left out. An empty `separator` never splits.
    PieceReader(std::u16string_view text, std::u16string_view separator, bool trim);

    // Steps to the next piece; false if there is none. An empty text has no pieces; any other has one more than it has
    // separators, empty ones included. A separator behind an odd number of backslashes belongs to the piece.
    bool Next();

    // The piece, with its escapes; UnescapeText gives the text that it stands for.
    std::u16string_view Raw() const { return piece; }

    // The text from the piece on, with all that follows it.
    std::u16string_view RawToTheEnd() const {
        return {piece.data(), static_cast<size_t>(rest.data() + rest.size() - piece.data())};
    }

    // Whether there is a backslash in the piece, so that Raw may differ from the text that it stands for.
    bool MayHaveEscapes() const { return hasBackslash; }

  private:
    size_t FindSeparator();
    size_t FindSeparatorUnit();
    size_t FindLongSeparator();

    // What stands behind the separator found last.
    std::u16string_view rest;
    std::u16string_view separator;
    std::u16string_view piece;
    // How many backslashes stand directly before `rest`; only a separator that ends in one leaves any.
    size_t backslashesBefore = 0;
    bool trims;
    bool isAtEnd;
    bool hasBackslash = false;
};

// Appends the pieces of `text` to `list`, each without its escapes: nothing for an empty text. With `trim` blanks,
// tabs, returns and line feeds at both ends of a piece go before its escapes are taken out. Empty pieces are kept.
void SplitList(TextArgument text, TextArgument separator, std::vector<String>& list, bool trim);

// The same into a sorted set: of pieces that are equal (blind to letter case) the first stays.
void SplitList(TextArgument text, TextArgument separator, std::set<String>& list, bool trim);

// `a`, `separator` and `b` in a row; `a` through EscapeText for the separator with `escapeA`, `b` with `escapeB`.
String JoinList(TextArgument a, TextArgument b, TextArgument separator, bool escapeA, bool escapeB);

// The pieces of `list`, each through EscapeText with `escape`, with `separator` between them. With `escape`, SplitList
// without trimming gives the pieces back, unless there is but one and it is empty.
String JoinAll(const std::vector<String>& list, TextArgument separator, bool escape);

// `text` with a backslash before every backslash and every occurrence of `delimiter`. An empty one never occurs.
String EscapeText(TextArgument text, TextArgument delimiter);

// The same for several delimiters; where two of them begin, the first of `delimiters` counts.
String EscapeText(TextArgument text, std::initializer_list<std::u16string_view> delimiters);

// Single units, each a delimiter of its own.
struct CharacterSet {
    std::u16string_view units;
};

// The same for each unit of a set.
String EscapeText(TextArgument text, CharacterSet delimiters);

// `text` with one backslash for each two, and `delimiter` for each one behind a backslash. A backslash before anything
// else, and one at the very end, stays.
String UnescapeText(TextArgument text, TextArgument delimiter);

// Whether the last units of `text`, as many as `literal` has, are equal to it, blind to letter case.
bool EndsWith(TextArgument text, TextArgument literal);

// `text` without blanks, tabs, returns and line feeds at both ends.
String TrimWhitespace(TextArgument text);

// The same as a part of `text`.
template <typename Unit>
std::basic_string_view<Unit> TrimmedPartOf(std::basic_string_view<Unit> text) {
    const auto isBlank = [](Unit unit) { return unit == ' ' || unit == '\t' || unit == '\r' || unit == '\n'; };
    while (!text.empty() && isBlank(text.front())) {
        text.remove_prefix(1);
    }
    while (!text.empty() && isBlank(text.back())) {
        text.remove_suffix(1);
    }
    return text;
}
inline std::u16string_view TrimmedPart(std::u16string_view text) {
    return TrimmedPartOf(text);
}
inline std::string_view TrimmedPart(std::string_view text) {
    return TrimmedPartOf(text);
}

// Whether `text` is "true", "yes", "1", "on" or "enable", blind to letter case.
bool ParseBool(TextArgument text);

}  // namespace zkhw
