#include "restree/NodePath.h"

#include <string>

#include <gtest/gtest.h>

namespace {

using qn::dsc::String;
using qn::dsc::TextArgument;

// The exact units, since Strings compare blind to letter case.
std::u16string Units(const String& text) {
    return std::u16string(text.View());
}

std::u16string Joined(TextArgument parentPath, TextArgument name) {
    return Units(zkhw::JoinEscapedPath(parentPath, name));
}

std::u16string Displayed(TextArgument parentPath, TextArgument name, const char16_t* displayName) {
    const auto shown = displayName == nullptr ? std::nullopt : std::optional<std::u16string_view>(displayName);
    return Units(zkhw::JoinDisplayPath(parentPath, name, shown));
}

std::u16string Relative(TextArgument target, TextArgument base) {
    return Units(zkhw::MakeRelativeNodePath(target, base));
}

std::u16string Rebased(TextArgument list, TextArgument base) {
    return Units(zkhw::RebaseListPaths(list, base));
}

TEST(JoinEscapedPath, ChildOfTheRootHasOneSlash) {
    EXPECT_EQ(Joined(u"/", u"a"), u"/a");
}

TEST(JoinEscapedPath, OtherChildIsPutBehindASlash) {
    EXPECT_EQ(Joined(u"/a", u"b"), u"/a/b");
    EXPECT_EQ(Joined(u"", u"b"), u"/b");
    EXPECT_EQ(Joined(u"..", u"b"), u"../b");
}

TEST(JoinEscapedPath, NameIsEscaped) {
    EXPECT_EQ(Joined(u"/", u"a/b"), u"/a\\/b");
    EXPECT_EQ(Joined(u"/x", u"a\\b/"), u"/x/a\\\\b\\/");
}

TEST(JoinEscapedPath, ParentStaysAsItIs) {
    EXPECT_EQ(Joined(u"/a\\/b", u"c"), u"/a\\/b/c");
}

TEST(JoinEscapedPath, EmptyNameLeavesTheSlash) {
    EXPECT_EQ(Joined(u"/", u""), u"/");
    EXPECT_EQ(Joined(u"/a", u""), u"/a/");
}

TEST(JoinDisplayPath, DisplayNameStandsForTheName) {
    EXPECT_EQ(Displayed(u"/", u"a", u"Display A"), u"/Display A");
    EXPECT_EQ(Displayed(u"/x", u"a", u"A/B"), u"/x/A\\/B");
}

TEST(JoinDisplayPath, WithoutOneTheNameStands) {
    EXPECT_EQ(Displayed(u"/", u"a", nullptr), u"/a");
    EXPECT_EQ(Displayed(u"/x", u"a/b", nullptr), u"/x/a\\/b");
}

TEST(JoinDisplayPath, EmptyDisplayNameLeavesNoTrace) {
    EXPECT_EQ(Displayed(u"/x", u"a", u""), u"/x");
    EXPECT_EQ(Displayed(u"/", u"a", u""), u"/");
}

TEST(MakeRelativeNodePath, ClimbsToTheCommonPartAndDescends) {
    EXPECT_EQ(Relative(u"/a/b/c", u"/a/d"), u"../b/c");
    EXPECT_EQ(Relative(u"/a/b", u"/c/d"), u"../../a/b");
}

TEST(MakeRelativeNodePath, DescendsFromAnAncestor) {
    EXPECT_EQ(Relative(u"/a/b", u"/a"), u"b");
    EXPECT_EQ(Relative(u"/a/b/c/d", u"/a"), u"b/c/d");
}

TEST(MakeRelativeNodePath, ClimbsToAnAncestor) {
    EXPECT_EQ(Relative(u"/a", u"/a/b"), u"..");
    EXPECT_EQ(Relative(u"/a", u"/a/b/c/d"), u"../../..");
}

TEST(MakeRelativeNodePath, EqualPathsGiveTheEmptyText) {
    EXPECT_EQ(Relative(u"/a/b", u"/a/b"), u"");
    EXPECT_EQ(Relative(u"/", u"/"), u"");
    EXPECT_EQ(Relative(u"", u""), u"");
}

TEST(MakeRelativeNodePath, ComponentsCompareBlindToCase) {
    EXPECT_EQ(Relative(u"/A/b", u"/a/D"), u"../b");
    EXPECT_EQ(Relative(u"/A/B", u"/a/b"), u"");
}

TEST(MakeRelativeNodePath, ComponentsCompareWithoutTheirEscapes) {
    EXPECT_EQ(Relative(u"/a\\/b/c", u"/a\\/b"), u"c");
    EXPECT_EQ(Relative(u"/a\\\\b/c", u"/a\\b/d"), u"../c");
    EXPECT_EQ(Relative(u"/a\\/b", u"/a/b"), u"../../a\\/b");
}

TEST(MakeRelativeNodePath, FirstComponentLosesItsEscapesWithoutAClimb) {
    EXPECT_EQ(Relative(u"/a/b\\/c", u"/a"), u"b/c");
    EXPECT_EQ(Relative(u"/a/b\\/c/d\\/e", u"/a"), u"b/c/d\\/e");
}

TEST(MakeRelativeNodePath, ComponentsBehindAreEscapedAnew) {
    EXPECT_EQ(Relative(u"/a/b\\/c\\\\", u"/d"), u"../a/b\\/c\\\\");
    EXPECT_EQ(Relative(u"/a\\x", u"/d"), u"../a\\\\x");
}

TEST(MakeRelativeNodePath, RootHasAnEmptyLastComponent) {
    EXPECT_EQ(Relative(u"/a", u"/"), u"../a");
    EXPECT_EQ(Relative(u"/", u"/a"), u"../");
}

TEST(MakeRelativeNodePath, EmptyPathsHaveNoComponents) {
    EXPECT_EQ(Relative(u"a/b", u""), u"a/b");
    EXPECT_EQ(Relative(u"", u"a/b"), u"../..");
}

TEST(MakeRelativeNodePath, EmptyComponentsCount) {
    EXPECT_EQ(Relative(u"/a//b", u"/a"), u"/b");
    EXPECT_EQ(Relative(u"/a//b", u"/a/"), u"b");
    EXPECT_EQ(Relative(u"/a/", u"/a"), u"");
    EXPECT_EQ(Relative(u"/a", u"/a/"), u"..");
    EXPECT_EQ(Relative(u"/a//", u"/b"), u"../a//");
    EXPECT_EQ(Relative(u"a", u"/a"), u"../../a");
}

TEST(MakeRelativeNodePath, BlanksBelongToComponents) {
    EXPECT_EQ(Relative(u"/a/b", u"/a /c"), u"../../a/b");
    EXPECT_EQ(Relative(u"/a /b", u"/a/c"), u"../../a /b");
    EXPECT_EQ(Relative(u"/ a", u"/a"), u"../ a");
}

TEST(MakeRelativeNodePath, BackslashInTheSharedPartOrTheBaseLeavesTheRestAlone) {
    EXPECT_EQ(Relative(u"/a\\/b/c/d", u"/a\\/b/e"), u"../c/d");
    EXPECT_EQ(Relative(u"/a/b", u"/c\\/d/e"), u"../../a/b");
    EXPECT_EQ(Relative(u"/a/b", u"/c\\d"), u"../a/b");
}

TEST(MakeRelativeNodePath, BackslashFarBehindIsEscapedAnew) {
    EXPECT_EQ(Relative(u"/a/b/c/d/e/f/g\\h", u"/z"), u"../a/b/c/d/e/f/g\\\\h");
    EXPECT_EQ(Relative(u"/z/b/c/d/e/f/g\\h", u"/z"), u"b/c/d/e/f/g\\\\h");
    EXPECT_EQ(Relative(u"/a\\", u"/z"), u"../a\\\\");
}

TEST(MakeRelativeNodePath, ComponentsOutsideAsciiCompareByTheLanguage) {
    EXPECT_EQ(Relative(u"/\u00c9/b", u"/\u00e9/c"), u"../b");
    EXPECT_EQ(Relative(u"/a\u00ad/b", u"/a"), u"b");
}

// Windows has an order of its own outside printable ASCII: docs/platforms.md lists where it differs.
TEST(MakeRelativeNodePath, WidthOfAComponentDoesNotCountAsOnlyLinuxOrdersSo) {
    EXPECT_EQ(Relative(u"/\uff21/b", u"/a"), u"b");
}

TEST(MakeRelativeNodePath, HundredThousandLevelsTakeLinearTime) {
    std::u16string base;
    std::u16string target;
    std::u16string expected;
    for (int i = 0; i < 100000; ++i) {
        base += u"/b";
        target += u"/t";
        expected += u"../";
    }
    EXPECT_TRUE(Relative(target.c_str(), base.c_str()) == expected + target.substr(1));
    EXPECT_EQ(Relative((base + u"/x").c_str(), base.c_str()), u"x");
}

TEST(RebaseListPaths, MakesAbsolutePathsRelative) {
    EXPECT_EQ(Rebased(u"/a/b,/a/c/d", u"/a/c"), u"../b,d");
}

TEST(RebaseListPaths, OtherPathsStay) {
    EXPECT_EQ(Rebased(u"x/y, ../z ,/a/b", u"/a"), u"x/y,../z,b");
}

TEST(RebaseListPaths, PiecesAreTrimmed) {
    EXPECT_EQ(Rebased(u" /a/b ,\n\t/a/c", u"/a"), u"b,c");
}

TEST(RebaseListPaths, EmptyListStaysEmpty) {
    EXPECT_EQ(Rebased(u"", u"/a"), u"");
}

TEST(RebaseListPaths, EmptyPiecesStay) {
    EXPECT_EQ(Rebased(u"x,, ", u"/a"), u"x,,");
}

TEST(RebaseListPaths, PiecesAreEscapedForTheList) {
    EXPECT_EQ(Rebased(u"a\\,b", u"/"), u"a\\,b");
    // The backslash that escapes the "/" is itself escaped as part of a piece.
    EXPECT_EQ(Rebased(u"/x/a\\/b", u"/y"), u"../x/a\\\\/b");
}

TEST(RebaseListPaths, BackslashAnywhereEscapesEachPieceAnew) {
    EXPECT_EQ(Rebased(u"\\, /a/b ,/c", u"/a"), u"\\, /a/b,../c");
    EXPECT_EQ(Rebased(u"x\\y,/a/b", u"/a"), u"x\\\\y,b");
    EXPECT_EQ(Rebased(u"/a/b,\\", u"/a"), u"b,\\\\");
}

TEST(RebaseListPaths, BackslashInTheBaseIsNoneOfTheList) {
    EXPECT_EQ(Rebased(u"/a/b,/x/c", u"/x\\/y/z"), u"../../a/b,../../x/c");
    EXPECT_EQ(Rebased(u"/a/b", u"/x\\,y"), u"../a/b");
}

TEST(RebaseListPaths, BlankPiecesAreEmpty) {
    EXPECT_EQ(Rebased(u" ", u"/a"), u"");
    EXPECT_EQ(Rebased(u" , ", u"/a"), u",");
    EXPECT_EQ(Rebased(u",", u"/a"), u",");
}

TEST(RebaseListPaths, SlashAloneIsTheRoot) {
    EXPECT_EQ(Rebased(u"/", u"/a/b"), u"../../");
    EXPECT_EQ(Rebased(u"/,x", u"/"), u",x");
    EXPECT_EQ(Rebased(u"//", u"/a"), u"..//");
}

TEST(RebaseListPaths, ListsMayBeLong) {
    std::u16string list;
    std::u16string expected;
    for (int i = 0; i < 500; ++i) {
        list += list.empty() ? u"/board/bank" : u" , /board/bank";
        expected += expected.empty() ? u"../bank" : u",../bank";
    }
    EXPECT_TRUE(Rebased(std::u16string_view(list), u"/board/x") == expected);
}

TEST(RebaseListPaths, PathOfTheNodeItselfBecomesEmpty) {
    EXPECT_EQ(Rebased(u"/a/b,x", u"/a/b"), u",x");
}

}  // namespace
