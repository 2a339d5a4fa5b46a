#include "qn/dsc/WideToUtf8.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "qn/dsc/exception/Exception.h"

namespace qn::dsc {
namespace {

using namespace std::string_view_literals;

std::string Encode(std::u16string_view units) {
    uint32_t length = 0;
    const std::unique_ptr<char[]> result(WideToUtf8(units.data(), units.data() + units.size(), &length));
    EXPECT_EQ(result[length], '\0');
    return std::string(result.get(), length);
}

TEST(WideToUtf8, BelowHex80IsOneByte) {
    for (char16_t unit = 0; unit < 0x80; ++unit) {
        EXPECT_EQ(Encode(std::u16string_view(&unit, 1)), std::string(1, static_cast<char>(unit)));
    }
}

TEST(WideToUtf8, BelowHex800IsTwoBytes) {
    EXPECT_EQ(Encode(u"\u0080"), "\xC2\x80");
    EXPECT_EQ(Encode(u"\u00FC"), "\xC3\xBC");
    EXPECT_EQ(Encode(u"\u07FF"), "\xDF\xBF");
}

TEST(WideToUtf8, EverythingElseIsThreeBytes) {
    EXPECT_EQ(Encode(u"\u0800"), "\xE0\xA0\x80");
    EXPECT_EQ(Encode(u"\u20AC"), "\xE2\x82\xAC");
    EXPECT_EQ(Encode(u"\uFFFF"), "\xEF\xBF\xBF");
}

TEST(WideToUtf8, HalvesOfAPairAreNotJoined) {
    EXPECT_EQ(Encode(u"\U0001F600"), "\xED\xA0\xBD\xED\xB8\x80");
}

TEST(WideToUtf8, AnUnpairedHalfPasses) {
    EXPECT_EQ(Encode(u"\xD800"sv), "\xED\xA0\x80");
    EXPECT_EQ(Encode(u"\xDFFF"sv), "\xED\xBF\xBF");
    EXPECT_EQ(Encode(u"\xDE00\xD83D"sv), "\xED\xB8\x80\xED\xA0\xBD");
}

TEST(WideToUtf8, NulUnitsAreBytes) {
    EXPECT_EQ(Encode(u"a\0b"sv), "a\0b"sv);
}

TEST(WideToUtf8, NullGivesTheNulAlone) {
    uint32_t length = 77;
    const std::unique_ptr<char[]> result(WideToUtf8(nullptr, nullptr, &length));
    EXPECT_EQ(result[0], '\0');
    EXPECT_EQ(length, 0U);
}

TEST(WideToUtf8, NothingGivesTheNulAlone) {
    EXPECT_EQ(Encode(u""), "");
}

TEST(WideToUtf8, PlainTextOfEveryLength) {
    std::u16string units;
    std::string expected;
    for (int length = 0; length < 100; ++length) {
        ASSERT_EQ(Encode(units), expected);
        units.push_back(static_cast<char16_t>(1 + length % 127));
        expected.push_back(static_cast<char>(1 + length % 127));
    }
}

TEST(WideToUtf8, AWideUnitAnywhereInALongText) {
    for (size_t length = 0; length < 40; ++length) {
        for (size_t place = 0; place <= length; ++place) {
            std::u16string units(length, u'x');
            units.insert(place, 1, u'\u0080');
            std::string expected(length, 'x');
            expected.insert(place, "\xC2\x80"sv);
            ASSERT_EQ(Encode(units), expected);
        }
    }
}

TEST(WideToUtf8, MoreThanTheLimitIsABufferOverflow) {
    const std::u16string_view units = u"\u20AC\u20AC";
    try {
        WideToUtf8(units.data(), units.data() + 2, nullptr, 5);
        FAIL() << "nothing thrown";
    } catch (const exception::BufferOverflow& failure) {
        EXPECT_STREQ(failure.what(), "Buffer overflowed");
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/WideToUtf8");
        EXPECT_GT(failure.GetLine(), 0);
    }
}

TEST(WideToUtf8, ExactlyTheLimitPasses) {
    const std::u16string_view units = u"\u20AC\u20AC";
    const std::unique_ptr<char[]> result(WideToUtf8(units.data(), units.data() + 2, nullptr, 6));
    EXPECT_STREQ(result.get(), "\xE2\x82\xAC\xE2\x82\xAC");
}

TEST(MeasureAsUtf8, AddsUpTheUnits) {
    const std::u16string_view units = u"a\u00FC\u20AC\U0001F600";
    EXPECT_EQ(MeasureAsUtf8(units.data(), units.data() + units.size()), 1U + 2U + 3U + 6U);
}

TEST(MeasureAsUtf8, StopsBeforeTheLimitIsPassed) {
    const std::u16string_view units = u"a\u20AC\u20AC";
    EXPECT_EQ(MeasureAsUtf8(units.data(), units.data() + 3, 7), 7U);
    EXPECT_EQ(MeasureAsUtf8(units.data(), units.data() + 3, 6), 4U);
    EXPECT_EQ(MeasureAsUtf8(units.data(), units.data() + 3, 3), 1U);
    EXPECT_EQ(MeasureAsUtf8(units.data(), units.data() + 3, 0), 0U);
    const std::u16string plain(20, u'x');
    EXPECT_EQ(MeasureAsUtf8(plain.data(), plain.data() + 20, 11), 11U);
}

TEST(EncodeUtf8, StopsWhereThereIsNoRoom) {
    const std::u16string_view units = u"a\u20ACb";
    char bytes[6] = {'-', '-', '-', '-', '-', '-'};
    EXPECT_EQ(EncodeUtf8(units.data(), units.data() + 3, bytes, 3), units.data() + 1);
    EXPECT_EQ(std::string(bytes, 6), "a-----");
    EXPECT_EQ(EncodeUtf8(units.data(), units.data() + 3, bytes, 4), units.data() + 2);
    EXPECT_EQ(std::string(bytes, 6), "a\xE2\x82\xAC--");
}

TEST(EncodeUtf8, StopsWhereThereIsNoRoomInPlainText) {
    const std::u16string units(30, u'x');
    std::string bytes(30, '-');
    EXPECT_EQ(EncodeUtf8(units.data(), units.data() + 30, bytes.data(), 13), units.data() + 13);
    EXPECT_EQ(bytes, std::string(13, 'x') + std::string(17, '-'));
}

}  // namespace
}  // namespace qn::dsc
