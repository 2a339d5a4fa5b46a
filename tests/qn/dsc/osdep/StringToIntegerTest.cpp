#include "qn/dsc/osdep/StringToInteger.h"

#include <cstdint>
#include <string>
#include <string_view>

#include <gtest/gtest.h>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/IntegerToString.h"

namespace {

using qn::dsc::String;
using qn::dsc::exception::UnableToConvert;
using qn::dsc::osdep::IntegerToString;
using qn::dsc::osdep::StringToInteger;
using namespace std::string_view_literals;

TEST(StringToInteger, ReadsDigitsOfTheRadix) {
    EXPECT_EQ(StringToInteger(u"12", 10), 12);
    EXPECT_EQ(StringToInteger(u"101", 2), 5);
    EXPECT_EQ(StringToInteger(u"777", 8), 511);
    EXPECT_EQ(StringToInteger(u"zZ", 36), 35 * 36 + 35);
    EXPECT_EQ(StringToInteger(u"ffFF", 16), 0xFFFF);
}

TEST(StringToInteger, EmptyTextIsZero) {
    EXPECT_EQ(StringToInteger(u"", 10), 0);
}

TEST(StringToInteger, BlankTextIsZero) {
    EXPECT_EQ(StringToInteger(u"   ", 10), 0);
    EXPECT_EQ(StringToInteger(u" \t\r\n", 10), 0);
}

TEST(StringToInteger, LeadingWhitespaceIsSkipped) {
    EXPECT_EQ(StringToInteger(u" \t\r\n7", 10), 7);
    EXPECT_EQ(StringToInteger(u"\v7", 10), 0);
    EXPECT_EQ(StringToInteger(u"\u00a0"
                              u"7",
                              10),
              0);
}

TEST(StringToInteger, TrailingTextIsIgnored) {
    EXPECT_EQ(StringToInteger(u"12abc", 10), 12);
    EXPECT_EQ(StringToInteger(u"12 3", 10), 12);
    EXPECT_EQ(StringToInteger(u"12\0003"sv, 10), 12);
    EXPECT_EQ(StringToInteger(u"1012", 2), 5);
}

TEST(StringToInteger, JunkIsZero) {
    EXPECT_EQ(StringToInteger(u"abc", 10), 0);
    EXPECT_EQ(StringToInteger(u"-", 10), 0);
    EXPECT_EQ(StringToInteger(u"- 5", 10), 0);
    EXPECT_EQ(StringToInteger(u"9", 8), 0);
}

TEST(StringToInteger, PunctuationNextToTheDigitsIsNoDigit) {
    // These stand between "9" and "A" in ASCII.
    EXPECT_EQ(StringToInteger(u":", 10), 0);
    EXPECT_EQ(StringToInteger(u"1@", 16), 1);
    EXPECT_EQ(StringToInteger(u"1[", 36), 1);
    EXPECT_EQ(StringToInteger(u"1`", 36), 1);
}

TEST(StringToInteger, OnlyDigitsAndLettersOfAsciiCount) {
    EXPECT_EQ(StringToInteger(u"\uff11", 10), 0);
    EXPECT_EQ(StringToInteger(u"1\u0661", 10), 1);
    EXPECT_EQ(StringToInteger(u"1\uff21", 16), 1);
}

TEST(StringToInteger, SignsStandInOneOrder) {
    EXPECT_EQ(StringToInteger(u"-5", 10), -5);
    EXPECT_EQ(StringToInteger(u"+5", 10), 5);
    EXPECT_EQ(StringToInteger(u"-+5", 10), -5);
    EXPECT_EQ(StringToInteger(u"+-5", 10), 0);
    EXPECT_EQ(StringToInteger(u"--5", 10), 0);
    EXPECT_EQ(StringToInteger(u"++5", 10), 0);
}

TEST(StringToInteger, MinusInAnotherRadixIsIgnored) {
    EXPECT_EQ(StringToInteger(u"-7", 16), 7);
    EXPECT_EQ(StringToInteger(u"-11", 2), 3);
}

TEST(StringToInteger, HexadecimalPrefixIsSkipped) {
    EXPECT_EQ(StringToInteger(u"  0x1F", 16), 31);
    EXPECT_EQ(StringToInteger(u"0X1f", 16), 31);
    EXPECT_EQ(StringToInteger(u"-0x10", 16), 16);
    EXPECT_EQ(StringToInteger(u"+0x10", 16), 16);
    EXPECT_EQ(StringToInteger(u"0x0x10", 16), 0);
}

TEST(StringToInteger, HexadecimalPrefixNeedsAUnitBehindIt) {
    EXPECT_EQ(StringToInteger(u"0x", 16), 0);
    EXPECT_EQ(StringToInteger(u"0xg", 16), 0);
}

TEST(StringToInteger, HexadecimalPrefixCountsInNoOtherRadix) {
    EXPECT_EQ(StringToInteger(u"0x1F", 10), 0);
    EXPECT_EQ(StringToInteger(u"0x1", 36), 33 * 36 + 1);
}

TEST(StringToInteger, MagnitudeComesWithItsSign) {
    bool negative = false;
    EXPECT_EQ(StringToInteger(u"-4294967295", 10, negative), 4294967295u);
    EXPECT_TRUE(negative);
    EXPECT_EQ(StringToInteger(u"4294967295", 10, negative), 4294967295u);
    EXPECT_FALSE(negative);
    EXPECT_EQ(StringToInteger(u"-7", 16, negative), 7u);
    EXPECT_TRUE(negative);
}

TEST(StringToInteger, EmptyAndBlankTextsAreNotNegative) {
    bool negative = true;
    EXPECT_EQ(StringToInteger(u"", 10, negative), 0u);
    EXPECT_FALSE(negative);
    negative = true;
    EXPECT_EQ(StringToInteger(u"  ", 10, negative), 0u);
    EXPECT_FALSE(negative);
}

TEST(StringToInteger, JunkBehindAMinusIsNegativeZero) {
    bool negative = false;
    EXPECT_EQ(StringToInteger(u"-x", 10, negative), 0u);
    EXPECT_TRUE(negative);
}

TEST(StringToInteger, SignedFormWrapsRound) {
    EXPECT_EQ(StringToInteger(u"2147483648", 10), INT32_MIN);
    EXPECT_EQ(StringToInteger(u"-2147483648", 10), INT32_MIN);
    EXPECT_EQ(StringToInteger(u"4294967295", 10), -1);
    EXPECT_EQ(StringToInteger(u"FFFFFFFF", 16), -1);
}

TEST(StringToInteger, OverflowOfTheLastSumWraps) {
    EXPECT_EQ(StringToInteger(u"4294967296", 10), 0);
}

TEST(StringToInteger, OverflowOfAProductThatShowsThrows) {
    EXPECT_THROW(StringToInteger(u"99999999999", 10), UnableToConvert);
}

TEST(StringToInteger, OverflowOfAProductThatDoesNotShowWraps) {
    // 999999999 * 10 is 1410065398 modulo 2^32, which isn't less than 999999999.
    EXPECT_EQ(StringToInteger(u"9999999999", 10), 1410065407);
    // 0xFFFFFFFF * 16 is 0xFFFFFFF0, which is less.
    EXPECT_THROW(StringToInteger(u"FFFFFFFFF", 16), UnableToConvert);
}

TEST(StringToInteger, RadixOutOfRangeThrows) {
    for (uint32_t radix : {0u, 1u, 37u, 0xFFFFFFFFu}) {
        EXPECT_THROW(StringToInteger(u"5", radix), UnableToConvert) << radix;
        EXPECT_THROW(StringToInteger(u"", radix), UnableToConvert) << radix;
    }
}

TEST(StringToInteger, ThrowSaysWhere) {
    try {
        StringToInteger(u"5", 1);
        ADD_FAILURE();
    } catch (const UnableToConvert& failure) {
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/osdep/StringToInteger");
        EXPECT_GT(failure.GetLine(), 0);
    }
}

TEST(StringToInteger, ReadsWhatIntegerToStringWrites) {
    for (uint32_t radix = 2; radix <= 36; ++radix) {
        for (uint32_t value : {0u, 1u, 35u, 36u, 123456789u, 0x7FFFFFFFu, 0xFFFFFFFFu}) {
            bool negative = true;
            EXPECT_EQ(StringToInteger(IntegerToString(value, radix), radix, negative), value) << radix;
            EXPECT_FALSE(negative);
        }
    }
}

}  // namespace
