#include <gtest/gtest.h>

#include "interfaces/support/NodeViewTest.h"
#include "support/TreeDump.h"

namespace zkhw {
namespace {

using NodeBasics = NodeViewTest;

std::string NameOf(const NodeView& view) {
    return GivenText([&](BSTR* text) { return view->GetName(text); });
}
std::string PathOf(const NodeView& view) {
    return GivenText([&](BSTR* text) { return view->GetPath(text); });
}
std::string DisplayPathOf(const NodeView& view) {
    return GivenText([&](BSTR* text) { return view->GetDisplayPath(text); });
}
std::string TypesOf(const NodeView& view) {
    return GivenTexts([&](ULONG* count, BSTR** types) { return view->GetTypes(count, types); });
}

TEST_F(NodeBasics, GetNameGivesTheName) {
    EXPECT_EQ(NameOf(View(*AddChild(*root, u"Gr\u00F6\u00DFe"))), "S_OK Gr{00F6}{00DF}e");
}

TEST_F(NodeBasics, GetNameOfANamelessNodeIsTheEmptyText) {
    EXPECT_EQ(NameOf(View(*AddChild(*root, u""))), "S_OK ");
}

TEST_F(NodeBasics, TheFourTextsOfANodeRefuseANullPointer) {
    const NodeView view = Root();
    EXPECT_EQ(view->GetName(nullptr), E_POINTER);
    EXPECT_EQ(view->GetPath(nullptr), E_POINTER);
    EXPECT_EQ(view->GetDisplayPath(nullptr), E_POINTER);
    EXPECT_EQ(view->GetType(nullptr), E_POINTER);
}

TEST_F(NodeBasics, GetPathOfTheRootIsASlash) {
    EXPECT_EQ(PathOf(Root()), "S_OK /");
    EXPECT_EQ(DisplayPathOf(Root()), "S_OK /");
}

TEST_F(NodeBasics, GetPathEscapesSlashesAndBackslashes) {
    ResTreeNode* const child = AddChild(*AddChild(*root, u"a/b"), u"c\\d");
    EXPECT_EQ(PathOf(View(*child)), "S_OK /a\\/b/c\\\\d");
}

TEST_F(NodeBasics, GetDisplayPathTakesDisplayNamesAndLeavesOutEmptyOnes) {
    ResTreeNode* const a = AddChild(*root, u"a");
    ResTreeNode* const b = AddChild(*a, u"b");
    ResTreeNode* const c = AddChild(*b, u"c");
    AddText(*a, u"DisplayName", u"A/1");
    AddText(*b, u"DisplayName", u"");
    EXPECT_EQ(DisplayPathOf(View(*a)), "S_OK /A\\/1");
    EXPECT_EQ(DisplayPathOf(View(*b)), "S_OK /A\\/1");
    EXPECT_EQ(DisplayPathOf(View(*c)), "S_OK /A\\/1/c");
}

TEST_F(NodeBasics, GetDisplayPathOfALocalisedNameEndsAtItsNul) {
    ResTreeNode* const a = AddChild(*root, u"a");
    a->AddTextEntry(u"DisplayName", std::u16string_view(u"Shown\0eng=Shown", 15), LocalizedTextEntry);
    EXPECT_EQ(DisplayPathOf(View(*a)), "S_OK /Shown");
}

TEST_F(NodeBasics, SetNameRenamesTheNodeAndItsEntry) {
    ResTreeNode* const child = AddChild(*root, u"Old");
    EXPECT_EQ(View(*child)->SetName(In(u"New")), S_OK);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  New:T\n");
}

TEST_F(NodeBasics, SetNameOfARootNeedsNoParent) {
    EXPECT_EQ(Root()->SetName(In(u"New")), S_OK);
    EXPECT_EQ(DumpTree(*root), "New:Root ordered\n");
}

TEST_F(NodeBasics, SetNameRefusesNull) {
    EXPECT_EQ(Root()->SetName(nullptr), E_POINTER);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n");
}

TEST_F(NodeBasics, SetNameToTheNameOfASiblingLosesTheEntryInAnUnorderedParent) {
    const auto parent = MakeRootNode(false);
    ResTreeNode* const a = AddChild(*parent, u"a");
    AddChild(*parent, u"b");
    NodeView view = View(*a);
    EXPECT_EQ(view->SetName(In(u"B")), S_FALSE);
    EXPECT_EQ(DumpTree(*parent), "Root:Root\n  b:T\n");
    EXPECT_EQ(NameOf(view), "S_OK a");
}

TEST_F(NodeBasics, SetNameToTheNameOfASiblingIsAllowedInAnOrderedParent) {
    ResTreeNode* const a = AddChild(*root, u"a");
    AddChild(*root, u"b");
    EXPECT_EQ(View(*a)->SetName(In(u"b")), S_OK);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  b:T\n  b:T\n");
}

TEST_F(NodeBasics, SetNameToAnotherLetterCaseSucceeds) {
    const auto parent = MakeRootNode(false);
    EXPECT_EQ(View(*AddChild(*parent, u"abc"))->SetName(In(u"ABC")), S_OK);
    EXPECT_EQ(DumpTree(*parent), "Root:Root\n  ABC:T\n");
}

TEST_F(NodeBasics, GetTypeGivesTheType) {
    const NodeView view = View(*AddChild(*root, u"a", u"Module"));
    EXPECT_EQ(GivenText([&](BSTR* text) { return view->GetType(text); }), "S_OK Module");
}

// "Module" is based on "Resource" and "ResourceList", which have no bases.
TEST_F(NodeBasics, GetTypesGivesTypeBasesAndProtocolsWithRepetitions) {
    ResTreeNode* const child = AddChild(*root, u"a", u"Module");
    AddText(*child, u"Protocols", u" P ,Module,,Q");
    EXPECT_EQ(TypesOf(View(*child)), "S_OK [Module, Resource, ResourceList, P, Module, , Q]");
}

TEST_F(NodeBasics, GetTypesOfAnUnknownTypeIsThatAlone) {
    EXPECT_EQ(TypesOf(View(*AddChild(*root, u"a", u"X"))), "S_OK [X]");
}

TEST_F(NodeBasics, GetTypesRefusesNullPointers) {
    const NodeView view = Root();
    ULONG count = untouchedNumber;
    auto* array = Untouched<BSTR*>();
    EXPECT_EQ(view->GetTypes(nullptr, &array), E_POINTER);
    EXPECT_EQ(view->GetTypes(&count, nullptr), E_POINTER);
}

TEST_F(NodeBasics, IsOfTypeKnowsTypeBasesAndProtocols) {
    ResTreeNode* const child = AddChild(*root, u"a", u"Module");
    AddText(*child, u"Protocols", u"Foobar,Foo");
    const NodeView view = View(*child);
    for (const char16_t* const yes : {u"", u"module", u"RESOURCE", u"ResourceList", u"Foo", u"Foobar"}) {
        EXPECT_EQ(view->IsOfType(In(yes)), S_OK);
    }
    EXPECT_EQ(view->IsOfType(nullptr), S_OK);
    for (const char16_t* const no : {u"IOResource", u"foo", u"Foob", u"Foobar,Fo", u" "}) {
        EXPECT_EQ(view->IsOfType(In(no)), S_FALSE);
    }
}

TEST_F(NodeBasics, OnlyTheRootHasNoParent) {
    ResTreeNode* const child = AddChild(*root, u"a");
    EXPECT_EQ(Root()->HasParent(), S_FALSE);
    EXPECT_EQ(View(*child)->HasParent(), S_OK);
}

TEST_F(NodeBasics, GetParentGivesTheParent) {
    const NodeView view = View(*AddChild(*AddChild(*root, u"a"), u"b"));
    EXPECT_EQ(GivenNode([&](IzkhwResourceTreeNode** node) { return view->GetParent(node); }), "S_OK /a");
}

TEST_F(NodeBasics, GetParentOfTheRootIsNull) {
    const NodeView view = Root();
    EXPECT_EQ(GivenNode([&](IzkhwResourceTreeNode** node) { return view->GetParent(node); }), "S_OK null");
}

TEST_F(NodeBasics, GetParentRefusesNull) {
    EXPECT_EQ(Root()->GetParent(nullptr), E_POINTER);
    EXPECT_EQ(View(*AddChild(*root, u"a"))->GetParent(nullptr), E_POINTER);
}

TEST_F(NodeBasics, ANodeThatIsGivenHasOneReference) {
    const NodeView view = View(*AddChild(*root, u"a"));
    IzkhwResourceTreeNode* parent = nullptr;
    ASSERT_EQ(view->GetParent(&parent), S_OK);
    EXPECT_EQ(parent->Release(), 0U);
}

}  // namespace
}  // namespace zkhw
