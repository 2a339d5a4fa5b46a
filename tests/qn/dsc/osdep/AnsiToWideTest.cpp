#include "qn/dsc/osdep/AnsiToWide.h"

#include <memory>
#include <string>
#include <string_view>

#include <gtest/gtest.h>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/WideToAnsi.h"

namespace {

using qn::dsc::osdep::AnsiToWide;
using qn::dsc::osdep::WideToAnsi;
using namespace std::string_view_literals;

std::u16string Wide(std::string_view bytes, const char* locale) {
    const std::unique_ptr<char16_t[]> units(AnsiToWide(bytes.data(), bytes.data() + bytes.size(), locale));
    return units.get();
}

TEST(AnsiToWide, EmptySourceGivesOnlyTheNul) {
    for (const char* locale : {"", "US-ASCII", "cp932"}) {
        const std::unique_ptr<char16_t[]> units(AnsiToWide(nullptr, nullptr, locale));
        EXPECT_EQ(units[0], 0) << locale;
        EXPECT_EQ(Wide("", locale), u"") << locale;
    }
}

TEST(AnsiToWide, EmptySourceIsNoErrorInAnUnknownLocale) {
    EXPECT_EQ(Wide("", "cp1252"), u"");
}

TEST(AnsiToWide, UnknownLocaleThrowsInvalidLocale) {
    EXPECT_THROW(Wide("a", "cp1252"), qn::dsc::exception::InvalidLocale);
}

TEST(AnsiToWide, AsciiIsTheSameInEveryLocale) {
    for (const char* locale : {"", "US-ASCII", "cp932"}) {
        EXPECT_EQ(Wide("Targets\\QN\x01 ~", locale), u"Targets\\QN\x01 ~") << locale;
    }
}

TEST(AnsiToWide, EveryByteOfAsciiIsItsUnit) {
    for (const char* locale : {"", "US-ASCII", "cp932"}) {
        for (int value = 1; value < 0x80; ++value) {
            const char byte = static_cast<char>(value);
            EXPECT_EQ(Wide({&byte, 1}, locale), std::u16string(1, static_cast<char16_t>(byte))) << locale << value;
        }
    }
}

TEST(AnsiToWide, SourceStopsAtItsFirstNul) {
    for (const char* locale : {"", "US-ASCII", "cp932"}) {
        EXPECT_EQ(Wide("ab\0cd"sv, locale), u"ab") << locale;
        EXPECT_EQ(Wide("\0cd"sv, locale), u"") << locale;
    }
}

TEST(AnsiToWide, SourceStopsAtItsEnd) {
    const char text[] = "abcdef";
    const std::unique_ptr<char16_t[]> units(AnsiToWide(text, text + 3, ""));
    EXPECT_EQ(std::u16string(units.get()), u"abc");
}

TEST(AnsiToWide, DefaultCodePageIsUtf8) {
    EXPECT_EQ(Wide("\xC3\xA9\xE2\x82\xAC", ""), u"\u00e9\u20ac");
    EXPECT_EQ(Wide("\xC2\x80\xDF\xBF\xE0\xA0\x80\xEF\xBF\xBF", ""), u"\u0080\u07ff\u0800\uffff");
}

TEST(AnsiToWide, DefaultCodePageMakesPairsOfFourBytes) {
    EXPECT_EQ(Wide("\xF0\x9F\x98\x80", ""), u"\xD83D\xDE00");
    EXPECT_EQ(Wide("\xF0\x90\x80\x80\xF4\x8F\xBF\xBF", ""), u"\xD800\xDC00\xDBFF\xDFFF");
}

// Windows puts its default character in the place of what is no text.
TEST(AnsiToWide, DefaultCodePageKeepsBytesThatAreNoUtf8AsOnlyLinuxKeepsBytes) {
    struct Row {
        std::string_view bytes;
        std::u16string_view units;
    };
    const Row rows[] = {
        {"\x80", u"\xDC80"},                                // a continuation on its own
        {"a\xFFz", u"a\xDCFFz"},                            // no byte of UTF-8
        {"\xC3", u"\xDCC3"},                                // cut off
        {"\xE2\x82", u"\xDCE2\xDC82"},                      // cut off
        {"\xE2\x82z", u"\xDCE2\xDC82z"},                    // broken off
        {"\xC0\xAF", u"\xDCC0\xDCAF"},                      // too long a form
        {"\xE0\x80\x80", u"\xDCE0\xDC80\xDC80"},            // too long a form
        {"\xF0\x80\x80\x80", u"\xDCF0\xDC80\xDC80\xDC80"},  // too long a form
        {"\xED\xA0\x80", u"\xDCED\xDCA0\xDC80"},            // an encoded surrogate
        {"\xF4\x90\x80\x80", u"\xDCF4\xDC90\xDC80\xDC80"},  // above U+10FFFF
        {"\xF5\x80", u"\xDCF5\xDC80"},                      // no lead byte
        {"\xC3\xC3\xA9", u"\xDCC3\u00e9"},                  // a good sequence behind a bad byte
    };
    for (const Row& row : rows) {
        EXPECT_EQ(Wide(row.bytes, ""), row.units) << testing::PrintToString(row.bytes);
    }
}

TEST(AnsiToWide, DefaultCodePageBringsEverySequenceOfThreeBytesBackAsOnlyLinuxKeepsBytes) {
    const std::string bytes = "a\x7F\x80\xA0\xBF\xC2\xC3\xDF\xE0\xE2\xED\xEF\xF0\xF4\xFF";
    for (char first : bytes) {
        for (char second : bytes) {
            for (char third : bytes) {
                const std::string source{first, second, third};
                const std::u16string units = Wide(source, "");
                const std::unique_ptr<char[]> back(WideToAnsi(units.data(), units.data() + units.size(), ""));
                ASSERT_EQ(back.get(), source) << testing::PrintToString(source);
            }
        }
    }
}

TEST(AnsiToWide, UsAsciiDropsTheTopBit) {
    EXPECT_EQ(Wide("\xC1\xFF\xE1z", "US-ASCII"),
              u"A\x7F"
              u"az");
}

TEST(AnsiToWide, Cp932ReadsShiftJis) {
    EXPECT_EQ(Wide("\x93\xFA\x96{\x8C\xEA \xB1", "cp932"), u"\u65e5\u672c\u8a9e \uff71");
    EXPECT_EQ(Wide("\\~", "cp932"), u"\\~");
}

TEST(AnsiToWide, Cp932GivesTheDefaultCharacterForBytesWithoutAny) {
    EXPECT_EQ(Wide("a\x81", "cp932"), u"a\u30fb");
    EXPECT_EQ(Wide("a\x85\x40z", "cp932"), u"a\u30fbz");
}

TEST(AnsiToWide, LongTextsAreConvertedWhole) {
    std::string narrow;
    std::u16string wide;
    for (int i = 0; i < 300000; ++i) {
        narrow += "\x93\xFA";
        wide += u'\u65e5';
    }
    EXPECT_TRUE(Wide(narrow, "cp932") == wide);
    EXPECT_TRUE(Wide(std::string(1000000, 'x'), "") == std::u16string(1000000, u'x'));
}

}  // namespace
