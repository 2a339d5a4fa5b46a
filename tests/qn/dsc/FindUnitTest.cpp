#include "qn/dsc/FindUnit.h"

#include <gtest/gtest.h>

#include <string>

namespace qn::dsc {
namespace {

TEST(FindUnit, FindsAUnitAtAnyPlaceOfTextsOfAnyLength) {
    for (size_t length = 0; length <= 40; ++length) {
        for (size_t place = 0; place < length; ++place) {
            std::u16string text(length, u'a');
            text[place] = u'x';
            for (size_t from = 0; from <= length; ++from) {
                EXPECT_EQ(FindUnit(text, u'x', from), from <= place ? place : length)
                    << length << ", " << place << ", " << from;
            }
        }
    }
}

TEST(FindUnit, GivesTheSizeWithoutAnyHit) {
    for (size_t length = 0; length <= 40; ++length) {
        EXPECT_EQ(FindUnit(std::u16string(length, u'a'), u'x'), length);
    }
}

TEST(FindUnit, FirstOfSeveralHitsCounts) {
    const std::u16string text(30, u'x');
    for (size_t from = 0; from <= text.size(); ++from) {
        EXPECT_EQ(FindUnit(text, u'x', from), from);
    }
}

TEST(FindUnit, BothBytesOfAUnitCount) {
    const std::u16string lookAlikes = u"\u2f2f\u2f00\u012f";
    EXPECT_EQ(FindUnit(lookAlikes, u'/'), 3u);
    EXPECT_EQ(FindUnit(lookAlikes + lookAlikes + lookAlikes, u'/'), 9u);
    EXPECT_EQ(FindUnit(lookAlikes + lookAlikes + lookAlikes + u'/', u'/'), 9u);
    EXPECT_EQ(FindUnit(std::u16string(9, u'a') + u'\u3042', u'\u3042'), 9u);
    EXPECT_EQ(FindUnit(std::u16string(9, u'a') + u'\xFFFF', u'\xFFFF'), 9u);
    EXPECT_EQ(FindUnit(std::u16string(9, u'a') + u'\0' + u'a', u'\0'), 9u);
}

TEST(FindEither, FindsWhicheverComesFirst) {
    for (size_t length = 2; length <= 40; ++length) {
        for (size_t place = 0; place + 1 < length; ++place) {
            std::u16string text(length, u'a');
            text[place] = u'x';
            text[place + 1] = u'y';
            EXPECT_EQ(FindEither(text, u'x', u'y'), place) << length;
            EXPECT_EQ(FindEither(text, u'y', u'x'), place) << length;
            EXPECT_EQ(FindEither(text, u'x', u'y', place + 1), place + 1) << length;
            EXPECT_EQ(FindEither(text, u'z', u'y'), place + 1) << length;
        }
    }
}

TEST(FindEither, LooksBehindTheTextForNothing) {
    const std::u16string text(u"aaaaaaaaaax");
    for (size_t length = 0; length < text.size(); ++length) {
        EXPECT_EQ(FindEither(std::u16string_view(text).substr(0, length), u'x', u'y'), length);
    }
}

TEST(HasSameUnits, TellsEqualTexts) {
    EXPECT_TRUE(HasSameUnits(u"", u""));
    EXPECT_TRUE(HasSameUnits({}, u""));
    EXPECT_TRUE(HasSameUnits(u"abc", u"abc"));
    EXPECT_TRUE(HasSameUnits(u"a\u540d", u"a\u540d"));
    EXPECT_FALSE(HasSameUnits(u"abc", u"abC"));
    EXPECT_FALSE(HasSameUnits(u"abc", u"ab"));
    EXPECT_FALSE(HasSameUnits(u"", u"a"));
    EXPECT_FALSE(HasSameUnits(u"\u0161", u"\u0061"));
    EXPECT_FALSE(HasSameUnits(u"\u6101", u"\u6102"));
}

}  // namespace
}  // namespace qn::dsc
