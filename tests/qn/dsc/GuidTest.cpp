#include "qn/dsc/Guid.h"

#include <cstring>
#include <string>

#include <gtest/gtest.h>

#include "qn/dsc/exception/Exception.h"

namespace {

using qn::dsc::Guid;
using qn::dsc::String;
using qn::dsc::exception::BadGuidString;

constexpr char16_t sample[] = u"{01234567-89AB-CDEF-0123-456789ABCDEF}";

TEST(Guid, ParsesItsTextForm) {
    const Guid guid(sample);
    EXPECT_EQ(guid.data1, 0x01234567u);
    EXPECT_EQ(guid.data2, 0x89AB);
    EXPECT_EQ(guid.data3, 0xCDEF);
    const uint8_t bytes[] = {0x01, 0x23, 0x45, 0x67, 0x89, 0xAB, 0xCD, 0xEF};
    EXPECT_EQ(std::memcmp(guid.data4, bytes, 8), 0);
}

TEST(Guid, NumbersAreInTheByteOrderOfTheMachine) {
    const Guid guid(sample);
    const uint32_t first = 0x01234567;
    EXPECT_EQ(std::memcmp(&guid, &first, 4), 0);
    EXPECT_EQ(sizeof(Guid), 16u);
}

TEST(Guid, ToStringGivesTheTextBack) {
    EXPECT_EQ(Guid(sample).ToString().View(), sample);
    EXPECT_EQ(Guid(u"{FFFFFFFF-FFFF-FFFF-FFFF-FFFFFFFFFFFF}").ToString().View(),
              u"{FFFFFFFF-FFFF-FFFF-FFFF-FFFFFFFFFFFF}");
    EXPECT_EQ(Guid(sample).ToString().Length(), 38u);
}

TEST(Guid, LowerCaseDigitsParseAndComeOutAsCapitals) {
    EXPECT_EQ(Guid(u"{abcdefAB-cdef-ABCD-efab-cdefabcdefab}").ToString().View(),
              u"{ABCDEFAB-CDEF-ABCD-EFAB-CDEFABCDEFAB}");
}

TEST(Guid, DefaultIsAllZero) {
    EXPECT_EQ(Guid().ToString().View(), u"{00000000-0000-0000-0000-000000000000}");
}

TEST(Guid, IsMadeFromItsFields) {
    constexpr Guid guid(0x01234567, 0x89AB, 0xCDEF, {0x01, 0x23, 0x45, 0x67, 0x89, 0xAB, 0xCD, 0xEF});
    EXPECT_EQ(guid, Guid(sample));
}

TEST(Guid, CopyHasTheSameBytes) {
    const Guid guid(sample);
    const Guid copy = guid;
    EXPECT_EQ(std::memcmp(&copy, &guid, 16), 0);
    EXPECT_EQ(copy, guid);
    EXPECT_FALSE(copy == Guid());
}

TEST(Guid, TextOfAnotherLengthThrows) {
    const std::u16string text = sample;
    for (const std::u16string& wrong : {std::u16string(), text.substr(0, 37), text + u" ", text.substr(1, 36)}) {
        EXPECT_THROW(Guid{std::u16string_view(wrong)}, BadGuidString) << wrong.size();
    }
}

TEST(Guid, WrongUnitAtAnyPlaceThrows) {
    for (size_t place = 0; place < 38; ++place) {
        for (char16_t wrong : {u'g', u'G', u' ', u'/', u':', u'@', u'`', u'_', u'\0', u'\uff11'}) {
            std::u16string text = sample;
            text[place] = wrong;
            EXPECT_THROW(Guid{std::u16string_view(text)}, BadGuidString)
                << place << " " << static_cast<unsigned>(wrong);
        }
    }
}

TEST(Guid, DigitInPlaceOfASignThrowsAndTheOtherWayRound) {
    for (size_t place = 0; place < 38; ++place) {
        std::u16string text = sample;
        const bool isDigit = text[place] != u'{' && text[place] != u'-' && text[place] != u'}';
        text[place] = isDigit ? u'-' : u'0';
        EXPECT_THROW(Guid{std::u16string_view(text)}, BadGuidString) << place;
    }
}

TEST(Guid, FailedAssignChangesNothing) {
    Guid guid(sample);
    EXPECT_THROW(guid.Assign(u"{FFFFFFFF-FFFF-FFFF-FFFF-FFFFFFFFFFFF)"), BadGuidString);
    EXPECT_EQ(guid, Guid(sample));
    guid.Assign(u"{FFFFFFFF-FFFF-FFFF-FFFF-FFFFFFFFFFFF}");
    EXPECT_EQ(guid.data1, 0xFFFFFFFFu);
}

TEST(Guid, ThrowSaysWhatAndWhere) {
    try {
        Guid guid(u"");
        ADD_FAILURE();
    } catch (const BadGuidString& failure) {
        EXPECT_STREQ(failure.what(), "Badly formatted Guid string.");
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/Guid");
        EXPECT_GT(failure.GetLine(), 0);
    }
}

}  // namespace
