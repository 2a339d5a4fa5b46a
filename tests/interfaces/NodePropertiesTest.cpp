#include <gtest/gtest.h>

#include "interfaces/support/NodeViewTest.h"
#include "support/TreeDump.h"

namespace zkhw {
namespace {

// Localised text in front, then a child, a plain text, a link and a last plain text.
class NodeProperties : public NodeViewTest {
  protected:
    NodeProperties() {
        root->AddTextEntry(u"Label", std::u16string_view(u"Clock\0eng=Clock", 15), LocalizedTextEntry);
        AddChild(*root, u"Child");
        AddText(*root, u"Speed", u"40");
        AddLink(*root, u"Link", u"Child");
        AddText(*root, u"Last", u"");
        view = Root();
    }

    std::string Get(const char16_t* name) {
        return GivenText([&](BSTR* text) { return view->GetProperty(In(name), text); });
    }
    std::string GetAt(ULONG index) {
        return GivenText([&](BSTR* text) { return view->GetPropertyAt(index, text); });
    }
    std::string Names() {
        return GivenTexts([&](ULONG* count, BSTR** names) { return view->GetPropertyNames(count, names); });
    }

    static constexpr const char* initialTree =
        "Root:Root ordered\n"
        "  Label~Clock{0000}eng=Clock\n"
        "  Child:T\n"
        "  Speed=40\n"
        "  Link->Child\n"
        "  Last=\n";

    NodeView view;
};

TEST_F(NodeProperties, GetPropertyGivesAPlainValueBlindToLetterCase) {
    EXPECT_EQ(Get(u"SPEED"), "S_OK 40");
}

TEST_F(NodeProperties, GetPropertyGivesAnEmptyValue) {
    EXPECT_EQ(Get(u"Last"), "S_OK ");
}

TEST_F(NodeProperties, GetPropertyGivesALocalisedValueUpToItsNul) {
    EXPECT_EQ(Get(u"Label"), "S_OK Clock");
}

TEST_F(NodeProperties, GetPropertyOfWhatIsNoTextLeavesTheOutPointer) {
    EXPECT_EQ(Get(u"Missing"), "S_FALSE untouched");
    EXPECT_EQ(Get(u"Child"), "S_FALSE untouched");
    EXPECT_EQ(Get(u"Link"), "S_FALSE untouched");
    EXPECT_EQ(Get(u""), "S_FALSE untouched");
}

TEST_F(NodeProperties, ANullNameIsTheEmptyName) {
    AddText(*root, u"", u"nameless");
    EXPECT_EQ(GivenText([&](BSTR* text) { return view->GetProperty(nullptr, text); }), "S_OK nameless");
    EXPECT_EQ(view->IsLocalizedProperty(nullptr), S_FALSE);
}

TEST_F(NodeProperties, TheFirstOfEqualKeysCounts) {
    AddText(*root, u"speed", u"50");
    EXPECT_EQ(Get(u"Speed"), "S_OK 40");
    EXPECT_EQ(view->SetProperty(In(u"Speed"), In(u"60")), S_OK);
    EXPECT_EQ(Get(u"speed"), "S_OK 60");
    EXPECT_EQ(GetAt(3), "S_OK 50");
}

TEST_F(NodeProperties, GetPropertyAtCountsPlainAndLocalisedTexts) {
    EXPECT_EQ(GetAt(0), "S_OK Clock");
    EXPECT_EQ(GetAt(1), "S_OK 40");
    EXPECT_EQ(GetAt(2), "S_OK ");
}

TEST_F(NodeProperties, GetPropertyAtPastTheLastLeavesTheOutPointer) {
    EXPECT_EQ(GetAt(3), "S_FALSE untouched");
    EXPECT_EQ(GetAt(0xFFFFFFFF), "S_FALSE untouched");
}

TEST_F(NodeProperties, SetPropertyAtCountsPlainTextsOnly) {
    EXPECT_EQ(view->SetPropertyAt(0, In(u"41")), S_OK);
    EXPECT_EQ(GetAt(0), "S_OK Clock");
    EXPECT_EQ(GetAt(1), "S_OK 41");
    EXPECT_EQ(view->SetPropertyAt(1, In(u"end")), S_OK);
    EXPECT_EQ(GetAt(2), "S_OK end");
}

TEST_F(NodeProperties, SetPropertyAtPastTheLastPlainTextChangesNothing) {
    EXPECT_EQ(view->SetPropertyAt(2, In(u"x")), S_FALSE);
    EXPECT_EQ(view->SetPropertyAt(0xFFFFFFFF, In(u"x")), S_FALSE);
    EXPECT_EQ(DumpTree(*root), initialTree);
}

TEST_F(NodeProperties, SetPropertyAtWithoutATextAssignsTheEmptyOne) {
    EXPECT_EQ(view->SetPropertyAt(0, nullptr), S_OK);
    EXPECT_EQ(GetAt(1), "S_OK ");
}

TEST_F(NodeProperties, TheIndexFollowsTheKeysInAnUnorderedNode) {
    ResTreeNode* const node = AddChild(*root, u"Unordered");
    AddText(*node, u"b", u"2");
    AddText(*node, u"C", u"3", LocalizedTextEntry);
    AddText(*node, u"a", u"1");
    view = View(*node);
    EXPECT_EQ(GetAt(0) + GetAt(1) + GetAt(2), "S_OK 1S_OK 2S_OK 3");
    EXPECT_EQ(Names(), "S_OK [a, b, C]");
}

TEST_F(NodeProperties, SetPropertyAssignsWhatIsThere) {
    EXPECT_EQ(view->SetProperty(In(u"speed"), In(u"50")), S_OK);
    EXPECT_EQ(Get(u"Speed"), "S_OK 50");
    EXPECT_EQ(Names(), "S_OK [Label, Speed, Last]");
}

TEST_F(NodeProperties, SetPropertyKeepsALocalisedTextLocalised) {
    EXPECT_EQ(view->SetProperty(In(u"Label"), In(u"Plain")), S_OK);
    EXPECT_EQ(Get(u"Label"), "S_OK Plain");
    EXPECT_EQ(view->IsLocalizedProperty(In(u"Label")), S_OK);
}

TEST_F(NodeProperties, SetPropertyAppendsAPlainTextIfThereIsNone) {
    EXPECT_EQ(view->SetProperty(In(u"New"), In(u"v")), S_OK);
    EXPECT_EQ(DumpTree(*root), std::string(initialTree) + "  New=v\n");
}

TEST_F(NodeProperties, SetPropertyOnAChildOrALinkChangesNothingAndSaysOk) {
    EXPECT_EQ(view->SetProperty(In(u"Child"), In(u"v")), S_OK);
    EXPECT_EQ(view->SetProperty(In(u"Link"), In(u"v")), S_OK);
    EXPECT_EQ(DumpTree(*root), initialTree);
}

TEST_F(NodeProperties, SetPropertyWithoutAValueAssignsTheEmptyText) {
    EXPECT_EQ(view->SetProperty(In(u"Speed"), nullptr), S_OK);
    EXPECT_EQ(Get(u"Speed"), "S_OK ");
}

TEST_F(NodeProperties, GetPropertyNamesGivesKeysAsTheyAreWritten) {
    EXPECT_EQ(Names(), "S_OK [Label, Speed, Last]");
}

TEST_F(NodeProperties, GetPropertyNamesOfANodeWithoutTextsIsEmpty) {
    view = View(*root->FindRaw(u"Child")->Child());
    EXPECT_EQ(Names(), "S_OK []");
}

TEST_F(NodeProperties, GetPropertyNamesRefusesNullPointers) {
    ULONG count = untouchedNumber;
    auto* array = Untouched<BSTR*>();
    EXPECT_EQ(view->GetPropertyNames(nullptr, &array), E_POINTER);
    EXPECT_EQ(view->GetPropertyNames(&count, nullptr), E_POINTER);
}

TEST_F(NodeProperties, OnlyALocalisedTextIsALocalisedProperty) {
    EXPECT_EQ(view->IsLocalizedProperty(In(u"LABEL")), S_OK);
    for (const char16_t* const name : {u"Speed", u"Child", u"Link", u"Missing", u""}) {
        EXPECT_EQ(view->IsLocalizedProperty(In(name)), S_FALSE);
    }
}

}  // namespace
}  // namespace zkhw
