// Strings of bytes have all operations of strings of units (StringBaseTest.cpp, StringBaseTextTest.cpp), and no byte
// means anything to them.

#include <gtest/gtest.h>

#include <string>
#include <string_view>
#include <utility>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/exception/Exception.h"

namespace qn::dsc {
namespace {

std::string Bytes(const NarrowString& text) {
    return std::string(text.View());
}

TEST(NarrowString, IsMadeFromACountedText) {
    EXPECT_EQ(Bytes(NarrowString("ab\0cd", 4)), std::string("ab\0c", 4));
    EXPECT_EQ(Bytes(NarrowString(static_cast<const char*>(nullptr), 5)), "");
}

TEST(NarrowString, NullIsTheEmptyText) {
    const NarrowString text(nullptr);
    EXPECT_TRUE(text.IsEmpty());
    EXPECT_STREQ(text.CStr(), "");
}

TEST(NarrowString, EndsWithANul) {
    const NarrowString text("ab");
    EXPECT_EQ(text.End(), text.CStr() + 2);
    EXPECT_EQ(text.At(1), 'b');
    EXPECT_EQ(text.At(2), '\0');
}

TEST(NarrowString, IsMadeFromARangeAndFromCopiesOfAByte) {
    const char bytes[] = "abcdef";
    EXPECT_EQ(Bytes(NarrowString(bytes + 1, bytes + 4)), "bcd");
    EXPECT_EQ(Bytes(NarrowString(3, '\xFF')), "\xFF\xFF\xFF");
}

TEST(NarrowString, CopyIsDeep) {
    const NarrowString original("abc");
    NarrowString copy(original);
    EXPECT_NE(copy.CStr(), original.CStr());
    copy.Append("d");
    EXPECT_EQ(Bytes(original), "abc");
    EXPECT_EQ(Bytes(copy), "abcd");
}

TEST(NarrowString, IsAssignedFromACopyATextAndAMovedString) {
    const NarrowString original("abc");
    NarrowString text;
    text = original;
    EXPECT_EQ(Bytes(text), "abc");
    text = "de";
    EXPECT_EQ(Bytes(text), "de");
    NarrowString source("fgh");
    const char* const buffer = source.CStr();
    text = std::move(source);
    EXPECT_EQ(text.CStr(), buffer);
    text.Assign(original);
    EXPECT_EQ(Bytes(text), "abc");
    text.Assign("xyz", 2);
    EXPECT_EQ(Bytes(text), "xy");
}

TEST(NarrowString, RefusesAViewOfMoreThan32Bits) {
    // The length alone decides: no byte is read.
    volatile size_t length = size_t{1} << 32;
    const std::string_view tooLong("x", length);
    EXPECT_THROW(NarrowString{tooLong}, exception::OutOfRange);
    NarrowString text("kept");
    EXPECT_THROW(text.Assign(tooLong), exception::OutOfRange);
    EXPECT_THROW(text.Append(tooLong), exception::OutOfRange);
    EXPECT_EQ(Bytes(text), "kept");
}

TEST(NarrowString, WithoutBufferIsFilledByAssignment) {
    NarrowString text = NarrowString::WithoutBuffer();
    text.Assign(NarrowString("ab"));
    EXPECT_EQ(Bytes(text), "ab");
}

TEST(NarrowString, SwapExchangesTheTexts) {
    NarrowString left("left");
    NarrowString right("r");
    swap(left, right);
    EXPECT_EQ(Bytes(left), "r");
    EXPECT_EQ(Bytes(right), "left");
}

TEST(NarrowString, AppendsAPartAndCopiesOfAByte) {
    NarrowString text("a");
    text.Append(NarrowString("0123"), 1, 2);
    text.Append(3, 'z');
    EXPECT_EQ(Bytes(text), "a12zzz");
    // The count is limited to the whole source: what is behind its end comes as NUL.
    text.Append(NarrowString("xy"), 1, 9);
    EXPECT_EQ(Bytes(text), std::string("a12zzzy\0", 8));
}

TEST(NarrowString, AppendingItselfIsSafe) {
    NarrowString text("abc");
    text.Append(text);
    EXPECT_EQ(Bytes(text), "abcabc");
}

TEST(NarrowString, ReserveMakesRoomAndKeepsTheText) {
    NarrowString text("abc");
    text.Reserve(100);
    EXPECT_EQ(text.Capacity(), 100U);
    EXPECT_EQ(Bytes(text), "abc");
}

TEST(NarrowString, PlusJoins) {
    const NarrowString left("ab");
    EXPECT_EQ(Bytes(NarrowString::Concat(left, NarrowString("cd"))), "abcd");
    EXPECT_EQ(Bytes(left + NarrowString("cd")), "abcd");
    EXPECT_EQ(Bytes(left + "e"), "abe");
    EXPECT_EQ(Bytes("e" + left), "eab");
    EXPECT_EQ(Bytes(left + '\0'), std::string("ab\0", 3));
}

TEST(NarrowString, PartsAreTaken) {
    const NarrowString text("0123456789");
    EXPECT_EQ(Bytes(text.Substring(2, 3)), "234");
    EXPECT_EQ(Bytes(text.Substring(7)), "789");
    EXPECT_EQ(Bytes(text.CheckedSubstring(8, 5)), "89");
    EXPECT_EQ(Bytes(text.CheckedSubstring(10, 5)), "");
    EXPECT_THROW(text.CheckedSubstring(11, 0), exception::OutOfRange2);
    EXPECT_THROW(text.Substring(2, 0xFFFFFFFE), exception::OutOfRange);
}

TEST(NarrowString, BytesAreErased) {
    NarrowString text("0123456789");
    text.Erase(2, 3, false);
    EXPECT_EQ(Bytes(text), "0156789");
    EXPECT_EQ(text.Capacity(), 10U);
    text.Erase(3, 100, true);
    EXPECT_EQ(Bytes(text), "015");
    EXPECT_EQ(text.Capacity(), 3U);
    EXPECT_THROW(text.Erase(4, 0, false), exception::OutOfRange2);
}

TEST(NarrowString, TextsOfEveryKindAreFound) {
    const NarrowString text("a/b/c/b/");
    EXPECT_EQ(text.Find("b/"), 2U);
    EXPECT_EQ(text.Find(NarrowString("b/"), 3), 6U);
    EXPECT_EQ(text.FindLast("b/"), 6U);
    EXPECT_EQ(text.FindLast(NarrowString("b/"), 5), 2U);
    EXPECT_EQ(text.FindFirstOf("cb"), 2U);
    EXPECT_EQ(text.FindFirstOf(NarrowString("cb"), 3), 4U);
    EXPECT_EQ(text.FindFirstNotOf("a/"), 2U);
    EXPECT_EQ(text.FindFirstNotOf(NarrowString("/b"), 1), 4U);
    EXPECT_EQ(text.FindLastNotOf("b/"), 4U);
    EXPECT_EQ(text.FindLastNotOf(NarrowString("b/"), 3), 0U);
}

}  // namespace
}  // namespace qn::dsc
