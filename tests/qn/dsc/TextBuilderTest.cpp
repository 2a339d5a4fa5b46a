#include "qn/dsc/TextBuilder.h"

#include <gtest/gtest.h>

#include <string>

namespace qn::dsc {
namespace {

using namespace std::string_view_literals;

TEST(TextBuilder, IsEmptyAtFirst) {
    TextBuilder builder;
    EXPECT_TRUE(builder.IsEmpty());
    EXPECT_EQ(builder.View(), u""sv);
    EXPECT_EQ(builder.Text().View(), u""sv);
}

TEST(TextBuilder, PutsPiecesInARow) {
    TextBuilder builder;
    builder.Append(u"ab");
    builder.Append(u""sv);
    builder.Append(std::u16string_view());
    builder.Append(u'c');
    builder.Append(u"d\0e"sv);
    EXPECT_FALSE(builder.IsEmpty());
    EXPECT_EQ(builder.View(), u"abcd\0e"sv);
}

TEST(TextBuilder, GivesAStringOfTheExactSize) {
    TextBuilder builder;
    builder.Append(u"0123456789");
    const String text = builder.Text();
    EXPECT_EQ(text.View(), u"0123456789"sv);
    EXPECT_EQ(text.Capacity(), 10u);
}

TEST(TextBuilder, MayGrowToAnyLengthByPieces) {
    TextBuilder builder;
    std::u16string expected;
    for (int i = 0; i < 300; ++i) {
        const std::u16string piece(static_cast<size_t>(i), static_cast<char16_t>(u'a' + i % 26));
        builder.Append(piece);
        expected += piece;
    }
    EXPECT_EQ(builder.View(), expected);
    EXPECT_EQ(builder.Text().View(), expected);
}

TEST(TextBuilder, MayGrowToAnyLengthByUnits) {
    TextBuilder builder;
    std::u16string expected;
    for (int i = 0; i < 2000; ++i) {
        builder.Append(static_cast<char16_t>(i));
        expected += static_cast<char16_t>(i);
        ASSERT_EQ(builder.View().size(), expected.size());
    }
    EXPECT_EQ(builder.View(), expected);
}

TEST(TextBuilder, TakesAPieceOfExactlyTheRoomThatIsLeft) {
    for (const size_t length : {255u, 256u, 257u}) {
        TextBuilder builder;
        builder.Append(u'x');
        builder.Append(std::u16string(length - 1, u'y'));
        builder.Append(u'z');
        EXPECT_EQ(builder.View(), u'x' + std::u16string(length - 1, u'y') + u'z');
    }
}

TEST(TextBuilder, WidensAscii) {
    for (size_t length = 0; length <= 300; length += length < 40 ? 1 : 20) {
        TextBuilder builder;
        builder.Append(u'<');
        builder.AppendAscii(std::string(length, 'a'));
        builder.Append(u'>');
        EXPECT_EQ(builder.View(), u'<' + std::u16string(length, u'a') + u'>');
    }
}

TEST(TextBuilder, DecodesUtf8) {
    for (size_t length = 0; length <= 300; length += length < 40 ? 1 : 20) {
        TextBuilder builder;
        builder.Append(u'<');
        EXPECT_TRUE(builder.AppendUtf8(std::string(length, 'a')));
        EXPECT_TRUE(builder.AppendUtf8(std::string(length, 'b') + "\xC3\xA4\xE6\x97\xA5"));
        builder.Append(u'>');
        EXPECT_EQ(builder.View(),
                  u'<' + std::u16string(length, u'a') + std::u16string(length, u'b') + u"\u00E4\u65E5>");
    }
}

TEST(TextBuilder, StaysAsItIsBesideBytesThatAreNoText) {
    TextBuilder builder;
    builder.Append(u"before");
    for (const char* bytes : {"\xFF", "\xC3", "a\xF0\x9F\x98\x80", "\xC0\x80", "text that is long enough\x80"}) {
        EXPECT_FALSE(builder.AppendUtf8(bytes));
        EXPECT_EQ(builder.View(), u"before");
    }
}

}  // namespace
}  // namespace qn::dsc
