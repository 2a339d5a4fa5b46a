// Parts, search and comparison of strings.

#include <gtest/gtest.h>

#include <map>
#include <new>
#include <string>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/exception/Exception.h"
#include "support/AllocationFaultScope.h"

namespace qn::dsc {
namespace {

using namespace std::string_view_literals;

constexpr uint32_t none = 0xFFFFFFFF;

std::u16string Units(const String& text) {
    return std::u16string(text.View());
}

template <class Operation>
void ExpectOffsetOutOfRange(Operation operation) {
    try {
        operation();
        FAIL() << "nothing thrown";
    } catch (const exception::OutOfRange2& failure) {
        EXPECT_STREQ(failure.what(), "Out of range: String offset out of range");
        EXPECT_EQ(static_cast<uint32_t>(failure.GetErrorCode()), 0x8ABC7007U);
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/StringBase");
        EXPECT_GT(failure.GetLine(), 0);
    }
}

// Concatenation.

TEST(StringBaseConcat, JoinsBothInTheExactSize) {
    const String left(u"one\0", 4);
    const String joined = String::Concat(left, String(u"two"));
    EXPECT_EQ(Units(joined), u"one\0two"sv);
    EXPECT_EQ(joined.Capacity(), 7U);
    EXPECT_EQ(Units(left), u"one\0"sv);
}

TEST(StringBaseConcat, JoinsEmptyTexts) {
    EXPECT_EQ(Units(String::Concat(String(), String())), u"");
    EXPECT_EQ(Units(String::Concat(String(u"a"), String())), u"a");
    EXPECT_EQ(Units(String::Concat(String(), String(u"a"))), u"a");
}

TEST(StringBaseConcat, JoinsManyPartsWithOneAllocation) {
    const support::AllocationCounter counter;
    const String joined = String::Concat({u"a"sv, u""sv, u"bc"sv, std::u16string_view(), u"d"sv});
    EXPECT_EQ(counter.Count(), 1U);
    EXPECT_EQ(Units(joined), u"abcd");
}

TEST(StringBaseConcat, PlusJoinsTextsAndUnits) {
    const String text(u"text");
    EXPECT_EQ(Units(text + String(u"more")), u"textmore");
    EXPECT_EQ(Units(text + u"literal"), u"textliteral");
    EXPECT_EQ(Units(u"literal" + text), u"literaltext");
    EXPECT_EQ(Units(text + u'x'), u"textx");
    EXPECT_EQ(Units(text + u'\0'), u"text\0"sv);
    EXPECT_EQ(Units(text + static_cast<const char16_t*>(nullptr)), u"text");
    EXPECT_EQ(Units(text), u"text");
}

TEST(StringBaseConcat, WithoutMemoryIsABadAllocation) {
    const String text(u"text");
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(text + u"more", std::bad_alloc);
}

// Parts.

TEST(StringBaseSubstring, TakesCountUnits) {
    const String text(u"0123456789");
    EXPECT_EQ(Units(text.Substring(2, 3)), u"234");
    EXPECT_EQ(Units(text.Substring(0, 10)), u"0123456789");
    EXPECT_EQ(Units(text.Substring(4, 0)), u"");
    EXPECT_EQ(Units(text.Substring(10, 0)), u"");
}

TEST(StringBaseSubstring, OfMinusOneUnitsGoesToTheEnd) {
    const String text(u"0123456789");
    EXPECT_EQ(Units(text.Substring(7, 0xFFFFFFFF)), u"789");
    EXPECT_EQ(Units(text.Substring(7)), u"789");
    EXPECT_EQ(Units(text.Substring(10)), u"");
}

TEST(StringBaseSubstring, PastTheEndTakesTheRest) {
    const String text(u"0123456789");
    EXPECT_EQ(Units(text.Substring(7, 3)), u"789");
    EXPECT_EQ(Units(text.Substring(7, 4)), u"789");
    EXPECT_EQ(Units(text.Substring(7, 0xFFFFFFFF - 7)), u"789");
}

TEST(StringBaseSubstring, RefusesASumOfMoreThan32Bits) {
    const String text(u"0123456789");
    EXPECT_THROW(text.Substring(2, 0xFFFFFFFE), exception::OutOfRange);
    EXPECT_THROW(text.CheckedSubstring(7, 0xFFFFFFFE), exception::OutOfRange);
    EXPECT_EQ(Units(text.Substring(1, 0xFFFFFFFE)), u"123456789");
}

TEST(StringBaseSubstring, KeepsNulUnits) {
    EXPECT_EQ(Units(String(u"a\0b\0c", 5).Substring(1, 3)), u"\0b\0"sv);
}

TEST(StringBaseSubstring, HasTheExactSize) {
    EXPECT_EQ(String(u"0123456789").Substring(2, 3).Capacity(), 3U);
}

TEST(StringBaseCheckedSubstring, IsTheSameWithinTheText) {
    const String text(u"0123456789");
    EXPECT_EQ(Units(text.CheckedSubstring(2, 3)), u"234");
    EXPECT_EQ(Units(text.CheckedSubstring(7, 100)), u"789");
    EXPECT_EQ(Units(text.CheckedSubstring(7, 0xFFFFFFFF)), u"789");
    EXPECT_EQ(Units(text.CheckedSubstring(7)), u"789");
}

TEST(StringBaseCheckedSubstring, AtTheLengthIsEmpty) {
    const String text(u"0123456789");
    EXPECT_EQ(Units(text.CheckedSubstring(10, 5)), u"");
    EXPECT_EQ(Units(String().CheckedSubstring(0, 5)), u"");
}

TEST(StringBaseCheckedSubstring, BehindTheLengthIsRefused) {
    const String text(u"0123456789");
    ExpectOffsetOutOfRange([&text] { text.CheckedSubstring(11, 0); });
    ExpectOffsetOutOfRange([&text] { text.CheckedSubstring(0xFFFFFFFF, 0xFFFFFFFF); });
    ExpectOffsetOutOfRange([] { String().CheckedSubstring(1, 0); });
}

TEST(StringBaseCheckedSubstring, WithoutMemoryForTheFailureIsABadAllocation) {
    const String text(u"0123456789");
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(text.CheckedSubstring(11, 0), std::bad_alloc);
}

TEST(StringBaseErase, RemovesUnits) {
    String text(u"0123456789");
    text.Erase(2, 3, false);
    EXPECT_EQ(Units(text), u"0156789");
    EXPECT_EQ(*text.End(), u'\0');
    text.Erase(0, 1, false);
    EXPECT_EQ(Units(text), u"156789");
    text.Erase(3, 0, false);
    EXPECT_EQ(Units(text), u"156789");
}

TEST(StringBaseErase, IsLimitedToTheRest) {
    String text(u"0123456789");
    text.Erase(6, 100, false);
    EXPECT_EQ(Units(text), u"012345");
    text.Erase(4, 0xFFFFFFFF, false);
    EXPECT_EQ(Units(text), u"0123");
    text.Erase(4, 1, false);
    EXPECT_EQ(Units(text), u"0123");
}

TEST(StringBaseErase, KeepsTheBufferWithoutShrink) {
    String text(u"0123456789");
    text.Erase(0, 10, false);
    EXPECT_TRUE(text.IsEmpty());
    EXPECT_EQ(text.Capacity(), 10U);
}

TEST(StringBaseErase, WithShrinkFollowsTheRuleOfAssignment) {
    String text(u"0123456789");
    text.Erase(3, 5, true);
    EXPECT_EQ(Units(text), u"01289");
    EXPECT_EQ(text.Capacity(), 10U);
    text.Erase(1, 1, true);
    EXPECT_EQ(Units(text), u"0289");
    EXPECT_EQ(text.Capacity(), 4U);
    text.Erase(0, 4, true);
    EXPECT_EQ(Units(text), u"");
    EXPECT_EQ(text.Capacity(), 0U);
}

TEST(StringBaseErase, BehindTheLengthIsRefused) {
    String text(u"0123456789");
    ExpectOffsetOutOfRange([&text] { text.Erase(11, 1, false); });
    ExpectOffsetOutOfRange([&text] { text.Erase(11, 0, true); });
    EXPECT_EQ(Units(text), u"0123456789");
}

TEST(StringBaseErase, WithoutMemoryToShrinkLeavesTheText) {
    String text(u"0123456789");
    {
        const support::AllocationFaultScope fault(1, true);
        EXPECT_THROW(text.Erase(2, 7, true), std::bad_alloc);
    }
    EXPECT_EQ(Units(text), u"0123456789");
    EXPECT_EQ(text.Capacity(), 10U);
}

// Search.

TEST(StringBaseFind, FindsTheFirstUnit) {
    const String text(u"abcabc");
    EXPECT_EQ(text.Find(u'b', 0), 1U);
    EXPECT_EQ(text.Find(u'b', 1), 1U);
    EXPECT_EQ(text.Find(u'b', 2), 4U);
    EXPECT_EQ(text.Find(u'b', 5), none);
    EXPECT_EQ(text.Find(u'x', 0), none);
}

TEST(StringBaseFind, FindsNulUnits) {
    EXPECT_EQ(String(u"a\0b", 3).Find(u'\0', 0), 1U);
    EXPECT_EQ(String(u"ab").Find(u'\0', 0), none);
}

TEST(StringBaseFind, FindsTheFirstText) {
    const String text(u"abcabcd");
    EXPECT_EQ(text.Find(String(u"bc"), 0), 1U);
    EXPECT_EQ(text.Find(u"bc", 2), 4U);
    EXPECT_EQ(text.Find(u"bcd"sv), 4U);
    EXPECT_EQ(text.Find(u"abcabcd", 0), 0U);
    EXPECT_EQ(text.Find(u"abcabcde", 0), none);
    EXPECT_EQ(text.Find(u"cd", 6), none);
}

TEST(StringBaseFind, BeginsAtTheFrontUnlessTold) {
    const String text(u"abab");
    EXPECT_EQ(text.Find(u"ab"), 0U);
    EXPECT_EQ(text.Find(u"ab"sv), 0U);
    EXPECT_EQ(text.Find(String(u"ab")), 0U);
    EXPECT_EQ(text.Find(u'a'), 0U);
}

TEST(StringBaseFind, DoesNotFoldCase) {
    EXPECT_EQ(String(u"abc").Find(u"B", 0), none);
    EXPECT_EQ(String(u"abc").Find(u'B', 0), none);
    EXPECT_EQ(String(u"abc").FindLast(u'B', none), none);
    EXPECT_EQ(String(u"abc").FindLast(u"B", none), none);
}

TEST(StringBaseFind, FromTheEndOnFindsNothing) {
    const String text(u"abc");
    EXPECT_EQ(text.Find(u'c', 3), none);
    EXPECT_EQ(text.Find(u'c', none), none);
    EXPECT_EQ(text.Find(u"c", 3), none);
    EXPECT_EQ(text.Find(u"", 3), none);
    EXPECT_EQ(text.Find(u"", none), none);
    EXPECT_EQ(String().Find(u"", 0), none);
    EXPECT_EQ(String().Find(u'a', 0), none);
}

TEST(StringBaseFind, FindsTheEmptyTextWhereItBegins) {
    EXPECT_EQ(String(u"abc").Find(u"", 0), 0U);
    EXPECT_EQ(String(u"abc").Find(String(), 2), 2U);
}

TEST(StringBaseFindLast, FindsTheLastUnit) {
    const String text(u"abcabc");
    EXPECT_EQ(text.FindLast(u'b', 5), 4U);
    EXPECT_EQ(text.FindLast(u'b', 4), 4U);
    EXPECT_EQ(text.FindLast(u'b', 3), 1U);
    EXPECT_EQ(text.FindLast(u'b', 0), none);
    EXPECT_EQ(text.FindLast(u'x', 5), none);
}

TEST(StringBaseFindLast, FromBehindTheLastOffsetMeansThatOne) {
    const String text(u"abcabc");
    EXPECT_EQ(text.FindLast(u'c', 6), 5U);
    EXPECT_EQ(text.FindLast(u'c', 1000), 5U);
    EXPECT_EQ(text.FindLast(u'c', none), 5U);
    EXPECT_EQ(text.FindLast(u'c'), 5U);
    EXPECT_EQ(text.FindLast(u"abc", none), 3U);
    EXPECT_EQ(text.FindLast(u"abc"), 3U);
}

TEST(StringBaseFindLast, FindsTheLastText) {
    const String text(u"abcabc");
    EXPECT_EQ(text.FindLast(String(u"abc"), 3), 3U);
    EXPECT_EQ(text.FindLast(u"abc"sv, 2), 0U);
    EXPECT_EQ(text.FindLast(u"bc", 0), none);
    EXPECT_EQ(text.FindLast(u"abcabcabc", none), none);
}

TEST(StringBaseFindLast, InTheEmptyTextFindsNothing) {
    EXPECT_EQ(String().FindLast(u'a', none), none);
    EXPECT_EQ(String().FindLast(u"a", 0), none);
}

TEST(StringBaseFindFirstOf, FindsAUnitOfTheSet) {
    const String text(u"path/to\\file");
    EXPECT_EQ(text.FindFirstOf(String(u"\\/"), 0), 4U);
    EXPECT_EQ(text.FindFirstOf(u"\\/", 5), 7U);
    EXPECT_EQ(text.FindFirstOf(u"\\/"sv, 8), none);
    EXPECT_EQ(text.FindFirstOf(u"XYZ", 0), none);
}

TEST(StringBaseFindFirstOf, StartsAtTheFrontUnlessToldOtherwise) {
    const String text(u"/a/");
    EXPECT_EQ(text.FindFirstOf(String(u"\\/")), 0U);
    EXPECT_EQ(text.FindFirstOf(u"\\/"), 0U);
    EXPECT_EQ(text.FindFirstOf(u"\\/"sv), 0U);
    EXPECT_EQ(text.FindFirstNotOf(String(u"a")), 0U);
    EXPECT_EQ(text.FindFirstNotOf(u"a"), 0U);
    EXPECT_EQ(text.FindFirstNotOf(u"a"sv), 0U);
}

TEST(StringBaseFindFirstOf, FindsNothingInTheEmptySetOrBehindTheEnd) {
    EXPECT_EQ(String(u"abc").FindFirstOf(String(), 0), none);
    EXPECT_EQ(String(u"abc").FindFirstOf(u"abc", 3), none);
    EXPECT_EQ(String(u"abc").FindFirstOf(u"abc", none), none);
    EXPECT_EQ(String().FindFirstOf(u"abc", 0), none);
}

TEST(StringBaseFindFirstNotOf, FindsAUnitOutsideTheSet) {
    const String text(u"  \t word ");
    EXPECT_EQ(text.FindFirstNotOf(String(u" \t"), 0), 4U);
    EXPECT_EQ(text.FindFirstNotOf(u" \t"sv, 5), 5U);
    EXPECT_EQ(text.FindFirstNotOf(u" \t", 8), none);
    EXPECT_EQ(String(u"aaa").FindFirstNotOf(u"a", 0), none);
}

TEST(StringBaseFindFirstNotOf, TheEmptySetStopsAtFrom) {
    const String text(u"abc");
    EXPECT_EQ(text.FindFirstNotOf(String(), 0), 0U);
    EXPECT_EQ(text.FindFirstNotOf(String(), 2), 2U);
    EXPECT_EQ(text.FindFirstNotOf(String(), 3), none);
    EXPECT_EQ(String().FindFirstNotOf(String(), 0), none);
}

TEST(StringBaseFindLastNotOf, FindsAUnitOutsideTheSet) {
    const String text(u" word \t ");
    EXPECT_EQ(text.FindLastNotOf(String(u" \t"), none), 4U);
    EXPECT_EQ(text.FindLastNotOf(u" \t"), 4U);
    EXPECT_EQ(text.FindLastNotOf(u" \t"sv, 3), 3U);
    EXPECT_EQ(text.FindLastNotOf(u" \t", 0), none);
    EXPECT_EQ(text.FindLastNotOf(u" \t", 1000), 4U);
}

TEST(StringBaseFindLastNotOf, TheEmptySetStopsAtFrom) {
    const String text(u"abc");
    EXPECT_EQ(text.FindLastNotOf(String(), 1), 1U);
    EXPECT_EQ(text.FindLastNotOf(String(), none), 2U);
    EXPECT_EQ(String().FindLastNotOf(String(), none), none);
}

TEST(StringBaseFind, WorksOnBytes) {
    const NarrowString text("a/b/c");
    EXPECT_EQ(text.Find('/', 0), 1U);
    EXPECT_EQ(text.FindLast('/'), 3U);
    EXPECT_EQ(text.Find("b/", 0), 2U);
    EXPECT_EQ(text.FindFirstOf("cb", 0), 2U);
    EXPECT_EQ(text.FindFirstNotOf("a/", 0), 2U);
    EXPECT_EQ(text.FindLastNotOf("c", none), 3U);
}

// Comparison.

TEST(StringBaseCompare, IsBlindToLetterCase) {
    const String text(u"abc");
    EXPECT_TRUE(text == String(u"ABC"));
    EXPECT_TRUE(text == u"ABC");
    EXPECT_TRUE(u"ABC" == text);
    EXPECT_TRUE(text == u"ABC"sv);
    EXPECT_FALSE(text != String(u"ABC"));
    EXPECT_FALSE(text != u"ABC");
    EXPECT_FALSE(text < String(u"ABC"));
    EXPECT_FALSE(String(u"ABC") < text);
    EXPECT_FALSE(text < u"ABC");
    EXPECT_FALSE(u"ABC" < text);
    EXPECT_EQ(Compare(text, String(u"ABC")), 0);
}

TEST(StringBaseCompare, GivesMinusOneZeroAndOne) {
    EXPECT_EQ(Compare(String(u"a"), String(u"B")), -1);
    EXPECT_EQ(Compare(String(u"a"), String(u"A")), 0);
    EXPECT_EQ(Compare(String(u"b"), String(u"A")), 1);
    EXPECT_EQ(Compare(String(u"a"), u"B"), -1);
    EXPECT_EQ(Compare(String(u"a"), u"A"), 0);
    EXPECT_EQ(Compare(String(u"b"), u"A"), 1);
}

TEST(StringBaseCompare, OrdersBothWays) {
    const String text(u"beta");
    EXPECT_TRUE(text < String(u"GAMMA"));
    EXPECT_FALSE(text < String(u"ALPHA"));
    EXPECT_TRUE(text < u"Gamma");
    EXPECT_FALSE(text < u"Alpha");
    EXPECT_TRUE(u"Alpha" < text);
    EXPECT_FALSE(u"Gamma" < text);
    EXPECT_TRUE(text != u"Gamma");
    EXPECT_TRUE(text != String(u"bet"));
}

TEST(StringBaseCompare, NullIsTheEmptyText) {
    const char16_t* null = nullptr;
    EXPECT_TRUE(String() == null);
    EXPECT_FALSE(String(u"a") == null);
    EXPECT_EQ(Compare(String(u"a"), null), 1);
}

TEST(StringBaseCompare, OneKeyInASortedMapWhateverItsCase) {
    std::map<String, int> entries;
    entries[u"Foo"] = 1;
    entries[u"foo"] = 2;
    entries[u"FOO"] = 3;
    EXPECT_EQ(entries.size(), 1U);
    EXPECT_EQ(entries.at(u"fOO"), 3);
    // The first spelling stays.
    EXPECT_EQ(Units(entries.begin()->first), u"Foo");
}

TEST(StringBaseCompareSub, ComparesAPart) {
    const String text(u"Target=Board");
    EXPECT_EQ(text.CompareSub(0, 6, u"TARGET", none), 0);
    EXPECT_EQ(text.CompareSub(7, none, u"board"), 0);
    EXPECT_EQ(text.CompareSub(7, 100, u"board", 5), 0);
    EXPECT_EQ(text.CompareSub(0, 6, u"Targets", 6), 0);
    EXPECT_EQ(text.CompareSub(0, 6, u"Targets", 7), -1);
    EXPECT_EQ(text.CompareSub(0, 7, u"Target", none), 1);
    EXPECT_EQ(text.CompareSub(12, 3, u"", none), 0);
    EXPECT_EQ(text.CompareSub(0, 0, nullptr, none), 0);
}

TEST(StringBaseCompareSub, BehindTheLengthIsRefused) {
    ExpectOffsetOutOfRange([] { String(u"abc").CompareSub(4, 0, u"", none); });
}

TEST(StringBaseCompareSub, RefusesASumOfMoreThan32Bits) {
    EXPECT_THROW(String(u"abc").CompareSub(2, 0xFFFFFFFE, u"", none), exception::OutOfRange);
}

}  // namespace
}  // namespace qn::dsc
