#include "qn/dsc/osdep/WideToAnsi.h"

#include <memory>
#include <string>
#include <string_view>

#include <gtest/gtest.h>

#include "qn/dsc/exception/Exception.h"

namespace {

using qn::dsc::osdep::WideToAnsi;
using namespace std::string_view_literals;

std::string Narrow(std::u16string_view units, const char* locale) {
    const std::unique_ptr<char[]> bytes(WideToAnsi(units.data(), units.data() + units.size(), locale));
    return bytes.get();
}

TEST(WideToAnsi, EmptySourceGivesOnlyTheNul) {
    for (const char* locale : {"", "US-ASCII", "cp932", "cp1252"}) {
        const std::unique_ptr<char[]> bytes(WideToAnsi(nullptr, nullptr, locale));
        EXPECT_EQ(bytes[0], 0) << locale;
    }
}

TEST(WideToAnsi, UnknownLocaleThrowsInvalidLocale) {
    EXPECT_THROW(Narrow(u"a", "utf-8"), qn::dsc::exception::InvalidLocale);
}

TEST(WideToAnsi, AsciiIsTheSameInEveryLocale) {
    for (const char* locale : {"", "US-ASCII", "cp932"}) {
        EXPECT_EQ(Narrow(u"Targets\\QN\x01 ~\x7F", locale), "Targets\\QN\x01 ~\x7F") << locale;
    }
}

TEST(WideToAnsi, EveryUnitOfAsciiIsItsByte) {
    for (const char* locale : {"", "US-ASCII", "cp932"}) {
        for (char16_t unit = 1; unit < 0x80; ++unit) {
            EXPECT_EQ(Narrow({&unit, 1}, locale), std::string(1, static_cast<char>(unit))) << locale << int{unit};
        }
    }
}

TEST(WideToAnsi, SourceStopsAtItsFirstNul) {
    for (const char* locale : {"", "US-ASCII", "cp932"}) {
        EXPECT_EQ(Narrow(u"ab\0cd"sv, locale), "ab") << locale;
    }
}

TEST(WideToAnsi, SourceStopsAtItsEnd) {
    const char16_t text[] = u"abcdef";
    const std::unique_ptr<char[]> bytes(WideToAnsi(text, text + 3, ""));
    EXPECT_STREQ(bytes.get(), "abc");
}

TEST(WideToAnsi, DefaultCodePageIsUtf8) {
    EXPECT_EQ(Narrow(u"\u00e9\u20ac", ""), "\xC3\xA9\xE2\x82\xAC");
    EXPECT_EQ(Narrow(u"\u0080\u07ff\u0800\uffff", ""), "\xC2\x80\xDF\xBF\xE0\xA0\x80\xEF\xBF\xBF");
}

TEST(WideToAnsi, DefaultCodePageJoinsPairs) {
    EXPECT_EQ(Narrow(u"\xD83D\xDE00", ""), "\xF0\x9F\x98\x80");
    EXPECT_EQ(Narrow(u"\xDBFF\xDFFF", ""), "\xF4\x8F\xBF\xBF");
}

// Windows puts its default character in the place of what is no text.
TEST(WideToAnsi, DefaultCodePageGivesBytesBackAsOnlyLinuxKeepsBytes) {
    for (unsigned byte = 0x80; byte <= 0xFF; ++byte) {
        const std::u16string units{u'a', static_cast<char16_t>(0xDC00 + byte), u'z'};
        EXPECT_EQ(Narrow(units, ""), (std::string{'a', static_cast<char>(byte), 'z'})) << byte;
    }
}

TEST(WideToAnsi, DefaultCodePageHasAQuestionMarkForOtherLoneSurrogatesAsOnlyLinuxKeepsBytes) {
    EXPECT_EQ(Narrow(u"a\xD800z", ""), "a?z");
    EXPECT_EQ(Narrow(u"a\xDC7Fz", ""), "a?z");
    EXPECT_EQ(Narrow(u"a\xDD00z", ""), "a?z");
    EXPECT_EQ(Narrow(u"a\xDFFF", ""), "a?");
    EXPECT_EQ(Narrow(u"\xD800\xD83D\xDE00", ""), "?\xF0\x9F\x98\x80");
}

TEST(WideToAnsi, UsAsciiHasAQuestionMarkForEachOtherUnitAsOnlyLinuxKeepsBytes) {
    EXPECT_EQ(Narrow(u"a\u0080\u00e9\u20ac\xDC80\xD83D\xDE00z", "US-ASCII"), "a??????z");
}

TEST(WideToAnsi, Cp932WritesShiftJis) {
    EXPECT_EQ(Narrow(u"\u65e5\u672c\u8a9e \uff71", "cp932"), "\x93\xFA\x96{\x8C\xEA \xB1");
}

TEST(WideToAnsi, Cp932HasAQuestionMarkForWhatItLacks) {
    EXPECT_EQ(Narrow(u"a\u20ac\u05d0z", "cp932"), "a??z");
    EXPECT_EQ(Narrow(u"a\xD800z", "cp932"), "a?z");
}

}  // namespace
