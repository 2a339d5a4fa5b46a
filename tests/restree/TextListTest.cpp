#include "restree/TextList.h"

#include <set>
#include <string>
#include <string_view>
#include <vector>

#include <gtest/gtest.h>

namespace {

using qn::dsc::String;
using namespace std::string_literals;
using namespace std::string_view_literals;
using zkhw::CharacterSet;
using zkhw::EndsWith;
using zkhw::EscapeText;
using zkhw::JoinAll;
using zkhw::JoinList;
using zkhw::ParseBool;
using zkhw::PieceReader;
using zkhw::SplitList;
using zkhw::TrimmedPart;
using zkhw::TrimWhitespace;
using zkhw::UnescapeText;

// The exact units, since Strings compare blind to letter case.
std::u16string Units(const String& text) {
    return std::u16string(text.View());
}

std::vector<std::u16string> Split(std::u16string_view text, std::u16string_view separator, bool trim) {
    std::vector<String> list;
    SplitList(text, separator, list, trim);
    std::vector<std::u16string> pieces;
    for (const String& piece : list) {
        pieces.push_back(Units(piece));
    }
    return pieces;
}

std::vector<std::u16string> RawPieces(std::u16string_view text, std::u16string_view separator, bool trim) {
    std::vector<std::u16string> pieces;
    PieceReader reader(text, separator, trim);
    while (reader.Next()) {
        pieces.emplace_back(reader.Raw());
    }
    return pieces;
}

using Pieces = std::vector<std::u16string>;

TEST(SplitList, EmptyTextAddsNothing) {
    EXPECT_EQ(Split(u"", u",", false), Pieces());
    EXPECT_EQ(Split(u"", u",", true), Pieces());
}

TEST(SplitList, TextWithoutASeparatorIsOnePiece) {
    EXPECT_EQ(Split(u"abc", u",", false), Pieces({u"abc"}));
}

TEST(SplitList, SplitsAtEachSeparator) {
    EXPECT_EQ(Split(u"a,b,c", u",", false), Pieces({u"a", u"b", u"c"}));
}

TEST(SplitList, EmptyPiecesAreKept) {
    EXPECT_EQ(Split(u",", u",", false), Pieces({u"", u""}));
    EXPECT_EQ(Split(u",a,,b", u",", false), Pieces({u"", u"a", u"", u"b"}));
}

TEST(SplitList, SeparatorAtTheEndGivesAnEmptyLastPiece) {
    EXPECT_EQ(Split(u"a,b,", u",", false), Pieces({u"a", u"b", u""}));
}

TEST(SplitList, EscapedSeparatorBelongsToThePiece) {
    EXPECT_EQ(Split(u"a\\,b,c", u",", false), Pieces({u"a,b", u"c"}));
}

TEST(SplitList, SeparatorBehindAPairOfBackslashesSplits) {
    EXPECT_EQ(Split(u"a\\\\,b", u",", false), Pieces({u"a\\", u"b"}));
}

TEST(SplitList, NumberOfBackslashesDecides) {
    EXPECT_EQ(Split(u"a\\\\\\,b", u",", false), Pieces({u"a\\,b"}));
    EXPECT_EQ(Split(u"a\\\\\\\\,b", u",", false), Pieces({u"a\\\\", u"b"}));
    EXPECT_EQ(Split(u"\\,", u",", false), Pieces({u","}));
    EXPECT_EQ(Split(u"\\,,\\,", u",", false), Pieces({u",", u","}));
}

TEST(SplitList, OtherBackslashesStay) {
    EXPECT_EQ(Split(u"a\\b,\\c\\", u",", false), Pieces({u"a\\b", u"\\c\\"}));
    EXPECT_EQ(Split(u"a\\/b,c", u",", false), Pieces({u"a\\/b", u"c"}));
}

TEST(SplitList, TrimStripsBothEndsOfEachPiece) {
    EXPECT_EQ(Split(u" a , b ", u",", true), Pieces({u"a", u"b"}));
    EXPECT_EQ(Split(u"\t\r\na b\n\r\t ,c", u",", true), Pieces({u"a b", u"c"}));
}

TEST(SplitList, WithoutTrimTheBlanksStay) {
    EXPECT_EQ(Split(u" a , b ", u",", false), Pieces({u" a ", u" b "}));
}

TEST(SplitList, TrimMakesBlankPiecesEmpty) {
    EXPECT_EQ(Split(u"  ", u",", true), Pieces({u""}));
    EXPECT_EQ(Split(u" , \t,a", u",", true), Pieces({u"", u"", u"a"}));
}

TEST(SplitList, TrimLeavesOtherSpaces) {
    EXPECT_EQ(Split(u"\v\fa\u00a0,\u3000", u",", true), Pieces({u"\v\fa\u00a0", u"\u3000"}));
}

TEST(SplitList, TrimComesBeforeTheEscapesAreTakenOut) {
    // With a blank for the separator, an escaped one at the end loses the blank and keeps the backslash.
    EXPECT_EQ(Split(u"a\\ ", u" ", true), Pieces({u"a\\"}));
}

TEST(SplitList, AppendsToTheList) {
    std::vector<String> list{String(u"x")};
    SplitList(u"a,b", u',', list, false);
    SplitList(String(u""), String(u","), list, false);
    ASSERT_EQ(list.size(), 3u);
    EXPECT_EQ(Units(list[0]), u"x");
    EXPECT_EQ(Units(list[2]), u"b");
}

TEST(SplitList, SeparatorIsMatchedByItsUnits) {
    EXPECT_EQ(Split(u"1x2X3", u"x", false), Pieces({u"1", u"2X3"}));
    EXPECT_EQ(Split(u"a\u00e9b\u00e9", u"\u00e9", false), Pieces({u"a", u"b", u""}));
}

TEST(SplitList, LongSeparatorsSplitToo) {
    EXPECT_EQ(Split(u"a::b:c::", u"::", false), Pieces({u"a", u"b:c", u""}));
    EXPECT_EQ(Split(u"a\\::b::c", u"::", false), Pieces({u"a::b", u"c"}));
    EXPECT_EQ(Split(u"a\\:::b", u"::", false), Pieces({u"a:::b"}));
    EXPECT_EQ(Split(u":::", u"::", false), Pieces({u"", u":"}));
    EXPECT_EQ(Split(u"::a", u"::", false), Pieces({u"", u"a"}));
}

TEST(SplitList, BackslashesAreCountedIntoASeparatorThatEndsInOne) {
    EXPECT_EQ(RawPieces(u"a|\\b", u"|\\", false), Pieces({u"a", u"b"}));
    // The separator's own backslash stands directly before the second one.
    EXPECT_EQ(RawPieces(u"a|\\|\\b", u"|\\", false), Pieces({u"a", u"|\\b"}));
    EXPECT_EQ(RawPieces(u"a\\b\\\\c", u"\\", false), Pieces({u"a", u"b", u"\\c"}));
}

TEST(SplitList, EmptySeparatorNeverSplits) {
    EXPECT_EQ(Split(u"a,b", u"", false), Pieces({u"a,b"}));
}

TEST(SplitList, NulUnitsAreOrdinary) {
    EXPECT_EQ(Split(u"a\0b,c"sv, u",", false), Pieces({u"a\0b"s, u"c"}));
}

TEST(SplitList, SetHoldsEachPieceOnceBlindToCase) {
    std::set<String> set;
    SplitList(u"b, A ,a,B,,c\\,d", u',', set, true);
    std::vector<std::u16string> pieces;
    for (const String& piece : set) {
        pieces.push_back(Units(piece));
    }
    EXPECT_EQ(pieces, Pieces({u"", u"A", u"b", u"c,d"}));
}

TEST(SplitList, SetGetsNothingFromAnEmptyText) {
    std::set<String> set;
    SplitList(u"", u',', set, true);
    EXPECT_TRUE(set.empty());
}

TEST(SplitList, MillionBackslashesTakeLinearTime) {
    const std::u16string even(1000000, u'\\');
    EXPECT_EQ(Split(even + u",b", u",", false), Pieces({std::u16string(500000, u'\\'), u"b"}));
    EXPECT_EQ(Split(even + u"\\,b", u",", false), Pieces({std::u16string(500000, u'\\') + u",b"}));
    EXPECT_EQ(RawPieces(even, u"\\", false).size(), 2u + 499999u);
}

TEST(SplitList, MillionPiecesTakeLinearTime) {
    EXPECT_EQ(Split(std::u16string(1000000, u','), u",", true).size(), 1000001u);
    std::u16string escaped;
    for (int i = 0; i < 500000; ++i) {
        escaped += u"\\,";
    }
    EXPECT_EQ(Split(escaped, u",", true), Pieces({std::u16string(500000, u',')}));
}

TEST(PieceReader, GivesPiecesAsTheyStand) {
    EXPECT_EQ(RawPieces(u" a\\,b , c", u",", false), Pieces({u" a\\,b ", u" c"}));
    EXPECT_EQ(RawPieces(u" a\\,b , c", u",", true), Pieces({u"a\\,b", u"c"}));
    EXPECT_EQ(RawPieces(u"", u",", true), Pieces());
}

TEST(PieceReader, TellsPiecesWithBackslashes) {
    PieceReader reader(u"a,b\\,c", u",", false);
    ASSERT_TRUE(reader.Next());
    EXPECT_FALSE(reader.MayHaveEscapes());
    ASSERT_TRUE(reader.Next());
    EXPECT_TRUE(reader.MayHaveEscapes());
    EXPECT_FALSE(reader.Next());
    EXPECT_FALSE(reader.Next());
}

TEST(PieceReader, GivesTheTextFromThePieceOn) {
    PieceReader reader(u"a/b\\/c//d", u"/", false);
    const Pieces expected{u"a/b\\/c//d", u"b\\/c//d", u"/d", u"d"};
    for (const std::u16string& rest : expected) {
        ASSERT_TRUE(reader.Next());
        EXPECT_EQ(reader.RawToTheEnd(), rest);
    }
    EXPECT_FALSE(reader.Next());
}

TEST(PieceReader, GivesAnEmptyLastPieceAsTheRest) {
    PieceReader reader(u"a/", u"/", false);
    ASSERT_TRUE(reader.Next());
    ASSERT_TRUE(reader.Next());
    EXPECT_EQ(reader.RawToTheEnd(), u"");
}

TEST(PieceReader, SplitsPiecesOfAnyLength) {
    for (size_t length = 0; length <= 40; ++length) {
        const std::u16string piece(length, u'a');
        EXPECT_EQ(RawPieces(piece + u"," + piece, u",", false), Pieces({piece, piece})) << length;
        EXPECT_EQ(RawPieces(piece + u"\\," + piece + u"," + piece, u",", false),
                  Pieces({piece + u"\\," + piece, piece}))
            << length;
        EXPECT_EQ(RawPieces(piece + u"\\\\," + piece, u",", false), Pieces({piece + u"\\\\", piece})) << length;
        EXPECT_EQ(RawPieces(u" " + piece + u" , " + piece + u"\n", u",", true), Pieces({piece, piece})) << length;
    }
}

TEST(PieceReader, TellsBackslashesForAnySeparator) {
    for (std::u16string_view separator : {u",", u"::", u"", u"|\\"}) {
        PieceReader plain(u"ab", separator, false);
        ASSERT_TRUE(plain.Next());
        EXPECT_FALSE(plain.MayHaveEscapes());
        PieceReader escaped(u"a\\b", separator, false);
        ASSERT_TRUE(escaped.Next());
        EXPECT_TRUE(escaped.MayHaveEscapes());
    }
    // Not in the piece, but the separator itself.
    PieceReader split(u"a\\b", u"\\", false);
    ASSERT_TRUE(split.Next());
    EXPECT_FALSE(split.MayHaveEscapes());
}

TEST(PieceReader, BackslashOfOnePieceIsNoneOfTheNext) {
    PieceReader reader(u"a\\,b,c", u",", false);
    ASSERT_TRUE(reader.Next());
    EXPECT_TRUE(reader.MayHaveEscapes());
    ASSERT_TRUE(reader.Next());
    EXPECT_FALSE(reader.MayHaveEscapes());
}

TEST(EscapeText, PutsABackslashBeforeDelimitersAndBackslashes) {
    EXPECT_EQ(Units(EscapeText(u"a/b\\c", u'/')), u"a\\/b\\\\c");
    EXPECT_EQ(Units(EscapeText(u"/", u"/")), u"\\/");
    EXPECT_EQ(Units(EscapeText(u"\\/", u"/")), u"\\\\\\/");
}

TEST(EscapeText, TextWithoutEitherStays) {
    EXPECT_EQ(Units(EscapeText(u"a,b c", u'/')), u"a,b c");
    EXPECT_EQ(Units(EscapeText(u"", u'/')), u"");
}

TEST(EscapeText, LongDelimiterGetsOneBackslash) {
    EXPECT_EQ(Units(EscapeText(u"a::b:c", u"::")), u"a\\::b:c");
    EXPECT_EQ(Units(EscapeText(u":::", u"::")), u"\\:::");
}

TEST(EscapeText, EmptyDelimiterEscapesBackslashesOnly) {
    EXPECT_EQ(Units(EscapeText(u"a\\b", u"")), u"a\\\\b");
}

TEST(EscapeText, BackslashAsDelimiterIsEscapedOnce) {
    EXPECT_EQ(Units(EscapeText(u"a\\b", u'\\')), u"a\\\\b");
}

TEST(EscapeText, DelimiterIsMatchedByItsUnits) {
    EXPECT_EQ(Units(EscapeText(u"xX", u'x')), u"\\xX");
}

TEST(EscapeText, TakesSeveralDelimiters) {
    EXPECT_EQ(Units(EscapeText(u"a,b::c\\:", {u",", u"::"})), u"a\\,b\\::c\\\\:");
}

TEST(EscapeText, TakesASetOfCharacters) {
    EXPECT_EQ(Units(EscapeText(u"a/b,c\\d;e", CharacterSet{u"/,"})), u"a\\/b\\,c\\\\d;e");
    EXPECT_EQ(Units(EscapeText(u"a/b\\", CharacterSet{u""})), u"a/b\\\\");
}

TEST(EscapeText, MillionBackslashesTakeLinearTime) {
    const std::u16string text(1000000, u'\\');
    EXPECT_TRUE(EscapeText(text.c_str(), u',').View() == std::u16string(2000000, u'\\'));
}

TEST(EscapeText, FindsADelimiterAtAnyPlace) {
    for (size_t length = 0; length <= 40; ++length) {
        const std::u16string part(length, u'a');
        EXPECT_EQ(Units(EscapeText(std::u16string_view(part + u"/" + part), u'/')), part + u"\\/" + part) << length;
        EXPECT_EQ(Units(EscapeText(std::u16string_view(part + u"\\"), u'/')), part + u"\\\\") << length;
    }
}

TEST(UnescapeText, TakesEscapesOut) {
    EXPECT_EQ(Units(UnescapeText(u"a\\/b\\\\c", u'/')), u"a/b\\c");
    EXPECT_EQ(Units(UnescapeText(u"\\\\\\\\", u'/')), u"\\\\");
    EXPECT_EQ(Units(UnescapeText(u"\\\\/", u'/')), u"\\/");
}

TEST(UnescapeText, FindsAnEscapeAtAnyPlace) {
    for (size_t length = 0; length <= 40; ++length) {
        const std::u16string part(length, u'a');
        EXPECT_EQ(Units(UnescapeText(std::u16string_view(part + u"\\/" + part), u'/')), part + u"/" + part) << length;
        EXPECT_EQ(Units(UnescapeText(std::u16string_view(part + u"\\"), u'/')), part + u"\\") << length;
    }
}

TEST(UnescapeText, OtherBackslashesStay) {
    EXPECT_EQ(Units(UnescapeText(u"a\\b\\,", u'/')), u"a\\b\\,");
    EXPECT_EQ(Units(UnescapeText(u"C:\\dir", u',')), u"C:\\dir");
}

TEST(UnescapeText, BackslashAtTheEndStays) {
    EXPECT_EQ(Units(UnescapeText(u"a\\", u'/')), u"a\\");
    EXPECT_EQ(Units(UnescapeText(u"\\\\\\", u'/')), u"\\\\");
}

TEST(UnescapeText, KnowsLongDelimiters) {
    EXPECT_EQ(Units(UnescapeText(u"a\\::b\\:c", u"::")), u"a::b\\:c");
    EXPECT_EQ(Units(UnescapeText(u"a\\:", u"::")), u"a\\:");
}

TEST(UnescapeText, EmptyDelimiterHasNoEscape) {
    EXPECT_EQ(Units(UnescapeText(u"a\\b\\\\", u"")), u"a\\b\\");
}

TEST(UnescapeText, BringsEveryEscapedTextBack) {
    const std::u16string units = u"a\\/";
    for (char16_t first : units) {
        for (char16_t second : units) {
            for (char16_t third : units) {
                const std::u16string text{first, second, third};
                EXPECT_EQ(Units(UnescapeText(EscapeText(text.c_str(), u'/'), u'/')), text);
            }
        }
    }
}

TEST(UnescapeText, MillionBackslashesTakeLinearTime) {
    const std::u16string text(1000001, u'\\');
    EXPECT_TRUE(UnescapeText(text.c_str(), u',').View() == std::u16string(500001, u'\\'));
}

TEST(JoinList, PutsTheSeparatorBetween) {
    EXPECT_EQ(Units(JoinList(u"a", u"b", u"/", false, false)), u"a/b");
    EXPECT_EQ(Units(JoinList(u"", u"", u"::", false, false)), u"::");
}

TEST(JoinList, EscapesTheSidesThatAreAskedFor) {
    EXPECT_EQ(Units(JoinList(u"a/\\", u"b/\\", u'/', false, false)), u"a/\\/b/\\");
    EXPECT_EQ(Units(JoinList(u"a/\\", u"b/\\", u'/', true, false)), u"a\\/\\\\/b/\\");
    EXPECT_EQ(Units(JoinList(u"a/\\", u"b/\\", u'/', false, true)), u"a/\\/b\\/\\\\");
    EXPECT_EQ(Units(JoinList(u"a/", u"b/", u'/', true, true)), u"a\\//b\\/");
}

TEST(JoinAll, PutsTheSeparatorBetweenAndNotBehind) {
    EXPECT_EQ(Units(JoinAll({}, u',', true)), u"");
    EXPECT_EQ(Units(JoinAll({String(u"a")}, u',', true)), u"a");
    EXPECT_EQ(Units(JoinAll({String(u"a"), String(u""), String(u"b")}, u", ", false)), u"a, , b");
}

TEST(JoinAll, EscapesIfAsked) {
    const std::vector<String> list{String(u"a,b"), String(u"c\\")};
    EXPECT_EQ(Units(JoinAll(list, u',', true)), u"a\\,b,c\\\\");
    EXPECT_EQ(Units(JoinAll(list, u',', false)), u"a,b,c\\");
}

TEST(JoinAll, SplitListBringsThePiecesBack) {
    const std::vector<String> list{String(u"a,b"), String(u""), String(u"\\"), String(u"\\,\\"), String(u" c ")};
    std::vector<String> back;
    SplitList(JoinAll(list, u',', true), u',', back, false);
    ASSERT_EQ(back.size(), list.size());
    for (size_t i = 0; i < list.size(); ++i) {
        EXPECT_EQ(Units(back[i]), Units(list[i])) << i;
    }
}

TEST(EndsWith, IsBlindToLetterCase) {
    EXPECT_TRUE(EndsWith(u"ResourceLIST", u"List"));
    EXPECT_TRUE(EndsWith(String(u"FooList"), u"List"));
    EXPECT_TRUE(EndsWith(u"LIST", u"List"));
}

TEST(EndsWith, ShorterTextDoesNot) {
    EXPECT_FALSE(EndsWith(u"ist", u"List"));
    EXPECT_FALSE(EndsWith(u"", u"List"));
}

TEST(EndsWith, OtherEndDoesNot) {
    EXPECT_FALSE(EndsWith(u"ListX", u"List"));
    EXPECT_FALSE(EndsWith(u"Lust", u"List"));
}

TEST(EndsWith, EmptyLiteralAlwaysDoes) {
    EXPECT_TRUE(EndsWith(u"", u""));
    EXPECT_TRUE(EndsWith(u"a", u""));
}

TEST(EndsWith, ComparesAsManyUnitsAsTheLiteralHas) {
    EXPECT_TRUE(EndsWith(u"x\u00c9", u"\u00e9"));
    // The last unit alone is the accent.
    EXPECT_FALSE(EndsWith(u"xe\u0301", u"\u00e9"));
    EXPECT_FALSE(EndsWith(u"Li-st", u"List"));
}

TEST(TrimWhitespace, StripsBothEnds) {
    EXPECT_EQ(Units(TrimWhitespace(u" \t\r\na b\n\r\t ")), u"a b");
    EXPECT_EQ(Units(TrimWhitespace(u"a")), u"a");
}

TEST(TrimWhitespace, TextOfNothingElseGivesTheEmptyText) {
    EXPECT_EQ(Units(TrimWhitespace(u" \t\r\n")), u"");
    EXPECT_EQ(Units(TrimWhitespace(u"")), u"");
}

TEST(TrimWhitespace, OtherSpacesStay) {
    EXPECT_EQ(Units(TrimWhitespace(u"\v a \f")), u"\v a \f");
    EXPECT_EQ(Units(TrimWhitespace(u"\u00a0")), u"\u00a0");
    EXPECT_EQ(Units(TrimWhitespace(u" \0 "sv)), u"\0"s);
}

TEST(TrimmedPart, IsAPartOfTheText) {
    const std::u16string_view text = u"  ab ";
    EXPECT_EQ(TrimmedPart(text).data(), text.data() + 2);
    EXPECT_EQ(TrimmedPart(text).size(), 2u);
}

TEST(TrimmedPart, TakesBytesToo) {
    EXPECT_EQ(TrimmedPart(" \t\r\na \xC2\xA0\n"sv), "a \xC2\xA0"sv);
    EXPECT_EQ(TrimmedPart(" \t\r\n"sv), ""sv);
    EXPECT_EQ(TrimmedPart(""sv), ""sv);
    EXPECT_EQ(TrimmedPart("\v\f\0"sv), "\v\f\0"sv);
}

TEST(ParseBool, FiveWordsAreTrue) {
    for (const char16_t* word : {u"true", u"yes", u"1", u"on", u"enable", u"TRUE", u"Yes", u"oN", u"Enable"}) {
        EXPECT_TRUE(ParseBool(word));
    }
}

TEST(ParseBool, AnythingElseIsFalse) {
    for (const char16_t* word : {u"", u"false", u"no", u"0", u"off", u"disable", u" true", u"true ", u"yes.", u"11",
                                 u"tru", u"enabled", u"t"}) {
        EXPECT_FALSE(ParseBool(word));
    }
}

}  // namespace
