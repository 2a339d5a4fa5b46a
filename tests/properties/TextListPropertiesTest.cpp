// Lists in texts: what was escaped and joined comes apart as it was.

#include <vector>

#include <gtest/gtest.h>

#include "properties/Random.h"
#include "restree/TextList.h"
#include "support/ExactText.h"

namespace zkhw {
namespace {

constexpr std::u16string_view units = u"ab\\\\\\,/:; \t\u00E4\u4E2D\0x";
constexpr std::u16string_view separators[] = {u",", u"/", u":", u";", u"\u4E2D", u"a"};

std::string Shown(const std::vector<String>& pieces) {
    std::string shown;
    for (const String& piece : pieces) {
        shown += "[" + qn::dsc::ExactText(piece) + "]";
    }
    return shown;
}

TEST(TextListProperties, WhatIsEscapedUnescapesToItself) {
    ForEachCase(5, [](Random& random) {
        const std::u16string_view separator = random.Of(separators);
        const std::u16string text = random.Text(units, 20);
        const String escaped = EscapeText(String(text), String(separator));
        EXPECT_EQ(UnescapeText(escaped, String(separator)).View(), text) << qn::dsc::ExactText(escaped);
    });
}

// An empty text is a list of nothing, so one empty piece alone is left out.
TEST(TextListProperties, JoinedPiecesSplitIntoThemselves) {
    ForEachCase(6, [](Random& random) {
        const std::u16string_view separator = random.Of(separators);
        std::vector<String> pieces(random.Below(6));
        for (String& piece : pieces) {
            piece = String(random.Text(units, 8));
        }
        if (pieces.size() == 1 && pieces[0].IsEmpty()) {
            pieces[0] = String(u"x");
        }
        const String joined = JoinAll(pieces, String(separator), true);
        std::vector<String> split;
        SplitList(joined, String(separator), split, false);
        EXPECT_EQ(Shown(split), Shown(pieces)) << qn::dsc::ExactText(joined);
    });
}

TEST(TextListProperties, PiecesOfAnyTextComeBackOnceTheyAreJoined) {
    ForEachCase(7, [](Random& random) {
        const std::u16string_view separator = random.Of(separators);
        std::vector<String> pieces;
        SplitList(String(random.Text(units, 20)), String(separator), pieces, random.OneIn(2));
        if (pieces.size() == 1 && pieces[0].IsEmpty()) {
            return;
        }
        std::vector<String> split;
        SplitList(JoinAll(pieces, String(separator), true), String(separator), split, false);
        EXPECT_EQ(Shown(split), Shown(pieces));
    });
}

}  // namespace
}  // namespace zkhw
