#include "qn/dsc/osdep/NameOrder.h"

#include <string>

#include <gtest/gtest.h>

namespace qn::dsc::osdep {

namespace {

bool Matches(std::u16string_view pattern, std::u16string_view name) {
    std::u16string upperPattern;
    std::u16string upperName;
    AppendUpper(pattern, upperPattern);
    AppendUpper(name, upperName);
    return MatchesPattern(upperPattern, upperName);
}

TEST(UpperUnit, RaisesAsciiLettersAlone) {
    EXPECT_EQ(UpperUnit(u'a'), u'A');
    EXPECT_EQ(UpperUnit(u'z'), u'Z');
    EXPECT_EQ(UpperUnit(u'A'), u'A');
    EXPECT_EQ(UpperUnit(u'`'), u'`');
    EXPECT_EQ(UpperUnit(u'{'), u'{');
    EXPECT_EQ(UpperUnit(u'_'), u'_');
    EXPECT_EQ(UpperUnit(u'7'), u'7');
}

TEST(UpperUnit, RaisesLettersOfOtherAlphabets) {
    EXPECT_EQ(UpperUnit(u'\x00E9'), u'\x00C9');
    EXPECT_EQ(UpperUnit(u'\x00FF'), u'\x0178');
    EXPECT_EQ(UpperUnit(u'\x03C3'), u'\x03A3');
    EXPECT_EQ(UpperUnit(u'\x0436'), u'\x0416');
    EXPECT_EQ(UpperUnit(u'\xFF41'), u'\xFF21');
}

TEST(UpperUnit, LeavesWhatHasNoSingleUpperUnit) {
    EXPECT_EQ(UpperUnit(u'\x00DF'), u'\x00DF');
    EXPECT_EQ(UpperUnit(u'\x65E5'), u'\x65E5');
    EXPECT_EQ(UpperUnit(u'\xD83D'), u'\xD83D');
    EXPECT_EQ(UpperUnit(u'\xDC80'), u'\xDC80');
}

TEST(UpperUnit, NeverLeadsIntoAscii) {
    EXPECT_EQ(UpperUnit(u'\x0131'), u'\x0131');
    EXPECT_EQ(UpperUnit(u'\x017F'), u'\x017F');
    for (uint32_t unit = 0x80; unit <= 0xFFFF; ++unit) {
        ASSERT_GE(UpperUnit(static_cast<char16_t>(unit)), 0x80) << unit;
    }
}

TEST(AppendUpper, AppendsOneUnitForEach) {
    std::u16string upper = u"x";
    AppendUpper(u"a\x00E9\xD83D\xDE00z", upper);
    EXPECT_EQ(upper, u"xA\x00C9\xD83D\xDE00Z");
}

TEST(MatchesPattern, StarStandsForAnyUnits) {
    EXPECT_TRUE(Matches(u"*", u""));
    EXPECT_TRUE(Matches(u"*", u"a.b"));
    EXPECT_TRUE(Matches(u"*resource.xml", u"resource.xml"));
    EXPECT_TRUE(Matches(u"*resource.xml", u"b_resource.xml"));
    EXPECT_TRUE(Matches(u"a*", u"a"));
    EXPECT_TRUE(Matches(u"a*c", u"abbc"));
    EXPECT_TRUE(Matches(u"a*b*c", u"aXbYbZc"));
    EXPECT_TRUE(Matches(u"**", u"x"));
}

TEST(MatchesPattern, QuestionMarkStandsForOneUnit) {
    EXPECT_TRUE(Matches(u"?", u"a"));
    EXPECT_TRUE(Matches(u"a?c", u"abc"));
    EXPECT_FALSE(Matches(u"?", u""));
    EXPECT_FALSE(Matches(u"?", u"ab"));
    EXPECT_TRUE(Matches(u"??", u"\xD83D\xDE00"));
    EXPECT_TRUE(Matches(u"?*", u"ab"));
    EXPECT_FALSE(Matches(u"?*", u""));
}

TEST(MatchesPattern, TheWholeNameMustFit) {
    EXPECT_FALSE(Matches(u"*resource.xml", u"resource.xml.bak"));
    EXPECT_FALSE(Matches(u"*resource.xml", u"resource.xm"));
    EXPECT_FALSE(Matches(u"abc", u"abcd"));
    EXPECT_FALSE(Matches(u"abc", u"ab"));
    EXPECT_FALSE(Matches(u"", u"a"));
    EXPECT_TRUE(Matches(u"", u""));
}

TEST(MatchesPattern, IsBlindToLetterCase) {
    EXPECT_TRUE(Matches(u"*resource.xml", u"A_Resource.XML"));
    EXPECT_TRUE(Matches(u"*RESOURCE.XML", u"a_resource.xml"));
    EXPECT_TRUE(Matches(u"\x00E9*", u"\x00C9t\x00C9"));
}

TEST(MatchesPattern, OtherSignsStandForThemselves) {
    EXPECT_TRUE(Matches(u"[a].+", u"[a].+"));
    EXPECT_FALSE(Matches(u"[a]", u"a"));
    EXPECT_FALSE(Matches(u"a.b", u"axb"));
    EXPECT_FALSE(Matches(u"*.*", u"readme"));
}

TEST(MatchesPattern, GoesBackToTheLastStarOnly) {
    // Tried from every star, this would not end in a lifetime.
    std::u16string pattern;
    for (int i = 0; i < 60; ++i) {
        pattern += u"*a";
    }
    EXPECT_FALSE(Matches(pattern + u"b", std::u16string(2000, u'a')));
    EXPECT_TRUE(Matches(pattern, std::u16string(2000, u'a')));
}

}  // namespace

}  // namespace qn::dsc::osdep
