#include <gtest/gtest.h>

#include "interfaces/support/NodeViewTest.h"

namespace zkhw {
namespace {

// Root: a: { b: { Speed=40, "/": {} }, L -> b }, "x/y": { "c\d": {} }, Dangling -> nowhere.
class FindNode : public NodeViewTest {
  protected:
    FindNode() {
        ResTreeNode* const b = AddChild(*a, u"b");
        AddText(*b, u"Speed", u"40");
        AddChild(*b, u"/");
        AddLink(*a, u"L", u"b");
        AddChild(*AddChild(*root, u"x/y"), u"c\\d");
        AddLink(*root, u"Dangling", u"nowhere");
    }

    // "S_FALSE /a/b consumed 5 crossed 0"
    static std::string Walk(const NodeView& view, const char16_t* path) {
        ULONG consumed = untouchedNumber;
        BOOL crossed = -1;
        const std::string node = GivenNode(
            [&](IzkhwResourceTreeNode** found) { return view->FindNode(In(path), &consumed, &crossed, found); });
        return node + " consumed " + std::to_string(consumed) + " crossed " + std::to_string(crossed);
    }
    std::string Walk(const char16_t* path) { return Walk(Root(), path); }

    // Without the optional arguments.
    static std::string Find(const NodeView& view, const char16_t* path) {
        return GivenNode(
            [&](IzkhwResourceTreeNode** found) { return view->FindNode(In(path), nullptr, nullptr, found); });
    }
    std::string Find(const char16_t* path) { return Find(Root(), path); }

    ResTreeNode* a = AddChild(*root, u"a");
};

TEST_F(FindNode, RefusesANullNodeAndTouchesNothing) {
    ULONG consumed = untouchedNumber;
    BOOL crossed = -1;
    EXPECT_EQ(Root()->FindNode(In(u"a"), &consumed, &crossed, nullptr), E_POINTER);
    EXPECT_EQ(consumed, untouchedNumber);
    EXPECT_EQ(crossed, -1);
}

TEST_F(FindNode, OfTheEmptyPathFindsNothing) {
    EXPECT_EQ(Walk(u""), "S_FALSE null consumed 0 crossed 0");
    EXPECT_EQ(Find(u""), "S_FALSE null");
    const NodeView view = Root();
    EXPECT_EQ(
        GivenNode([&](IzkhwResourceTreeNode** found) { return view->FindNode(nullptr, nullptr, nullptr, found); }),
        "S_FALSE null");
}

TEST_F(FindNode, OfASlashFindsThisVeryNode) {
    EXPECT_EQ(Walk(u"/"), "S_OK / consumed 1 crossed 0");
    EXPECT_EQ(Find(View(*a), u"/"), "S_OK /a");
    EXPECT_EQ(Walk(View(*a), u"/"), "S_OK /a consumed 1 crossed 0");
}

TEST_F(FindNode, FollowsNamesBlindToLetterCase) {
    EXPECT_EQ(Find(u"A/B"), "S_OK /a/b");
    EXPECT_EQ(Walk(u"a/b"), "S_OK /a/b consumed 3 crossed 0");
    EXPECT_EQ(Walk(u"/a/b"), "S_OK /a/b consumed 4 crossed 0");
}

TEST_F(FindNode, StartsAtItsOwnNodeAlsoWithALeadingSlash) {
    EXPECT_EQ(Find(View(*a), u"/b"), "S_OK /a/b");
    EXPECT_EQ(Find(View(*a), u"b"), "S_OK /a/b");
    EXPECT_EQ(Find(View(*a), u"/a"), "S_FALSE null");
}

TEST_F(FindNode, WithoutConsumedGivesNothingIfTheWayEndsEarly) {
    EXPECT_EQ(Find(u"a/x"), "S_FALSE null");
    EXPECT_EQ(Find(u"x"), "S_FALSE null");
    EXPECT_EQ(Find(u"a/b/Speed"), "S_FALSE null");
}

TEST_F(FindNode, WithConsumedGivesTheLastNodeAndWhereTheRestBegins) {
    EXPECT_EQ(Walk(u"a/b/prop"), "S_FALSE /a/b consumed 4 crossed 0");
    EXPECT_EQ(Walk(u"/a/b/prop"), "S_FALSE /a/b consumed 5 crossed 0");
    EXPECT_EQ(Walk(u"a/b/Speed"), "S_FALSE /a/b consumed 4 crossed 0");
    EXPECT_EQ(Walk(u"a/b/x/y/z"), "S_FALSE /a/b consumed 4 crossed 0");
}

TEST_F(FindNode, WhereNothingMatchesGivesItsOwnNodeAndTheStart) {
    EXPECT_EQ(Walk(u"prop"), "S_FALSE / consumed 0 crossed 0");
    EXPECT_EQ(Walk(u"/prop"), "S_FALSE / consumed 1 crossed 0");
    EXPECT_EQ(Walk(View(*a), u"prop"), "S_FALSE /a consumed 0 crossed 0");
}

TEST_F(FindNode, TakesASlashBehindABackslashIntoTheName) {
    EXPECT_EQ(Walk(u"x\\/y"), "S_OK /x\\/y consumed 4 crossed 0");
    // Four units of the name as it is escaped, and its separator.
    EXPECT_EQ(Walk(u"x\\/y/prop"), "S_FALSE /x\\/y consumed 5 crossed 0");
    EXPECT_EQ(Walk(u"/x\\/y/prop"), "S_FALSE /x\\/y consumed 6 crossed 0");
}

TEST_F(FindNode, CountsEverySlashInsideANameOnceMore) {
    EXPECT_EQ(Walk(u"a/b/\\//prop"), "S_FALSE /a/b/\\/ consumed 7 crossed 0");
}

TEST_F(FindNode, FallsShortByOneForEachEscapedBackslash) {
    EXPECT_EQ(Walk(u"x\\/y/c\\\\d"), "S_OK /x\\/y/c\\\\d consumed 9 crossed 0");
    // The rest begins at 10: five for "x\/y/", five for "c\\d/". One of them is not counted.
    EXPECT_EQ(Walk(u"x\\/y/c\\\\d/prop"), "S_FALSE /x\\/y/c\\\\d consumed 9 crossed 0");
}

TEST_F(FindNode, SplitsBehindAnEvenNumberOfBackslashes) {
    AddChild(*AddChild(*root, u"e\\"), u"f");
    EXPECT_EQ(Walk(u"e\\\\/f"), "S_OK /e\\\\/f consumed 5 crossed 0");
}

TEST_F(FindNode, DoesNotTrimAndKeepsEmptyNames) {
    EXPECT_EQ(Walk(u" a"), "S_FALSE / consumed 0 crossed 0");
    EXPECT_EQ(Walk(u"a/"), "S_FALSE /a consumed 2 crossed 0");
    EXPECT_EQ(Walk(u"//"), "S_FALSE / consumed 1 crossed 0");
    AddChild(*a, u"");
    EXPECT_EQ(Walk(u"a/"), "S_OK /a/ consumed 2 crossed 0");
}

TEST_F(FindNode, KnowsNoDotsAndNoAnchors) {
    EXPECT_EQ(Walk(u"a/.."), "S_FALSE /a consumed 2 crossed 0");
    EXPECT_EQ(Walk(u"."), "S_FALSE / consumed 0 crossed 0");
    EXPECT_EQ(Walk(u"#{document-root}/a"), "S_FALSE / consumed 0 crossed 0");
    AddChild(*a, u"..");
    EXPECT_EQ(Find(u"a/.."), "S_OK /a/..");
}

TEST_F(FindNode, TellsOfALinkOnTheWay) {
    EXPECT_EQ(Walk(u"a/L"), "S_OK /a/b consumed 3 crossed 1");
    EXPECT_EQ(Walk(u"a/L/Speed"), "S_FALSE /a/b consumed 4 crossed 1");
    EXPECT_EQ(Walk(u"a/b"), "S_OK /a/b consumed 3 crossed 0");
}

TEST_F(FindNode, TellsOfALinkAlsoWhereNothingIsFoundBehindIt) {
    BOOL crossed = -1;
    const NodeView view = Root();
    EXPECT_EQ(GivenNode([&](IzkhwResourceTreeNode** found) {
                  return view->FindNode(In(u"a/L/x"), nullptr, &crossed, found);
              }),
              "S_FALSE null");
    EXPECT_EQ(crossed, 1);
}

TEST_F(FindNode, EndsInFrontOfADanglingLink) {
    EXPECT_EQ(Walk(u"Dangling"), "S_FALSE / consumed 0 crossed 0");
    EXPECT_EQ(Walk(u"Dangling/x"), "S_FALSE / consumed 0 crossed 0");
}

TEST_F(FindNode, DoesNotCountALinkWithoutATarget) {
    AddLink(*a, u"Self", u"");
    EXPECT_EQ(Walk(u"a/Self/b"), "S_OK /a/b consumed 8 crossed 0");
}

TEST_F(FindNode, TakesTheFirstOfEqualNamesWhateverItIs) {
    AddText(*root, u"Twice", u"");
    AddChild(*root, u"Twice");
    EXPECT_EQ(Find(u"Twice"), "S_FALSE null");
}

TEST_F(FindNode, GoesRoundThroughLinksAsOftenAsThePathSays) {
    AddLink(*a, u"Up", u"..");
    EXPECT_EQ(Walk(u"a/Up/a/Up/a"), "S_OK /a consumed 11 crossed 1");
}

TEST_F(FindNode, GivesOneReference) {
    IzkhwResourceTreeNode* found = nullptr;
    ASSERT_EQ(Root()->FindNode(In(u"a"), nullptr, nullptr, &found), S_OK);
    EXPECT_EQ(found->Release(), 0U);
}

}  // namespace
}  // namespace zkhw
