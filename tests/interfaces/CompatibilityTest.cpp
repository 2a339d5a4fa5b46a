#include <gtest/gtest.h>

#include "interfaces/support/ForeignNode.h"
#include "interfaces/support/NodeViewTest.h"

namespace zkhw {
namespace {

// Two nodes to be compared: does `b` offer all that `a` asks for?
class Compatibility : public NodeViewTest {
  protected:
    static int Compare(const NodeView& asking, IzkhwResourceTreeNode* other, bool skipLocalized = false) {
        BOOL result = -1;
        EXPECT_EQ(asking->IsCompatibleWithEx(other, &result, skipLocalized ? 1 : 0), S_OK);
        return result;
    }
    int CompareBoth(bool skipLocalized = false) { return Compare(View(*a), View(*b).Get(), skipLocalized); }

    // With an object of the host in the place of `b`; all of those have to be gone in the end.
    int CompareForeign(bool skipLocalized = false) {
        const NodeView inner = View(*b);
        InterfacePointer<ForeignNode> other(new ForeignNode(tree, inner.Get()));
        const int result = Compare(View(*a), other.Get(), skipLocalized);
        EXPECT_EQ(tree.liveObjects, 1);
        return result;
    }

    ResTreeNode* a = AddChild(*root, u"a", u"T", true);
    ResTreeNode* b = AddChild(*root, u"b", u"T", true);
    ForeignTree tree;
};

TEST_F(Compatibility, WithNothingIsNever) {
    EXPECT_EQ(Compare(View(*a), nullptr), 0);
    BOOL result = -1;
    EXPECT_EQ(View(*a)->IsCompatibleWith(nullptr, &result), S_OK);
    EXPECT_EQ(result, 0);
}

TEST_F(Compatibility, RefusesANullResult) {
    const NodeView other = View(*b);
    EXPECT_EQ(View(*a)->IsCompatibleWith(other.Get(), nullptr), E_POINTER);
    EXPECT_EQ(View(*a)->IsCompatibleWithEx(other.Get(), nullptr, 0), E_POINTER);
    EXPECT_EQ(View(*a)->IsCompatibleWith(nullptr, nullptr), E_POINTER);
}

TEST_F(Compatibility, ANodeThatAsksForNothingIsMetByAny) {
    AddText(*b, u"More", u"x");
    AddChild(*b, u"Child");
    EXPECT_EQ(CompareBoth(), 1);
    EXPECT_EQ(Compare(View(*b), View(*a).Get()), 0);
}

TEST_F(Compatibility, ANodeIsCompatibleWithItselfAndWithACopy) {
    AddText(*a, u"P", u"1");
    AddText(*AddChild(*a, u"C"), u"Q", u"2");
    EXPECT_EQ(Compare(View(*a), View(*a).Get()), 1);
    IzkhwResourceTreeNode* copy = nullptr;
    ASSERT_EQ(View(*a)->CloneDetached(nullptr, &copy), S_OK);
    EXPECT_EQ(Compare(View(*a), copy), 1);
    copy->Release();
}

TEST_F(Compatibility, NamesAndTypesOfTheTwoNodesDoNotMatter) {
    ResTreeNode* const c = AddChild(*root, u"c", u"Other");
    EXPECT_EQ(Compare(View(*a), View(*c).Get()), 1);
}

TEST_F(Compatibility, EveryPropertyMustBeThereAndEqualBlindToLetterCase) {
    AddText(*a, u"P", u"abc");
    EXPECT_EQ(CompareBoth(), 0);
    AddText(*b, u"p", u"ABC");
    EXPECT_EQ(CompareBoth(), 1);
    b->SetProperty(u"P", u"abd");
    EXPECT_EQ(CompareBoth(), 0);
}

TEST_F(Compatibility, APropertyThatIsAChildOnTheOtherSideIsMissing) {
    AddText(*a, u"P", u"");
    AddChild(*b, u"P");
    EXPECT_EQ(CompareBoth(), 0);
}

TEST_F(Compatibility, ValueAndInterfaceAreNotCompared) {
    AddText(*a, u"value", u"1");
    AddText(*a, u"INTERFACE", u"x");
    EXPECT_EQ(CompareBoth(), 1);
    AddText(*b, u"Value", u"2");
    AddText(*b, u"Interface", u"y");
    EXPECT_EQ(CompareBoth(), 1);
}

TEST_F(Compatibility, SupportedValuesMustBeAmongTheOthers) {
    struct Case {
        const char16_t* ours;
        const char16_t* theirs;
        int expected;
    };
    for (const Case& each : {Case{u"a,b", u"b,c,a", 1}, Case{u"b,c,a", u"a,b", 0}, Case{u"A,B", u"a,b", 1},
                             Case{u"", u"", 1}, Case{u"", u"a", 1}, Case{u"a", u"", 0}, Case{u"a, b", u"a,b", 0},
                             Case{u"a, b", u" b,a", 1}, Case{u"a\\,b", u"a,b", 0}, Case{u"a\\,b", u"c,a\\,b", 1},
                             Case{u"a,", u"a", 0}, Case{u"a,", u",a", 1}, Case{u"a,a,a", u"a", 1}}) {
        a->SetProperty(u"supportedvalues", each.ours);
        b->SetProperty(u"SupportedValues", each.theirs);
        EXPECT_EQ(CompareBoth(), each.expected)
            << qn::dsc::ExactText(String(each.ours)) << " in " << qn::dsc::ExactText(String(each.theirs));
    }
}

TEST_F(Compatibility, SupportedValuesMustBeThere) {
    AddText(*a, u"SupportedValues", u"");
    EXPECT_EQ(CompareBoth(), 0);
}

TEST_F(Compatibility, OnlyTheFirstOfEqualKeysIsAskedFor) {
    AddText(*a, u"P", u"1");
    AddText(*a, u"P", u"2");
    AddText(*b, u"P", u"1");
    EXPECT_EQ(CompareBoth(), 1);
}

TEST_F(Compatibility, EveryChildMustBeThereByItsName) {
    AddChild(*a, u"C", u"T");
    EXPECT_EQ(CompareBoth(), 0);
    AddChild(*b, u"c", u"Other");
    EXPECT_EQ(CompareBoth(), 1);
}

TEST_F(Compatibility, ChildrenAreComparedAtEveryDepth) {
    AddText(*AddChild(*AddChild(*a, u"C"), u"D"), u"P", u"1");
    ResTreeNode* const d = AddChild(*AddChild(*b, u"C"), u"D");
    EXPECT_EQ(CompareBoth(), 0);
    AddText(*d, u"P", u"1");
    EXPECT_EQ(CompareBoth(), 1);
}

TEST_F(Compatibility, NamesWithSlashesAndBackslashesAreFound) {
    AddChild(*a, u"x/y\\z");
    AddChild(*b, u"x/y\\z");
    EXPECT_EQ(CompareBoth(), 1);
}

// A path of no length finds nothing.
TEST_F(Compatibility, AChildWithoutANameIsNeverFound) {
    AddChild(*a, u"");
    AddChild(*b, u"");
    EXPECT_EQ(CompareBoth(), 0);
}

TEST_F(Compatibility, ALinkIsAskedForByTheNameOfItsNode) {
    AddChild(*root, u"Target");
    AddLink(*a, u"L", u"../Target");
    AddChild(*b, u"L");
    EXPECT_EQ(CompareBoth(), 0);
    AddLink(*b, u"Target", u"../Target");
    EXPECT_EQ(CompareBoth(), 1);
}

TEST_F(Compatibility, ADanglingLinkAsksForNothing) {
    AddLink(*a, u"L", u"nowhere");
    EXPECT_EQ(CompareBoth(), 1);
}

TEST_F(Compatibility, ACircleOfLinksEnds) {
    AddLink(*AddChild(*a, u"C"), u"Up", u"..");
    ResTreeNode* const c = AddChild(*b, u"C");
    EXPECT_EQ(CompareBoth(), 0);
    // The link leads to "a", so that is the name that is looked for.
    AddLink(*c, u"a", u"..");
    EXPECT_EQ(CompareBoth(), 1);
}

TEST_F(Compatibility, LocalisedPropertiesAreComparedByTheirText) {
    a->AddTextEntry(u"L", std::u16string_view(u"x\0eng=x", 7), LocalizedTextEntry);
    AddText(*b, u"L", u"x");
    EXPECT_EQ(CompareBoth(), 1);
    b->SetProperty(u"L", u"y");
    EXPECT_EQ(CompareBoth(), 0);
    BOOL result = -1;
    EXPECT_EQ(View(*a)->IsCompatibleWith(View(*b).Get(), &result), S_OK);
    EXPECT_EQ(result, 0);
}

TEST_F(Compatibility, SkippingLocalisedOnesSkipsWhatIsLocalisedOnEitherSide) {
    AddText(*a, u"L", u"x", LocalizedTextEntry);
    EXPECT_EQ(CompareBoth(true), 1);
    AddText(*b, u"L", u"y");
    EXPECT_EQ(CompareBoth(true), 1);
    AddText(*a, u"M", u"1");
    AddText(*b, u"M", u"2", LocalizedTextEntry);
    EXPECT_EQ(CompareBoth(true), 1);
    AddText(*a, u"N", u"1");
    EXPECT_EQ(CompareBoth(true), 0);
    AddText(*b, u"N", u"1");
    EXPECT_EQ(CompareBoth(true), 1);
    EXPECT_EQ(CompareBoth(false), 0);
}

TEST_F(Compatibility, SkippingLocalisedOnesHoldsBelowToo) {
    AddText(*AddChild(*a, u"C"), u"L", u"x", LocalizedTextEntry);
    AddChild(*b, u"C");
    EXPECT_EQ(CompareBoth(true), 1);
    EXPECT_EQ(CompareBoth(false), 0);
}

// --- With an object of the host on the other side ---

TEST_F(Compatibility, AForeignNodeIsAskedThroughItsOperationsAlone) {
    AddText(*a, u"P", u"1");
    AddText(*b, u"P", u"1");
    AddText(*AddChild(*a, u"C"), u"Q", u"2");
    AddText(*AddChild(*b, u"C"), u"Q", u"2");
    EXPECT_EQ(CompareForeign(), 1);
    // The child is found and compared before the properties of the node itself.
    EXPECT_EQ(tree.calls, u"FQPQP");
}

TEST_F(Compatibility, AForeignNodeIsAskedForLocalisedPropertiesFirst) {
    AddText(*a, u"P", u"1");
    AddText(*b, u"P", u"1");
    EXPECT_EQ(CompareForeign(true), 1);
    EXPECT_EQ(tree.calls, u"QLP");
}

TEST_F(Compatibility, AForeignNodeWithoutAChildIsReleased) {
    AddChild(*a, u"C");
    AddChild(*b, u"C");
    AddChild(*a, u"D");
    AddChild(*a, u"E");
    EXPECT_EQ(CompareForeign(), 0);
    EXPECT_EQ(tree.calls, u"FQF");
}

TEST_F(Compatibility, AForeignNodeThatDiffersDeepDownIsReleasedOnTheWholeWay) {
    AddText(*AddChild(*AddChild(*a, u"C"), u"D"), u"P", u"1");
    AddText(*AddChild(*AddChild(*b, u"C"), u"D"), u"P", u"2");
    EXPECT_EQ(CompareForeign(), 0);
    EXPECT_EQ(tree.calls, u"FFQP");
}

TEST_F(Compatibility, AForeignNodeWithoutVersion5IsNotCompatible) {
    tree.hasVersion5 = false;
    EXPECT_EQ(CompareForeign(), 0);
    EXPECT_EQ(tree.calls, u"Q");
}

TEST_F(Compatibility, AForeignPropertyWithAResultOtherThanOkIsNotMet) {
    AddText(*a, u"P", u"1");
    AddText(*b, u"P", u"1");
    for (const HRESULT result : {S_FALSE, E_FAIL, E_OUTOFMEMORY}) {
        tree.propertyResult = result;
        EXPECT_EQ(CompareForeign(), 0);
    }
}

TEST_F(Compatibility, AForeignPropertyWithoutATextIsNotMet) {
    AddText(*a, u"P", u"");
    AddText(*b, u"P", u"");
    tree.givesNullValues = true;
    EXPECT_EQ(CompareForeign(), 0);
}

TEST_F(Compatibility, AForeignPropertyThatFailsToSayWhetherItIsLocalisedIsSkipped) {
    AddText(*a, u"P", u"1");
    tree.localizedResult = E_FAIL;
    EXPECT_EQ(CompareForeign(true), 1);
    EXPECT_EQ(CompareForeign(false), 0);
}

}  // namespace
}  // namespace zkhw
