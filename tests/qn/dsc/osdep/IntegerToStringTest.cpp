#include "qn/dsc/osdep/IntegerToString.h"

#include <cstdint>

#include <gtest/gtest.h>

#include "qn/dsc/exception/Exception.h"

namespace {

using qn::dsc::exception::UnableToConvert;
using qn::dsc::osdep::DecimalText;
using qn::dsc::osdep::IntegerToString;

std::u16string Unsigned(uint32_t value, uint32_t radix) {
    return std::u16string(IntegerToString(value, radix).View());
}
std::u16string Signed(int32_t value, uint32_t radix) {
    return std::u16string(IntegerToString(value, radix).View());
}

TEST(IntegerToString, DigitsAboveNineAreCapitalLetters) {
    EXPECT_EQ(Unsigned(255, 16), u"FF");
    EXPECT_EQ(Unsigned(35, 36), u"Z");
    EXPECT_EQ(Unsigned(0xDEADBEEF, 16), u"DEADBEEF");
}

TEST(IntegerToString, ZeroIsOneDigit) {
    EXPECT_EQ(Unsigned(0, 2), u"0");
    EXPECT_EQ(Unsigned(0, 36), u"0");
    EXPECT_EQ(Signed(0, 10), u"0");
}

TEST(IntegerToString, GreatestValueInEveryKindOfRadix) {
    EXPECT_EQ(Unsigned(0xFFFFFFFF, 2), u"11111111111111111111111111111111");
    EXPECT_EQ(Unsigned(0xFFFFFFFF, 8), u"37777777777");
    EXPECT_EQ(Unsigned(0xFFFFFFFF, 10), u"4294967295");
    EXPECT_EQ(Unsigned(0xFFFFFFFF, 36), u"1Z141Z3");
}

TEST(IntegerToString, NegativeInRadixTenHasASign) {
    EXPECT_EQ(Signed(-1, 10), u"-1");
    EXPECT_EQ(Signed(-120, 10), u"-120");
    EXPECT_EQ(Signed(INT32_MIN, 10), u"-2147483648");
    EXPECT_EQ(Signed(INT32_MAX, 10), u"2147483647");
}

TEST(IntegerToString, NegativeInAnotherRadixIsItsPattern) {
    EXPECT_EQ(Signed(-1, 16), u"FFFFFFFF");
    EXPECT_EQ(Signed(INT32_MIN, 16), u"80000000");
    EXPECT_EQ(Signed(-1, 2), u"11111111111111111111111111111111");
}

TEST(IntegerToString, RadixOutOfRangeThrows) {
    for (uint32_t radix : {0u, 1u, 37u, 100u, 0xFFFFFFFFu}) {
        EXPECT_THROW(Unsigned(5, radix), UnableToConvert) << radix;
        EXPECT_THROW(Unsigned(0, radix), UnableToConvert) << radix;
        EXPECT_THROW(Signed(-5, radix), UnableToConvert) << radix;
    }
}

TEST(IntegerToString, ThrowSaysWhere) {
    try {
        IntegerToString(5u, 1);
        ADD_FAILURE();
    } catch (const UnableToConvert& failure) {
        EXPECT_STREQ(failure.what(), "Unable to convert.");
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/osdep/IntegerToString");
        EXPECT_GT(failure.GetLine(), 0);
    }
}

TEST(DecimalText, HasTheDigitsAndASign) {
    EXPECT_EQ(DecimalText(0).View(), u"0");
    EXPECT_EQ(DecimalText(7).View(), u"7");
    EXPECT_EQ(DecimalText(10).View(), u"10");
    EXPECT_EQ(DecimalText(-1).View(), u"-1");
    EXPECT_EQ(DecimalText(1234567890).View(), u"1234567890");
    EXPECT_EQ(DecimalText(INT32_MAX).View(), u"2147483647");
    EXPECT_EQ(DecimalText(INT32_MIN).View(), u"-2147483648");
}

}  // namespace
