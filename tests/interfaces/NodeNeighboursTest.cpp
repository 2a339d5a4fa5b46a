#include <gtest/gtest.h>

#include "interfaces/support/NodeViewTest.h"

namespace zkhw {
namespace {

class NodeNeighbours : public NodeViewTest {
  protected:
    static std::string Children(const NodeView& view) {
        return GivenNodes(
            [&](ULONG* count, IzkhwResourceTreeNode*** nodes) { return view->GetChildren(count, nodes); });
    }
    static std::string ChildrenOfType(const NodeView& view, const char16_t* type) {
        return GivenNodes([&](ULONG* count, IzkhwResourceTreeNode*** nodes) {
            return view->GetChildrenOfType(In(type), count, nodes);
        });
    }
    static std::string Descendants(const NodeView& view, const char16_t* type) {
        return GivenNodes([&](ULONG* count, IzkhwResourceTreeNode*** nodes) {
            return view->GetDescendantsOfType(In(type), count, nodes);
        });
    }
};

TEST_F(NodeNeighbours, ANodeWithTextsAloneHasNoChildren) {
    AddText(*root, u"Text", u"");
    EXPECT_EQ(Root()->HasChildren(), S_FALSE);
    EXPECT_EQ(Children(Root()), "S_OK []");
}

TEST_F(NodeNeighbours, ADanglingLinkIsNoChild) {
    AddLink(*root, u"Link", u"nowhere");
    EXPECT_EQ(Root()->HasChildren(), S_FALSE);
    EXPECT_EQ(Children(Root()), "S_OK []");
}

TEST_F(NodeNeighbours, ALinkThatLeadsSomewhereIsAChild) {
    ResTreeNode* const a = AddChild(*root, u"A");
    AddLink(*a, u"Up", u"..");
    EXPECT_EQ(View(*a)->HasChildren(), S_OK);
    EXPECT_EQ(Children(View(*a)), "S_OK [/]");
}

TEST_F(NodeNeighbours, ChildrenStandInTheOrderOfTheEntriesWithLinksResolved) {
    AddChild(*root, u"C");
    AddLink(*root, u"L", u"A/Deep");
    AddText(*root, u"Text", u"");
    AddLink(*root, u"Nowhere", u"X");
    AddChild(*AddChild(*root, u"A"), u"Deep");
    AddLink(*root, u"Again", u"C");
    EXPECT_EQ(Root()->HasChildren(), S_OK);
    EXPECT_EQ(Children(Root()), "S_OK [/C, /A/Deep, /A, /C]");
}

TEST_F(NodeNeighbours, ChildrenOfAnUnorderedNodeFollowTheirKeys) {
    ResTreeNode* const a = AddChild(*root, u"A");
    AddChild(*a, u"c");
    AddChild(*a, u"B");
    AddLink(*a, u"a", u"c");
    EXPECT_EQ(Children(View(*a)), "S_OK [/A/c, /A/B, /A/c]");
}

TEST_F(NodeNeighbours, ChildrenOfATypeAreThoseThatSupportIt) {
    AddChild(*root, u"M", u"Module");
    AddChild(*root, u"T1");
    AddText(*AddChild(*root, u"P"), u"Protocols", u"Resource");
    AddLink(*root, u"L", u"M");
    EXPECT_EQ(ChildrenOfType(Root(), u"resource"), "S_OK [/M, /M]");
    EXPECT_EQ(ChildrenOfType(Root(), u"Resource"), "S_OK [/M, /P, /M]");
    EXPECT_EQ(ChildrenOfType(Root(), u"X"), "S_OK []");
    EXPECT_EQ(ChildrenOfType(Root(), u""), "S_OK [/M, /T1, /P, /M]");
}

TEST_F(NodeNeighbours, EveryChildThatIsGivenHasOneReference) {
    AddChild(*root, u"A");
    AddChild(*root, u"B");
    ULONG count = 0;
    IzkhwResourceTreeNode** nodes = nullptr;
    ASSERT_EQ(Root()->GetChildren(&count, &nodes), S_OK);
    ASSERT_EQ(count, 2U);
    EXPECT_EQ(nodes[0]->Release(), 0U);
    EXPECT_EQ(nodes[1]->Release(), 0U);
    CoTaskMemFree(nodes);
}

TEST_F(NodeNeighbours, NodeArraysRefuseNullPointers) {
    const NodeView view = Root();
    ULONG count = untouchedNumber;
    auto* nodes = Untouched<IzkhwResourceTreeNode**>();
    EXPECT_EQ(view->GetChildren(nullptr, &nodes), E_POINTER);
    EXPECT_EQ(view->GetChildren(&count, nullptr), E_POINTER);
    EXPECT_EQ(view->GetChildrenOfType(In(u""), nullptr, &nodes), E_POINTER);
    EXPECT_EQ(view->GetChildrenOfType(In(u""), &count, nullptr), E_POINTER);
    EXPECT_EQ(view->GetDescendantsOfType(In(u""), nullptr, &nodes), E_POINTER);
    EXPECT_EQ(view->GetDescendantsOfType(In(u""), &count, nullptr), E_POINTER);
}

// Root: A(T): { X(U): { Y(T) } }, B(U).
class NodeDescendants : public NodeNeighbours {
  protected:
    ResTreeNode* a = AddChild(*root, u"A");
    ResTreeNode* x = AddChild(*a, u"X", u"U");
    ResTreeNode* y = AddChild(*x, u"Y");
    ResTreeNode* b = AddChild(*root, u"B", u"U");
};

TEST_F(NodeDescendants, StandWithAParentBeforeItsChildren) {
    EXPECT_EQ(Descendants(Root(), u""), "S_OK [/A, /A/X, /A/X/Y, /B]");
    const NodeView view = Root();
    EXPECT_EQ(GivenNodes([&](ULONG* count, IzkhwResourceTreeNode*** nodes) {
                  return view->GetDescendantsOfType(nullptr, count, nodes);
              }),
              "S_OK [/A, /A/X, /A/X/Y, /B]");
}

TEST_F(NodeDescendants, AreLookedForBelowANodeOfAnotherTypeToo) {
    EXPECT_EQ(Descendants(Root(), u"T"), "S_OK [/A, /A/X/Y]");
    EXPECT_EQ(Descendants(Root(), u"U"), "S_OK [/A/X, /B]");
}

TEST_F(NodeDescendants, OfALeafAreNone) {
    EXPECT_EQ(Descendants(View(*b), u""), "S_OK []");
}

TEST_F(NodeDescendants, AreFoundBehindLinksAgain) {
    AddLink(*b, u"L", u"../A");
    EXPECT_EQ(Descendants(Root(), u"T"), "S_OK [/A, /A/X/Y, /A, /A/X/Y]");
}

TEST_F(NodeDescendants, DoNotRunRoundACircleOfLinks) {
    AddLink(*y, u"Up", u"..");
    AddLink(*y, u"Self", u"");
    AddLink(*y, u"Top", u"/");
    EXPECT_EQ(Descendants(Root(), u""), "S_OK [/A, /A/X, /A/X/Y, /B]");
    // From X on, the root is not on the way yet, and X is on it when it is met below the root.
    EXPECT_EQ(Descendants(View(*x), u""), "S_OK [/A/X/Y, /, /A, /B]");
}

TEST_F(NodeDescendants, PassOverLinksThatLeadToEachOther) {
    AddLink(*b, u"P", u"Q");
    AddLink(*b, u"Q", u"P");
    EXPECT_EQ(Descendants(View(*b), u""), "S_OK []");
    EXPECT_EQ(View(*b)->HasChildren(), S_FALSE);
}

}  // namespace
}  // namespace zkhw
