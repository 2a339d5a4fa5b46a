#include "qn/dsc/osdep/NativeText.h"

#include <string>
#include <string_view>

#include <gtest/gtest.h>

namespace qn::dsc::osdep {

namespace {

using namespace std::string_view_literals;

std::u16string Units(std::string_view bytes) {
    std::u16string units(bytes.size(), u'#');
    const size_t counted = NativeToUnits(bytes, nullptr);
    units.resize(NativeToUnits(bytes, units.data()));
    EXPECT_EQ(counted, units.size());
    return units;
}

std::string Bytes(std::u16string_view units) {
    std::string bytes(3 * units.size(), '#');
    const size_t counted = UnitsToNative(units, nullptr);
    bytes.resize(UnitsToNative(units, bytes.data()));
    EXPECT_EQ(counted, bytes.size());
    return bytes;
}

TEST(NativeText, AsciiAndNulStandForThemselves) {
    EXPECT_EQ(Units("a\\/\0\x7F"sv), u"a\\/\0\x7F"sv);
    EXPECT_EQ(Bytes(u"a\\/\0\x7F"sv), "a\\/\0\x7F"sv);
}

TEST(NativeText, EmptyTextGivesNothing) {
    EXPECT_EQ(Units(""), u"");
    EXPECT_EQ(Bytes(u""), "");
}

TEST(NativeText, SequencesOfEveryLengthAreDecodedAtBothEnds) {
    const struct {
        std::string_view bytes;
        std::u16string_view units;
    } rows[] = {
        {"\xC2\x80", u"\x0080"},
        {"\xDF\xBF", u"\x07FF"},
        {"\xE0\xA0\x80", u"\x0800"},
        {"\xED\x9F\xBF", u"\xD7FF"},
        {"\xEE\x80\x80", u"\xE000"},
        {"\xEF\xBF\xBF", u"\xFFFF"},
        {"\xF0\x90\x80\x80", u"\xD800\xDC00"},
        {"\xF4\x8F\xBF\xBF", u"\xDBFF\xDFFF"},
        {"\xF0\x9F\x98\x80", u"\xD83D\xDE00"},
        {"\xE2\x82\xAC", u"\x20AC"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(Units(row.bytes), row.units) << testing::PrintToString(row.bytes);
        EXPECT_EQ(Bytes(row.units), row.bytes) << testing::PrintToString(row.bytes);
    }
}

TEST(NativeText, BytesOutsideUtf8BecomeUnitsOfTheirOwnAndComeBack) {
    const struct {
        std::string_view bytes;
        std::u16string_view units;
    } rows[] = {
        // A continuation byte without a lead, and leads without what they promise.
        {"\x80", u"\xDC80"},
        {"a\xBF!", u"a\xDCBF!"},
        {"\xC3", u"\xDCC3"},
        {"\xC3"
         "A",
         u"\xDCC3"
         u"A"},
        {"\xE2\x82", u"\xDCE2\xDC82"},
        {"\xE2\x82"
         "A",
         u"\xDCE2\xDC82"
         u"A"},
        {"\xF0\x9F\x98", u"\xDCF0\xDC9F\xDC98"},
        // Overlong forms.
        {"\xC0\x80", u"\xDCC0\xDC80"},
        {"\xC1\xBF", u"\xDCC1\xDCBF"},
        {"\xE0\x9F\xBF", u"\xDCE0\xDC9F\xDCBF"},
        {"\xF0\x8F\xBF\xBF", u"\xDCF0\xDC8F\xDCBF\xDCBF"},
        // Encoded surrogates, and what is above the last character.
        {"\xED\xA0\x80", u"\xDCED\xDCA0\xDC80"},
        {"\xED\xBF\xBF", u"\xDCED\xDCBF\xDCBF"},
        {"\xF4\x90\x80\x80", u"\xDCF4\xDC90\xDC80\xDC80"},
        {"\xF5\x80", u"\xDCF5\xDC80"},
        {"\xFF\xFE", u"\xDCFF\xDCFE"},
        // A valid sequence right behind a broken one.
        {"\xE2\x82\xC3\xA9", u"\xDCE2\xDC82\x00E9"},
    };
    for (const auto& row : rows) {
        EXPECT_EQ(Units(row.bytes), row.units) << testing::PrintToString(row.bytes);
        EXPECT_EQ(Bytes(row.units), row.bytes) << testing::PrintToString(row.bytes);
    }
}

TEST(NativeText, EveryPairOfBytesComesBack) {
    for (unsigned first = 0; first < 256; ++first) {
        for (unsigned second = 0; second < 256; ++second) {
            const std::string bytes = {static_cast<char>(first), static_cast<char>(second)};
            ASSERT_EQ(Bytes(Units(bytes)), bytes) << first << ", " << second;
        }
    }
}

TEST(NativeText, OtherLoneSurrogatesBecomeQuestionMarks) {
    EXPECT_EQ(Bytes(u"\xD800"sv), "?");
    EXPECT_EQ(Bytes(u"\xDBFF"
                    u"a"sv),
              "?a");
    EXPECT_EQ(Bytes(u"\xDC00"sv), "?");
    EXPECT_EQ(Bytes(u"\xDC7F"sv), "?");
    EXPECT_EQ(Bytes(u"\xDD00"sv), "?");
    EXPECT_EQ(Bytes(u"\xDFFF"sv), "?");
    EXPECT_EQ(Bytes(u"\xD800\xD83D\xDE00"sv), "?\xF0\x9F\x98\x80");
}

TEST(NativeText, ALowUnitBehindAHighOneIsPartOfAPairBeforeItIsAByte) {
    EXPECT_EQ(Bytes(u"\xD83D\xDC80"sv), "\xF0\x9F\x92\x80");
    EXPECT_EQ(Bytes(u"\xD83D\xDC80\xDC80"sv), "\xF0\x9F\x92\x80\x80");
}

TEST(NativeText, TheExchangeOfBackslashesIsNotMadeHere) {
    EXPECT_EQ(Units("\\"), u"\\");
    EXPECT_EQ(Bytes(u"\xF05C"), "\xEF\x81\x9C");
    EXPECT_EQ(Units("\xEF\x81\x9C"), u"\xF05C");
}

}  // namespace

}  // namespace qn::dsc::osdep
