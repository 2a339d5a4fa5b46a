// Representation, construction, assignment and growth of strings; StringBaseTextTest.cpp has the operations on the
// text.

#include "qn/dsc/StringBase.h"

#include <gtest/gtest.h>

#include <array>
#include <cstring>
#include <new>
#include <string>
#include <utility>

#include "qn/dsc/exception/Exception.h"
#include "support/AllocationFaultScope.h"

namespace qn::dsc {
namespace {

using namespace std::string_view_literals;

std::u16string Units(const String& text) {
    return std::u16string(text.View());
}

std::string Units(const NarrowString& text) {
    return std::string(text.View());
}

// A text of `length` units in a buffer of `capacity` units.
String TextInBuffer(uint32_t length, uint32_t capacity) {
    String text(length, u'x');
    text.Reserve(capacity);
    EXPECT_EQ(text.Capacity(), capacity);
    return text;
}

TEST(StringBase, IsThreePointersInOrder) {
    String text = TextInBuffer(3, 10);
    std::array<const char16_t*, 3> fields;
    static_assert(sizeof(fields) == sizeof(text));
    std::memcpy(&fields, static_cast<const void*>(&text), sizeof(fields));
    EXPECT_EQ(fields[0], text.CStr());
    EXPECT_EQ(fields[1], text.CStr() + 3);
    EXPECT_EQ(fields[2], text.CStr() + 10);
}

TEST(StringBase, EmptyHasABuffer) {
    const String text;
    ASSERT_NE(text.CStr(), nullptr);
    EXPECT_EQ(*text.CStr(), u'\0');
    EXPECT_EQ(text.Length(), 0U);
    EXPECT_TRUE(text.IsEmpty());
    EXPECT_EQ(text.End(), text.CStr());
}

TEST(StringBase, EmptyOnesShareNothing) {
    const String first;
    const String second;
    EXPECT_NE(first.CStr(), second.CStr());
}

TEST(StringBase, IsMadeFromATerminatedText) {
    const String text(u"Target");
    EXPECT_EQ(Units(text), u"Target");
    EXPECT_EQ(text.Length(), 6U);
    EXPECT_EQ(*text.End(), u'\0');
    EXPECT_FALSE(text.IsEmpty());
}

TEST(StringBase, NullIsTheEmptyText) {
    const char16_t* null = nullptr;
    EXPECT_EQ(Units(String(null)), u"");
    EXPECT_EQ(Units(String(nullptr)), u"");
    EXPECT_EQ(Units(String(null, 5U)), u"");
    EXPECT_NE(String(null).CStr(), nullptr);
}

TEST(StringBase, IsMadeFromACountedText) {
    EXPECT_EQ(Units(String(u"Target", 3)), u"Tar");
    EXPECT_EQ(Units(String(u"Target", 0)), u"");
}

TEST(StringBase, ACountedTextMayHoldNul) {
    const String text(u"a\0b", 3);
    EXPECT_EQ(text.Length(), 3U);
    EXPECT_EQ(Units(text), u"a\0b"sv);
    EXPECT_EQ(text.At(1), u'\0');
    EXPECT_EQ(text.At(2), u'b');
}

TEST(StringBase, IsMadeFromARange) {
    const char16_t* source = u"Target";
    EXPECT_EQ(Units(String(source + 1, source + 4)), u"arg");
    EXPECT_EQ(Units(String(source, source)), u"");
}

TEST(StringBase, IsMadeFromCopiesOfAUnit) {
    EXPECT_EQ(Units(String(4, u'-')), u"----");
    EXPECT_EQ(Units(String(0, u'-')), u"");
    EXPECT_EQ(Units(NarrowString(2, 'x')), "xx");
}

TEST(StringBase, IsMadeFromAView) {
    EXPECT_EQ(Units(String(u"with\0nul"sv)), u"with\0nul"sv);
    EXPECT_EQ(Units(String(std::u16string_view())), u"");
}

TEST(StringBase, HoldsHalvesOfPairsAsTheyAre) {
    const String text(u"\xDE00\xD83D");
    EXPECT_EQ(text.Length(), 2U);
    EXPECT_EQ(text.At(0), 0xDE00);
    EXPECT_EQ(text.At(1), 0xD83D);
}

TEST(StringBase, CopyIsDeep) {
    String original(u"a\0b", 3);
    const String copy(original);
    EXPECT_NE(copy.CStr(), original.CStr());
    original.Append(u"more");
    EXPECT_EQ(Units(copy), u"a\0b"sv);
}

TEST(StringBase, CopyHasTheExactSize) {
    EXPECT_EQ(String(TextInBuffer(3, 100)).Capacity(), 100U);  // moved
    const String original = TextInBuffer(3, 100);
    EXPECT_EQ(String(original).Capacity(), 3U);
}

TEST(StringBase, MoveTakesTheBuffer) {
    String original(u"moved");
    const char16_t* buffer = original.CStr();
    const String target(std::move(original));
    EXPECT_EQ(target.CStr(), buffer);
    EXPECT_EQ(Units(target), u"moved");
}

TEST(StringBase, MoveAllocatesNothing) {
    String original(u"moved");
    String target(u"old");
    const support::AllocationCounter counter;
    String first(std::move(original));
    target = std::move(first);
    EXPECT_EQ(counter.Count(), 0U);
    EXPECT_EQ(Units(target), u"moved");
}

TEST(StringBase, MoveAssignmentToItselfKeepsTheText) {
    String text(u"kept");
    String& same = text;
    text = std::move(same);
    EXPECT_EQ(Units(text), u"kept");
}

TEST(StringBase, AMovedFromStringMayBeAssigned) {
    String text(u"first");
    const String taken(std::move(text));
    text = u"second";
    EXPECT_EQ(Units(text), u"second");
    const String takenToo(std::move(text));
    text = taken;
    EXPECT_EQ(Units(text), u"first");
}

TEST(StringBase, AMovedFromStringGetsABufferForTheEmptyText) {
    String text(u"first");
    const String taken(std::move(text));
    text.Assign(nullptr, 0);  // NOLINT(bugprone-use-after-move): the state after a move is the point.
    ASSERT_NE(text.CStr(), nullptr);
    EXPECT_EQ(*text.CStr(), u'\0');
    EXPECT_EQ(text.Length(), 0U);
}

TEST(StringBase, AMovedFromStringMayBeSwapped) {
    String text(u"first");
    String taken(std::move(text));
    text.Swap(taken);  // NOLINT(bugprone-use-after-move): the state after a move is the point.
    EXPECT_EQ(Units(text), u"first");
}

TEST(StringBase, WithoutBufferIsFilledByAssignment) {
    const support::AllocationCounter counter;
    String text = String::WithoutBuffer();
    EXPECT_EQ(counter.Count(), 0U);
    text.Assign(u"text");
    EXPECT_EQ(counter.Count(), 1U);
    EXPECT_EQ(Units(text), u"text");
}

TEST(StringBase, SwapExchangesBuffers) {
    String first(u"one");
    String second(u"two");
    const char16_t* buffer = first.CStr();
    swap(first, second);
    EXPECT_EQ(Units(first), u"two");
    EXPECT_EQ(second.CStr(), buffer);
}

TEST(StringBase, IsMadeWithOneAllocation) {
    const support::AllocationCounter counter;
    const String fromText(u"some text", 9);
    EXPECT_EQ(counter.Count(), 1U);
    const String copy(fromText);
    EXPECT_EQ(counter.Count(), 2U);
    const String empty;
    EXPECT_EQ(counter.Count(), 3U);
    const String units(5, u'x');
    EXPECT_EQ(counter.Count(), 4U);
}

TEST(StringBase, WithoutMemoryIsABadAllocation) {
    const String original(u"original");
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(String(), std::bad_alloc);
    EXPECT_THROW(String(u"text"), std::bad_alloc);
    EXPECT_THROW(String(u"text", 2), std::bad_alloc);
    EXPECT_THROW(String(3, u'x'), std::bad_alloc);
    EXPECT_THROW(String{original}, std::bad_alloc);
    EXPECT_THROW(NarrowString("text"), std::bad_alloc);
}

TEST(StringBase, BadAllocationHasItsText) {
    const support::AllocationFaultScope fault(1, true);
    try {
        const String text(u"text");
        FAIL() << "nothing thrown";
    } catch (const std::bad_alloc& failure) {
        EXPECT_STREQ(failure.what(), "bad allocation");
    }
}

TEST(StringBase, RefusesAViewOfMoreThan32Bits) {
    // The length alone decides: no unit is read.
    volatile size_t length = size_t{1} << 32;
    const std::u16string_view tooLong(u"x", length);
    EXPECT_THROW(String{tooLong}, exception::OutOfRange);
    String text(u"kept");
    EXPECT_THROW(text.Assign(tooLong), exception::OutOfRange);
    EXPECT_THROW(text.Append(tooLong), exception::OutOfRange);
    EXPECT_THROW(String::Concat({tooLong, tooLong}), exception::OutOfRange);
    EXPECT_EQ(Units(text), u"kept");
}

// Conversion between the two instances.

TEST(StringBase, IsMadeFromNarrowText) {
    EXPECT_EQ(Units(String("plain")), u"plain");
    EXPECT_EQ(Units(String("\xE2\x82\xAC")), u"\u20AC");
    EXPECT_EQ(Units(String("\xF0\x9F\x98\x80")), u"\U0001F600");
    EXPECT_EQ(Units(String("")), u"");
    const char* null = nullptr;
    EXPECT_EQ(Units(String(null)), u"");
}

TEST(StringBase, IsMadeFromCountedNarrowText) {
    EXPECT_EQ(Units(String("plain", 3U)), u"pla");
    EXPECT_EQ(Units(String("plain", 0U)), u"");
}

TEST(StringBase, CountedNarrowTextEndsAtItsFirstNul) {
    EXPECT_EQ(Units(String("ab\0cd", 5U)), u"ab");
    EXPECT_EQ(Units(String("\0cd", 3U)), u"");
}

TEST(StringBase, NarrowIsMadeFromWideText) {
    EXPECT_EQ(Units(NarrowString(u"plain")), "plain");
    EXPECT_EQ(Units(NarrowString(u"\u20AC")), "\xE2\x82\xAC");
    EXPECT_EQ(Units(NarrowString(u"\U0001F600")), "\xF0\x9F\x98\x80");
    EXPECT_EQ(Units(NarrowString(u"")), "");
    const char16_t* null = nullptr;
    EXPECT_EQ(Units(NarrowString(null)), "");
}

TEST(StringBase, CountedWideTextEndsAtItsFirstNul) {
    EXPECT_EQ(Units(NarrowString(u"ab\0cd", 5U)), "ab");
    EXPECT_EQ(Units(NarrowString(u"abcd", 2U)), "ab");
}

TEST(StringBase, EachInstanceIsMadeFromTheOther) {
    EXPECT_EQ(Units(String(NarrowString("name"))), u"name");
    EXPECT_EQ(Units(NarrowString(String(u"name"))), "name");
    EXPECT_EQ(Units(NarrowString(String(u"ab\0cd", 5))), "ab");
}

// Assignment.

TEST(StringBaseAssign, OfLessThanHalfTheCapacityShrinksTheBuffer) {
    String text = TextInBuffer(70, 100);
    text.Assign(u"0123456789", 10);
    EXPECT_EQ(Units(text), u"0123456789");
    EXPECT_EQ(text.Capacity(), 10U);  // a buffer of 11 units
}

TEST(StringBaseAssign, OfHalfTheCapacityOrMoreKeepsTheBuffer) {
    for (const uint32_t length : {50U, 60U, 99U, 100U}) {
        String text = TextInBuffer(70, 100);
        const char16_t* buffer = text.CStr();
        text.Assign(String(length, u'y'));
        EXPECT_EQ(Units(text), std::u16string(length, u'y'));
        EXPECT_EQ(text.CStr(), buffer) << length;
        EXPECT_EQ(text.Capacity(), 100U) << length;
        EXPECT_EQ(*text.End(), u'\0');
    }
}

TEST(StringBaseAssign, OfOneUnitLessThanHalfShrinksTheBuffer) {
    String text = TextInBuffer(70, 100);
    text.Assign(String(49, u'y'));
    EXPECT_EQ(Units(text), std::u16string(49, u'y'));
    EXPECT_EQ(text.Capacity(), 49U);
}

TEST(StringBaseAssign, OfMoreThanTheCapacityTakesTheExactSize) {
    String text = TextInBuffer(70, 100);
    text.Assign(String(101, u'y'));
    EXPECT_EQ(Units(text), std::u16string(101, u'y'));
    EXPECT_EQ(text.Capacity(), 101U);
}

TEST(StringBaseAssign, OfTheEmptyTextShrinksTheBuffer) {
    String text = TextInBuffer(70, 100);
    text.Assign(u"");
    EXPECT_TRUE(text.IsEmpty());
    EXPECT_EQ(text.Capacity(), 0U);
    EXPECT_EQ(*text.CStr(), u'\0');
}

TEST(StringBaseAssign, NullIsTheEmptyText) {
    String text(u"text");
    text.Assign(nullptr, 3);
    EXPECT_EQ(Units(text), u"");
    text = u"again";
    text.Assign(static_cast<const char16_t*>(nullptr));
    EXPECT_EQ(Units(text), u"");
}

TEST(StringBaseAssign, OfTheOwnBeginChangesNothing) {
    String text(u"unchanged");
    const char16_t* buffer = text.CStr();
    text.Assign(text.CStr());
    EXPECT_EQ(Units(text), u"unchanged");
    text.Assign(text.CStr(), 2);
    EXPECT_EQ(Units(text), u"unchanged");
    String& same = text;
    text = same;
    EXPECT_EQ(Units(text), u"unchanged");
    EXPECT_EQ(text.CStr(), buffer);
}

TEST(StringBaseAssign, OfAnInnerPartWorksInTheSameBuffer) {
    String text(u"0123456789");
    text.Assign(text.CStr() + 2, 7);
    EXPECT_EQ(Units(text), u"2345678");
    EXPECT_EQ(text.Capacity(), 10U);
}

TEST(StringBaseAssign, OfAnInnerPartWorksInANewBuffer) {
    String text(u"0123456789");
    text.Assign(text.CStr() + 7, 2);
    EXPECT_EQ(Units(text), u"78");
    EXPECT_EQ(text.Capacity(), 2U);
}

TEST(StringBaseAssign, TakesNulUnits) {
    String text;
    text.Assign(u"a\0b", 3);
    EXPECT_EQ(Units(text), u"a\0b"sv);
    String other;
    other.Assign(text);
    EXPECT_EQ(Units(other), u"a\0b"sv);
    other = u"";
    other.Assign(u"c\0d"sv);
    EXPECT_EQ(Units(other), u"c\0d"sv);
}

TEST(StringBaseAssign, WithoutMemoryLeavesTheText) {
    String text(u"before");
    {
        const support::AllocationFaultScope fault(1, true);
        EXPECT_THROW(text.Assign(u"a text that is a good deal longer than before"), std::bad_alloc);
        EXPECT_THROW(text.Assign(u"x"), std::bad_alloc);
        EXPECT_THROW(text = String(), std::bad_alloc);
    }
    EXPECT_EQ(Units(text), u"before");
    EXPECT_EQ(text.Capacity(), 6U);
}

// Growth.

TEST(StringBaseAppend, AppendsEveryKindOfText) {
    String text(u"a");
    text.Append(u"bc");
    text.Append(String(u"d"));
    text.Append(3, u'-');
    text.Append(u"\0e"sv);
    EXPECT_EQ(Units(text), u"abcd---\0e"sv);
    EXPECT_EQ(*text.End(), u'\0');
}

TEST(StringBaseAppend, NothingChangesNothing) {
    String text(u"a");
    text.Append(u"");
    text.Append(static_cast<const char16_t*>(nullptr));
    text.Append(String());
    text.Append(0, u'x');
    text.Append(std::u16string_view());
    EXPECT_EQ(Units(text), u"a");
    EXPECT_EQ(text.Capacity(), 1U);
}

TEST(StringBaseAppend, GrowsToTwiceTheNewLength) {
    String text(u"abc");
    text.Append(u"defg");
    EXPECT_EQ(text.Capacity(), 14U);  // a buffer of 2 * 7 + 1 units
    text.Append(7, u'x');
    EXPECT_EQ(text.Length(), 14U);
    EXPECT_EQ(text.Capacity(), 14U);
    text.Append(1, u'y');
    EXPECT_EQ(text.Capacity(), 30U);
    EXPECT_EQ(Units(text), u"abcdefgxxxxxxxy");
}

TEST(StringBaseAppend, WhatFitsKeepsTheBuffer) {
    String text = TextInBuffer(3, 10);
    const char16_t* buffer = text.CStr();
    text.Append(u"1234567");
    EXPECT_EQ(text.CStr(), buffer);
    EXPECT_EQ(text.Capacity(), 10U);
    EXPECT_EQ(Units(text), u"xxx1234567");
}

TEST(StringBaseAppend, WithoutMemoryForTwiceTakesTheExactSize) {
    String text(u"abc");
    const std::u16string more(200, u'm');
    {
        const support::AllocationFaultScope fault(1);
        text.Append(more);
    }
    EXPECT_EQ(Units(text), u"abc" + more);
    EXPECT_EQ(text.Capacity(), 203U);
}

TEST(StringBaseAppend, WithoutMemoryForTheExactSizeLeavesTheText) {
    String text(u"abc");
    const char16_t* buffer = text.CStr();
    {
        const support::AllocationFaultScope fault(1, true);
        EXPECT_THROW(text.Append(std::u16string(200, u'm')), std::bad_alloc);
        EXPECT_THROW(text.Append(200, u'm'), std::bad_alloc);
        EXPECT_THROW(text.Append(String(text), 0, 200), std::bad_alloc);
    }
    EXPECT_EQ(Units(text), u"abc");
    EXPECT_EQ(text.CStr(), buffer);
    EXPECT_EQ(text.Capacity(), 3U);
}

TEST(StringBaseAppend, FailsOnlyAtTheExactSize) {
    String text(u"abc");
    {
        const support::AllocationFaultScope fault(1, true);
        EXPECT_THROW(text.Append(200, u'm'), std::bad_alloc);
        EXPECT_EQ(osdep::AllocationCount(), 2U);
    }
    EXPECT_EQ(Units(text), u"abc");
}

TEST(StringBaseAppend, RefusesToDoubleTheTopBit) {
    String text;
    const support::AllocationCounter counter;
    EXPECT_THROW(text.Append(0x80000000, u'x'), exception::OutOfRange);
    EXPECT_EQ(counter.Count(), 0U);
    EXPECT_TRUE(text.IsEmpty());
    EXPECT_EQ(text.Capacity(), 0U);
}

TEST(StringBaseAppend, DoublesWhatHasNoTopBit) {
    String text;
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(text.Append(0x7FFFFFFF, u'x'), std::bad_alloc);
    EXPECT_EQ(osdep::AllocationCount(), 2U);
}

TEST(StringBaseAppend, RefusesASumOfMoreThan32Bits) {
    String text(u"a");
    try {
        text.Append(0xFFFFFFFF, u'x');
        FAIL() << "nothing thrown";
    } catch (const exception::OutOfRange& failure) {
        EXPECT_STREQ(failure.what(), "Out of range");
        EXPECT_NE(failure.GetFile(), nullptr);
        EXPECT_GT(failure.GetLine(), 0);
    }
    EXPECT_EQ(Units(text), u"a");
}

TEST(StringBaseAppend, ItselfIsSafe) {
    String text(u"abc");
    text.Append(text);
    EXPECT_EQ(Units(text), u"abcabc");
    text.Append(text.CStr());
    EXPECT_EQ(Units(text), u"abcabcabcabc");
}

TEST(StringBaseAppend, AnInnerPartOfItselfIsSafe) {
    String growing(u"0123456789");
    growing.Append(growing.View().substr(3, 5));
    EXPECT_EQ(Units(growing), u"012345678934567");

    String fitting = TextInBuffer(0, 50);
    fitting.Append(u"0123456789");
    fitting.Append(fitting.CStr() + 6);
    EXPECT_EQ(Units(fitting), u"01234567896789");
}

TEST(StringBaseAppend, ItselfWithItsNulIsSafe) {
    String growing(u"ab");
    growing.Append(std::u16string_view(growing.CStr(), 3));
    EXPECT_EQ(Units(growing), u"abab\0"sv);

    String fitting = TextInBuffer(2, 20);
    fitting.Append(std::u16string_view(fitting.CStr() + 1, 2));
    EXPECT_EQ(Units(fitting), u"xxx\0"sv);
}

TEST(StringBaseAppend, ManyPartsOfItselfAcrossAllSizesAreSafe) {
    String text(u"ab");
    std::u16string expected(u"ab");
    for (int step = 0; step < 40; ++step) {
        const size_t offset = expected.size() / 3;
        const size_t count = expected.size() / 2;
        text.Append(text.View().substr(offset, count));
        expected += std::u16string(expected, offset, count);
    }
    EXPECT_EQ(text.View(), expected);
}

TEST(StringBaseAppend, APartOfAnotherString) {
    String text(u"a");
    text.Append(String(u"0123456789"), 2, 3);
    EXPECT_EQ(Units(text), u"a234");
    text.Append(String(u"xyz"), 0, String::npos);
    EXPECT_EQ(Units(text), u"a234xyz");
    text.Append(String(u"xyz"), 1, 0);
    EXPECT_EQ(Units(text), u"a234xyz");
}

TEST(StringBaseAppend, TheCountOfAPartIsLimitedToTheWholeSource) {
    String text(u"a");
    text.Append(String(u"xyz"), 1, 10);
    // Three units, as long as the source: what is behind its end is NUL.
    EXPECT_EQ(Units(text), u"ayz\0"sv);
    text.Append(String(u"xyz"), 3, 2);
    EXPECT_EQ(Units(text), u"ayz\0\0\0"sv);
    text.Append(String(u"xyz"), 100, 1);
    EXPECT_EQ(Units(text), u"ayz\0\0\0\0"sv);
}

TEST(StringBaseAppend, APartOfItselfByOffsetIsSafe) {
    String text(u"0123456789");
    text.Append(text, 4, 6);
    EXPECT_EQ(Units(text), u"0123456789456789");
    String whole(u"abc");
    whole.Append(whole, 1, String::npos);
    EXPECT_EQ(Units(whole), u"abcbc\0"sv);
}

TEST(StringBaseAppend, OneUnitAtATimeTakesFewAllocations) {
    String text;
    const support::AllocationCounter counter;
    for (int step = 0; step < 1000000; ++step) {
        text.Append(1, u'x');
    }
    EXPECT_EQ(text.Length(), 1000000U);
    // Each growth more than doubles: 20 from 1 to 2 to the 20th.
    EXPECT_LE(counter.Count(), 20U);
}

TEST(StringBaseReserve, MakesRoomAndKeepsTheText) {
    String text(u"abc");
    text.Reserve(1000);
    EXPECT_EQ(text.Capacity(), 1000U);
    EXPECT_EQ(Units(text), u"abc");
    const char16_t* buffer = text.CStr();
    text.Append(997, u'x');
    EXPECT_EQ(text.CStr(), buffer);
}

TEST(StringBaseReserve, NeverShrinks) {
    String text = TextInBuffer(3, 100);
    text.Reserve(50);
    EXPECT_EQ(text.Capacity(), 100U);
}

TEST(StringBaseReserve, WithoutMemoryLeavesTheText) {
    String text(u"abc");
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(text.Reserve(1000), std::bad_alloc);
    EXPECT_EQ(Units(text), u"abc");
    EXPECT_EQ(text.Capacity(), 3U);
}

TEST(NarrowString, GrowsAndShrinksByTheSameRules) {
    NarrowString text("abc");
    text.Append("defg");
    EXPECT_EQ(text.Capacity(), 14U);
    EXPECT_EQ(Units(text), "abcdefg");
    text.Assign("x");
    EXPECT_EQ(text.Capacity(), 1U);
    text.Append(text);
    EXPECT_EQ(Units(text), "xx");
}

}  // namespace
}  // namespace qn::dsc
