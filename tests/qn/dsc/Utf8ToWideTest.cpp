#include "qn/dsc/Utf8ToWide.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/WideToUtf8.h"
#include "qn/dsc/exception/Exception.h"
#include "support/AllocationFaultScope.h"

namespace qn::dsc {
namespace {

using namespace std::string_view_literals;

std::u16string Decode(std::string_view bytes) {
    uint32_t length = 0;
    const std::unique_ptr<char16_t[]> result(Utf8ToWide(bytes.data(), static_cast<uint32_t>(bytes.size()), &length));
    EXPECT_EQ(result[length], u'\0');
    return std::u16string(result.get(), length);
}

// Whether the bytes are refused, by each of the ways to decode them.
bool IsRefused(std::string_view bytes) {
    const auto length = static_cast<uint32_t>(bytes.size());
    String text(u"untouched");
    const bool refused = !String::TryFromUtf8(bytes.data(), length, text);
    EXPECT_EQ(refused, text.View() == u"untouched"sv);
    EXPECT_EQ(refused, MeasureUtf8(bytes.data(), bytes.size()) == SIZE_MAX);
    if (refused) {
        EXPECT_THROW(Utf8ToWide(bytes.data(), length), exception::InvalidSequence);
        EXPECT_THROW(String::FromUtf8(bytes.data(), length), exception::InvalidSequence);
    } else {
        EXPECT_EQ(text.View(), Decode(bytes));
        EXPECT_EQ(String::FromUtf8(bytes.data(), length).View(), Decode(bytes));
    }
    return refused;
}

std::string Bytes(std::initializer_list<int> values) {
    std::string bytes;
    for (const int value : values) {
        bytes.push_back(static_cast<char>(static_cast<unsigned char>(value)));
    }
    return bytes;
}

TEST(Utf8ToWide, OneByteIsItsUnit) {
    for (int byte = 0; byte < 0x80; ++byte) {
        EXPECT_EQ(Decode(Bytes({byte})), std::u16string(1, static_cast<char16_t>(byte)));
    }
}

TEST(Utf8ToWide, TwoBytes) {
    EXPECT_EQ(Decode("\xC2\x80"), u"\u0080");
    EXPECT_EQ(Decode("\xC3\xBC"), u"\u00FC");
    EXPECT_EQ(Decode("\xDF\xBF"), u"\u07FF");
}

TEST(Utf8ToWide, ThreeBytes) {
    EXPECT_EQ(Decode("\xE0\xA0\x80"), u"\u0800");
    EXPECT_EQ(Decode("\xE2\x82\xAC"), u"\u20AC");
    EXPECT_EQ(Decode("\xEE\x80\x80"), u"\uE000");
    EXPECT_EQ(Decode("\xEF\xBF\xBF"), u"\uFFFF");
    EXPECT_EQ(Decode("\xEF\xBB\xBF"), u"\uFEFF");
}

TEST(Utf8ToWide, EncodedHalvesOfPairsPass) {
    EXPECT_EQ(Decode("\xED\xA0\x80"), u"\xD800"sv);
    EXPECT_EQ(Decode("\xED\xBF\xBF"), u"\xDFFF"sv);
    EXPECT_EQ(Decode("\xED\xA0\xBD\xED\xB8\x80"), u"\U0001F600");
}

TEST(Utf8ToWide, ContinuationBytesAndOverlongLeadsAreRefused) {
    for (int lead = 0x80; lead <= 0xC1; ++lead) {
        EXPECT_TRUE(IsRefused(Bytes({lead}))) << lead;
        EXPECT_TRUE(IsRefused(Bytes({lead, 0x80}))) << lead;
        EXPECT_TRUE(IsRefused(Bytes({lead, 0x80, 0x80}))) << lead;
    }
}

TEST(Utf8ToWide, LeadsOfFourBytesAndAboveAreRefused) {
    for (int lead = 0xF0; lead <= 0xFF; ++lead) {
        EXPECT_TRUE(IsRefused(Bytes({lead, 0x90, 0x80, 0x80}))) << lead;
        EXPECT_TRUE(IsRefused(Bytes({lead}))) << lead;
    }
    EXPECT_TRUE(IsRefused("\xF0\x9F\x98\x80"));
}

TEST(Utf8ToWide, TheSecondOfTwoBytesMustContinue) {
    for (int second = 0; second <= 0xFF; ++second) {
        const bool continues = second >= 0x80 && second <= 0xBF;
        EXPECT_EQ(IsRefused(Bytes({0xC2, second})), !continues) << second;
        EXPECT_EQ(IsRefused(Bytes({0xDF, second})), !continues) << second;
    }
}

TEST(Utf8ToWide, BothOfThreeBytesMustContinue) {
    for (int other = 0; other <= 0xFF; ++other) {
        const bool continues = other >= 0x80 && other <= 0xBF;
        for (const int lead : {0xE1, 0xED, 0xEF}) {
            EXPECT_EQ(IsRefused(Bytes({lead, other, 0x80})), !continues) << other;
            EXPECT_EQ(IsRefused(Bytes({lead, 0xBF, other})), !continues) << other;
        }
    }
}

TEST(Utf8ToWide, OverlongFormsOfThreeBytesAreRefused) {
    for (int second = 0; second <= 0xFF; ++second) {
        EXPECT_EQ(IsRefused(Bytes({0xE0, second, 0x80})), second < 0xA0 || second > 0xBF) << second;
    }
    EXPECT_TRUE(IsRefused("\xE0\x80\x80"));
}

TEST(Utf8ToWide, AnEndInsideASequenceIsRefused) {
    EXPECT_TRUE(IsRefused("\xC3"));
    EXPECT_TRUE(IsRefused("\xE2"));
    EXPECT_TRUE(IsRefused("\xE2\x82"));
    EXPECT_TRUE(IsRefused("plain text and then \xE2\x82"));
    // The bytes behind the end would complete the sequence.
    const std::string whole = "ab\xE2\x82\xAC";
    EXPECT_TRUE(IsRefused(std::string_view(whole).substr(0, 4)));
    EXPECT_TRUE(IsRefused(std::string_view(whole).substr(0, 3)));
}

TEST(Utf8ToWide, AFaultAnywhereInALongTextIsRefused) {
    for (size_t length = 1; length < 70; ++length) {
        for (size_t place = 0; place < length; ++place) {
            std::string bytes(length, 'x');
            bytes[place] = '\xFF';
            ASSERT_TRUE(IsRefused(bytes)) << length << " " << place;
        }
    }
}

TEST(IsAscii, SeesAByteOutsideAsciiAnywhereInATextOfAnyLength) {
    for (size_t length = 0; length < 70; ++length) {
        std::string bytes(length, '\x7F');
        ASSERT_TRUE(IsAscii(bytes.data(), length)) << length;
        for (size_t place = 0; place < length; ++place) {
            bytes[place] = '\x80';
            ASSERT_FALSE(IsAscii(bytes.data(), length)) << length << " " << place;
            bytes[place] = '\x7F';
        }
    }
}

TEST(Utf8ToWide, PlainTextOfEveryLengthPasses) {
    std::string bytes;
    std::u16string expected;
    for (int length = 0; length < 200; ++length) {
        ASSERT_EQ(Decode(bytes), expected);
        ASSERT_FALSE(IsRefused(bytes));
        const int byte = 1 + length % 127;
        bytes.push_back(static_cast<char>(byte));
        expected.push_back(static_cast<char16_t>(byte));
    }
}

TEST(Utf8ToWide, ALongSequenceAnywhereInALongTextPasses) {
    for (size_t length = 0; length < 40; ++length) {
        for (size_t place = 0; place <= length; ++place) {
            std::string bytes(length, 'x');
            bytes.insert(place, "\xE2\x82\xAC"sv);
            std::u16string expected(length, u'x');
            expected.insert(place, 1, u'\u20AC');
            ASSERT_EQ(Decode(bytes), expected);
            ASSERT_FALSE(IsRefused(bytes));
        }
    }
}

TEST(Utf8ToWide, NulBytesAreUnits) {
    EXPECT_EQ(Decode("a\0b"sv), u"a\0b"sv);
    EXPECT_EQ(String::FromUtf8("a\0b", 3).View(), u"a\0b"sv);
}

TEST(Utf8ToWide, NullGivesTheNulAlone) {
    uint32_t length = 77;
    const std::unique_ptr<char16_t[]> result(Utf8ToWide(nullptr, 5, &length));
    EXPECT_EQ(result[0], u'\0');
    EXPECT_EQ(length, 0U);
    EXPECT_EQ(String::FromUtf8(nullptr, 5).View(), u""sv);
}

TEST(Utf8ToWide, NothingGivesTheNulAlone) {
    EXPECT_EQ(Decode(""), u"");
    EXPECT_TRUE(String::FromUtf8("", 0).IsEmpty());
}

TEST(Utf8ToWide, RecordsWhereItThrew) {
    try {
        Utf8ToWide("\xFF", 1);
        FAIL() << "nothing thrown";
    } catch (const exception::InvalidSequence& failure) {
        EXPECT_STREQ(failure.what(), "Invalid UTF8 encoding sequence");
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/Utf8ToWide");
        EXPECT_GT(failure.GetLine(), 0);
    }
}

TEST(Utf8ToWide, EveryUnitComesBack) {
    std::u16string units;
    for (uint32_t unit = 0; unit <= 0xFFFF; ++unit) {
        units.push_back(static_cast<char16_t>(unit));
    }
    uint32_t length = 0;
    const std::unique_ptr<char[]> bytes(WideToUtf8(units.data(), units.data() + units.size(), &length));
    EXPECT_EQ(Decode(std::string_view(bytes.get(), length)), units);
}

TEST(DecodeUtf8, StopsWhereThereIsNoRoom) {
    const std::string_view bytes = "ab\xE2\x82\xAC\xC3\xBC";
    char16_t units[4] = {u'-', u'-', u'-', u'-'};
    EXPECT_EQ(DecodeUtf8(bytes.data(), bytes.size(), units, 3), bytes.data() + 5);
    EXPECT_EQ(std::u16string(units, 4), u"ab\u20AC-");
}

TEST(DecodeUtf8, StopsWhereThereIsNoRoomInPlainText) {
    const std::string bytes(30, 'x');
    std::u16string units(30, u'-');
    EXPECT_EQ(DecodeUtf8(bytes.data(), bytes.size(), units.data(), 13), bytes.data() + 13);
    EXPECT_EQ(units, std::u16string(13, u'x') + std::u16string(17, u'-'));
}

TEST(DecodeUtf8, StopsAtWhatIsNotWellFormed) {
    const std::string_view bytes = "ab\xFF";
    char16_t units[4] = {};
    EXPECT_EQ(DecodeUtf8(bytes.data(), bytes.size(), units, 4), bytes.data() + 2);
}

TEST(StringFromUtf8, HasTheExactSizeAndOneAllocation) {
    const support::AllocationCounter counter;
    const String plain = String::FromUtf8("plain text", 10);
    EXPECT_EQ(counter.Count(), 1U);
    EXPECT_EQ(plain.Capacity(), 10U);
    const String mixed = String::FromUtf8("a\xE2\x82\xAC", 4);
    EXPECT_EQ(counter.Count(), 2U);
    EXPECT_EQ(mixed.Capacity(), 2U);
    EXPECT_EQ(mixed.View(), u"a\u20AC"sv);
}

TEST(StringFromUtf8, IntoAStringFollowsTheRuleOfAssignment) {
    String text(u"0123456789");
    const char16_t* buffer = text.CStr();
    ASSERT_TRUE(String::TryFromUtf8("five5", 5, text));
    EXPECT_EQ(text.CStr(), buffer);
    EXPECT_EQ(text.View(), u"five5"sv);
    ASSERT_TRUE(String::TryFromUtf8("four", 4, text));
    EXPECT_EQ(text.View(), u"four"sv);
    EXPECT_EQ(text.Capacity(), 4U);
    ASSERT_TRUE(String::TryFromUtf8("longer than it was", 18, text));
    EXPECT_EQ(text.View(), u"longer than it was"sv);
    EXPECT_EQ(text.Capacity(), 18U);
}

TEST(StringFromUtf8, EndsInANul) {
    String text(u"0123456789");
    for (const std::string bytes :
         {"five5", "f\xC3\xBCnf5", "\xE2\x82\xAC\xE2\x82\xAC", "longer than it was", "\xC3\xBC and longer still"}) {
        ASSERT_TRUE(String::TryFromUtf8(bytes.data(), static_cast<uint32_t>(bytes.size()), text));
        EXPECT_EQ(text.CStr()[text.Length()], u'\0') << bytes;
        const String fresh = String::FromUtf8(bytes.data(), static_cast<uint32_t>(bytes.size()));
        EXPECT_EQ(fresh.CStr()[fresh.Length()], u'\0') << bytes;
    }
}

TEST(StringFromUtf8, IntoAStringWithoutBuffer) {
    String text = String::WithoutBuffer();
    ASSERT_TRUE(String::TryFromUtf8("", 0, text));
    ASSERT_NE(text.CStr(), nullptr);
    EXPECT_EQ(text.View(), u""sv);
}

TEST(StringFromUtf8, WithoutMemoryLeavesTheString) {
    String text(u"kept");
    const support::AllocationFaultScope fault(1, true);
    EXPECT_THROW(String::TryFromUtf8("a text that is longer", 21, text), std::bad_alloc);
    EXPECT_EQ(text.View(), u"kept"sv);
}

}  // namespace
}  // namespace qn::dsc
