#include <gtest/gtest.h>

#include "interfaces/support/NodeViewTest.h"

namespace zkhw {
namespace {

class NodeNames : public NodeViewTest {
  protected:
    static std::string Names(const NodeView& view, const char16_t* path, const char16_t* type, bool includePath) {
        return GivenTexts([&](ULONG* count, BSTR** names) {
            return view->GetChildNamesOfType(In(path), In(type), includePath ? 1 : 0, count, names, nullptr);
        });
    }
    std::string Names(const char16_t* path, bool includePath) { return Names(Root(), path, u"", includePath); }

    // With display names: "S_OK [a] [b]".
    template <typename Call>
    static std::string WithDisplays(Call call) {
        ULONG count = untouchedNumber;
        auto* names = Untouched<BSTR*>();
        auto* displays = Untouched<BSTR*>();
        const HRESULT result = call(&count, &names, &displays);
        const std::string first = TakeTexts(count, names);
        return ResultName(result) + " " + first + " " + TakeTexts(count, displays);
    }

    static std::string Descendants(const NodeView& view, const char16_t* path, const char16_t* type,
                                   const char16_t* exclusion = nullptr) {
        return GivenTexts([&](ULONG* count, BSTR** names) {
            return view->GetDescendantNamesEx(In(path), In(type), 1, In(exclusion), count, names, nullptr);
        });
    }
    // By name alone.
    static std::string DescendantNames(const NodeView& view, const char16_t* type,
                                       const char16_t* exclusion = nullptr) {
        return GivenTexts([&](ULONG* count, BSTR** names) {
            return view->GetDescendantNamesEx(nullptr, In(type), 0, In(exclusion), count, names, nullptr);
        });
    }
    static std::string DescendantsWithDisplays(const NodeView& view, const char16_t* path, bool includePath) {
        return WithDisplays([&](ULONG* count, BSTR** names, BSTR** displays) {
            return view->GetDescendantNamesEx(In(path), nullptr, includePath ? 1 : 0, nullptr, count, names, displays);
        });
    }
};

// --- Children ---

class NodeChildNames : public NodeNames {
  protected:
    NodeChildNames() {
        ResTreeNode* const a = AddChild(*root, u"A");
        AddText(*a, u"DisplayName", u"Shown");
        AddText(*root, u"Text", u"");
        AddLink(*root, u"L", u"A");
        AddLink(*root, u"Dangling", u"nowhere");
        AddChild(*root, u"x/y", u"U");
    }
};

TEST_F(NodeChildNames, WithoutPathsAreThoseOfTheNodes) {
    EXPECT_EQ(Names(nullptr, false), "S_OK [A, A, x/y]");
    EXPECT_EQ(Names(u"/ignored", false), "S_OK [A, A, x/y]");
}

TEST_F(NodeChildNames, WithPathsAreJoinedFromTheKeysOfTheEntries) {
    EXPECT_EQ(Names(nullptr, true), "S_OK [/A, /L, /x\\/y]");
}

TEST_F(NodeChildNames, WithAPathAreJoinedOntoThat) {
    EXPECT_EQ(Names(u"some/where", true), "S_OK [some/where/A, some/where/L, some/where/x\\/y]");
    EXPECT_EQ(Names(u"/", true), "S_OK [/A, /L, /x\\/y]");
    EXPECT_EQ(Names(u"", true), "S_OK [/A, /L, /x\\/y]");
    EXPECT_EQ(Names(u"b/", true), "S_OK [b//A, b//L, b//x\\/y]");
}

TEST_F(NodeChildNames, OfANodeBelowBeginWithItsOwnPath) {
    ResTreeNode* const deep = AddChild(*root->FindRaw(u"x/y")->Child(), u"Deep");
    AddChild(*deep, u"Leaf");
    EXPECT_EQ(Names(View(*deep), nullptr, u"", true), "S_OK [/x\\/y/Deep/Leaf]");
}

TEST_F(NodeChildNames, OfATypeLeaveOthersOut) {
    EXPECT_EQ(Names(Root(), nullptr, u"u", false), "S_OK [x/y]");
    EXPECT_EQ(Names(Root(), nullptr, u"T", true), "S_OK [/A, /L]");
    EXPECT_EQ(Names(Root(), nullptr, u"V", false), "S_OK []");
    EXPECT_EQ(Names(Root(), nullptr, nullptr, false), "S_OK [A, A, x/y]");
}

TEST_F(NodeChildNames, DisplayNamesAreJoinedOntoTheOwnDisplayPathWhateverThePath) {
    const NodeView view = Root();
    EXPECT_EQ(WithDisplays([&](ULONG* count, BSTR** names, BSTR** displays) {
                  return view->GetChildNamesOfType(In(u"/p"), nullptr, 1, count, names, displays);
              }),
              "S_OK [/p/A, /p/L, /p/x\\/y] [/Shown, /Shown, /x\\/y]");
    const NodeView below = View(*root->FindRaw(u"A")->Child());
    AddChild(*root->FindRaw(u"A")->Child(), u"C");
    EXPECT_EQ(WithDisplays([&](ULONG* count, BSTR** names, BSTR** displays) {
                  return below->GetChildNamesOfType(nullptr, nullptr, 0, count, names, displays);
              }),
              "S_OK [C] [/Shown/C]");
}

TEST_F(NodeChildNames, AChildWithAnEmptyDisplayNameShowsAsItsParent) {
    ResTreeNode* const a = root->FindRaw(u"A")->Child();
    AddText(*AddChild(*a, u"C"), u"DisplayName", u"");
    const NodeView view = View(*a);
    EXPECT_EQ(WithDisplays([&](ULONG* count, BSTR** names, BSTR** displays) {
                  return view->GetChildNames(nullptr, 0, count, names, displays);
              }),
              "S_OK [C] [/Shown]");
}

TEST_F(NodeChildNames, GetChildNamesTakesAllTypes) {
    const NodeView view = Root();
    EXPECT_EQ(GivenTexts(
                  [&](ULONG* count, BSTR** names) { return view->GetChildNames(In(u"/p"), 1, count, names, nullptr); }),
              "S_OK [/p/A, /p/L, /p/x\\/y]");
}

TEST_F(NodeChildNames, OfALeafAreEmptyArrays) {
    const NodeView view = View(*root->FindRaw(u"A")->Child());
    EXPECT_EQ(WithDisplays([&](ULONG* count, BSTR** names, BSTR** displays) {
                  return view->GetChildNamesOfType(nullptr, nullptr, 1, count, names, displays);
              }),
              "S_OK [] []");
}

TEST_F(NodeChildNames, RefuseNullPointers) {
    const NodeView view = Root();
    ULONG count = untouchedNumber;
    auto* names = Untouched<BSTR*>();
    auto* displays = Untouched<BSTR*>();
    EXPECT_EQ(view->GetChildNames(nullptr, 0, nullptr, &names, &displays), E_POINTER);
    EXPECT_EQ(view->GetChildNames(nullptr, 0, &count, nullptr, &displays), E_POINTER);
    EXPECT_EQ(view->GetChildNamesOfType(nullptr, nullptr, 0, nullptr, &names, &displays), E_POINTER);
    EXPECT_EQ(view->GetChildNamesOfType(nullptr, nullptr, 0, &count, nullptr, &displays), E_POINTER);
    EXPECT_EQ(view->GetDescendantNames(nullptr, nullptr, 0, nullptr, &names, &displays), E_POINTER);
    EXPECT_EQ(view->GetDescendantNames(nullptr, nullptr, 0, &count, nullptr, &displays), E_POINTER);
    EXPECT_EQ(view->GetDescendantNamesEx(nullptr, nullptr, 0, nullptr, nullptr, &names, &displays), E_POINTER);
    EXPECT_EQ(view->GetDescendantNamesEx(nullptr, nullptr, 0, nullptr, &count, nullptr, &displays), E_POINTER);
}

// --- Descendants: A: { A1 }, then what the test adds ---

class NodeDescendantNames : public NodeNames {
  protected:
    ResTreeNode* a = AddChild(*root, u"A");
    ResTreeNode* a1 = AddChild(*a, u"A1", u"U");
};

TEST_F(NodeDescendantNames, StandWithAParentBeforeItsChildren) {
    AddChild(*AddChild(*root, u"B"), u"B1");
    EXPECT_EQ(DescendantNames(Root(), u""), "S_OK [A, A1, B, B1]");
    EXPECT_EQ(Descendants(Root(), nullptr, u""), "S_OK [/A, /A/A1, /B, /B/B1]");
}

TEST_F(NodeDescendantNames, OfPlainChildrenAreTheirOwnPathsWhateverThePath) {
    EXPECT_EQ(Descendants(Root(), u"/elsewhere", u""), "S_OK [/A, /A/A1]");
    EXPECT_EQ(Descendants(View(*a), u"/elsewhere", nullptr), "S_OK [/A/A1]");
}

TEST_F(NodeDescendantNames, OfATypeAreLookedForBelowOthersToo) {
    AddChild(*a1, u"Deep");
    EXPECT_EQ(Descendants(Root(), nullptr, u"U"), "S_OK [/A/A1]");
    EXPECT_EQ(Descendants(Root(), nullptr, u"T"), "S_OK [/A, /A/A1/Deep]");
}

TEST_F(NodeDescendantNames, GetDescendantNamesExcludesNothing) {
    AddText(*a, u"", u"");
    const NodeView view = Root();
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** names) {
                  return view->GetDescendantNames(nullptr, nullptr, 1, count, names, nullptr);
              }),
              "S_OK [/A, /A/A1]");
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** names) {
                  return view->GetDescendantNames(nullptr, In(u"U"), 0, count, names, nullptr);
              }),
              "S_OK [A1]");
}

TEST_F(NodeDescendantNames, WithoutAnyAreEmptyArrays) {
    EXPECT_EQ(DescendantsWithDisplays(View(*a1), nullptr, true), "S_OK [] []");
}

TEST_F(NodeDescendantNames, ExclusionTakesEmptyAndTrueValues) {
    for (const char16_t* const value : {u"", u"true", u"TRUE", u"Yes", u"1", u"on", u"enable"}) {
        a->SetProperty(u"Hide", value);
        EXPECT_EQ(DescendantNames(Root(), u"", u"hide"), "S_OK [A1]") << qn::dsc::ExactText(std::u16string_view(value));
    }
    for (const char16_t* const value : {u"false", u"no", u"0", u"off", u" true", u"true ", u"enabled", u"2"}) {
        a->SetProperty(u"Hide", value);
        EXPECT_EQ(DescendantNames(Root(), u"", u"Hide"), "S_OK [A, A1]")
            << qn::dsc::ExactText(std::u16string_view(value));
    }
}

TEST_F(NodeDescendantNames, ExclusionTakesALocalisedTextAndNothingElse) {
    AddText(*a, u"Hide", u"yes", LocalizedTextEntry);
    EXPECT_EQ(DescendantNames(Root(), u"", u"Hide"), "S_OK [A1]");
    AddChild(*a1, u"Hide");
    EXPECT_EQ(DescendantNames(Root(), u"", u"Hide"), "S_OK [A1, Hide]");
}

TEST_F(NodeDescendantNames, AnEmptyExclusionExcludesNothing) {
    AddText(*a, u"", u"true");
    EXPECT_EQ(DescendantNames(Root(), u"", u""), "S_OK [A, A1]");
    EXPECT_EQ(DescendantNames(Root(), u"", nullptr), "S_OK [A, A1]");
}

TEST_F(NodeDescendantNames, BehindALinkAreThePathsOnWhichTheWalkCame) {
    AddLink(*root, u"L", u"A");
    EXPECT_EQ(Descendants(Root(), nullptr, u""), "S_OK [/A, /A/A1, /L, /L/A1]");
    EXPECT_EQ(DescendantNames(Root(), u""), "S_OK [A, A1, A, A1]");
}

TEST_F(NodeDescendantNames, EscapeTheKeyOfALink) {
    AddLink(*root, u"l/k", u"A");
    EXPECT_EQ(Descendants(Root(), nullptr, u""), "S_OK [/A, /A/A1, /l\\/k, /l\\/k/A1]");
}

TEST_F(NodeDescendantNames, OfEntriesBehindALinkAreJoinedOntoThePathThatWasPassedIn) {
    AddLink(*root, u"L", u"A");
    AddChild(*AddChild(*root, u"B"), u"B1");
    EXPECT_EQ(Descendants(Root(), nullptr, u""), "S_OK [/A, /A/A1, /L, /L/A1, /B, /B/B1]");
    // The link itself is still named from the node's own path.
    EXPECT_EQ(Descendants(Root(), u"/x", u""), "S_OK [/A, /A/A1, /L, /L/A1, /x/B, /x/B/B1]");
    EXPECT_EQ(Descendants(Root(), u"", u""), "S_OK [/A, /A/A1, /L, /L/A1, /B, /B/B1]");
}

TEST_F(NodeDescendantNames, AreJoinedOntoThePathFromTheStartIfItLeadsThroughALink) {
    AddLink(*root, u"L", u"A");
    AddChild(*root, u"B");
    EXPECT_EQ(Descendants(Root(), u"L", u""), "S_OK [L/A, L/A/A1, L/L, L/L/A1, L/B]");
    EXPECT_EQ(Descendants(Root(), u"/L/missing", u""),
              "S_OK [/L/missing/A, /L/missing/A/A1, /L/missing/L, /L/missing/L/A1, /L/missing/B]");
}

TEST_F(NodeDescendantNames, APathCountsOnlyWithPaths) {
    AddLink(*root, u"L", u"A");
    const NodeView view = Root();
    EXPECT_EQ(GivenTexts([&](ULONG* count, BSTR** names) {
                  return view->GetDescendantNamesEx(In(u"L"), nullptr, 0, nullptr, count, names, nullptr);
              }),
              "S_OK [A, A1, A, A1]");
}

// Below a plain child the walk has no way to hand on, so what follows the first link there is named as from nowhere.
TEST_F(NodeDescendantNames, OfEntriesBehindALinkBelowAPlainChildAreJoinedOntoNothing) {
    ResTreeNode* const n = AddChild(*root, u"N", u"T", true);
    AddChild(*n, u"R");
    AddLink(*n, u"L", u"../A");
    AddChild(*AddChild(*n, u"S"), u"S1");
    AddChild(*root, u"Z");
    EXPECT_EQ(Descendants(Root(), nullptr, u""), "S_OK [/A, /A/A1, /N, /N/R, /N/L, /N/L/A1, /S, /S/S1, /Z]");
    EXPECT_EQ(Descendants(Root(), u"/x", u""), "S_OK [/A, /A/A1, /N, /N/R, /N/L, /N/L/A1, /S, /S/S1, /Z]");
}

TEST_F(NodeDescendantNames, ALinkInsideOfWhatALinkLeadsToGoesOnFromThere) {
    AddLink(*a, u"M", u"../B");
    AddChild(*AddChild(*root, u"B"), u"B1");
    AddLink(*root, u"L", u"A");
    // Keys of A in order: A1, M.
    EXPECT_EQ(Descendants(Root(), nullptr, u""),
              "S_OK [/A, /A/A1, /A/M, /A/M/B1, /B, /B/B1, /L, /L/A1, /L/M, /L/M/B1]");
}

TEST_F(NodeDescendantNames, ALinkToANodeOfAnotherTypeStillCountsAsCrossed) {
    AddLink(*root, u"L", u"A");
    AddChild(*root, u"B", u"U");
    EXPECT_EQ(Descendants(Root(), u"/x", u"U"), "S_OK [/A/A1, /L/A1, /x/B]");
}

TEST_F(NodeDescendantNames, ALinkToAnExcludedNodeStillCountsAsCrossed) {
    AddText(*a, u"Hide", u"");
    AddLink(*root, u"L", u"A");
    AddChild(*root, u"B");
    EXPECT_EQ(Descendants(Root(), u"/x", u"", u"Hide"), "S_OK [/A/A1, /L/A1, /x/B]");
}

TEST_F(NodeDescendantNames, ADanglingLinkDoesNotCountAsCrossed) {
    AddLink(*root, u"D", u"nowhere");
    AddChild(*root, u"B");
    EXPECT_EQ(Descendants(Root(), u"/x", u""), "S_OK [/A, /A/A1, /B]");
}

TEST_F(NodeDescendantNames, ALinkBackToTheWayCountsAsDangling) {
    ResTreeNode* const n = AddChild(*root, u"N", u"T", true);
    AddLink(*n, u"Self", u"");
    AddLink(*n, u"Up", u"..");
    AddLink(*n, u"Me", u"../N");
    AddChild(*n, u"S");
    EXPECT_EQ(Descendants(Root(), nullptr, u""), "S_OK [/A, /A/A1, /N, /N/S]");
    EXPECT_EQ(DescendantNames(Root(), u""), "S_OK [A, A1, N, S]");
}

TEST_F(NodeDescendantNames, TwoLinksToOneNodeNameItTwice) {
    AddLink(*root, u"L", u"A");
    AddLink(*root, u"M", u"A");
    EXPECT_EQ(Descendants(Root(), nullptr, u""), "S_OK [/A, /A/A1, /L, /L/A1, /M, /M/A1]");
}

TEST_F(NodeDescendantNames, DisplaysOfPlainChildrenAreTheirOwn) {
    AddText(*a, u"DisplayName", u"Shown");
    AddText(*a1, u"DisplayName", u"");
    AddChild(*a1, u"Deep");
    EXPECT_EQ(DescendantsWithDisplays(Root(), u"/x", true),
              "S_OK [/A, /A/A1, /A/A1/Deep] [/Shown, /Shown, /Shown/Deep]");
    EXPECT_EQ(DescendantsWithDisplays(View(*a), nullptr, false), "S_OK [A1, Deep] [/Shown, /Shown/Deep]");
}

TEST_F(NodeDescendantNames, DisplaysBehindALinkAreJoinedOnTheWay) {
    ResTreeNode* const n = AddChild(*root, u"N", u"T", true);
    AddText(*root, u"DisplayName", u"not shown for a root");
    AddText(*n, u"DisplayName", u"Nice");
    AddText(*a, u"DisplayName", u"Shown");
    AddLink(*n, u"L", u"../A");
    AddChild(*n, u"S");
    AddText(*AddChild(*n, u"E"), u"DisplayName", u"");
    // From N as the top its own display path is handed in, and the entries behind the link use it.
    EXPECT_EQ(DescendantsWithDisplays(View(*n), nullptr, false),
              "S_OK [A, A1, S, E] [/Nice/Shown, /Nice/Shown/A1, /Nice/S, /Nice]");
    // From the root there is nothing to hand on to N.
    EXPECT_EQ(DescendantsWithDisplays(Root(), nullptr, false),
              "S_OK [A, A1, N, A, A1, S, E] [/Shown, /Shown/A1, /Nice, /Nice/Shown, /Nice/Shown/A1, /S, ]");
}

TEST_F(NodeDescendantNames, DisplaysAndPathsAreJoinedEachOnItsOwn) {
    AddText(*a, u"DisplayName", u"Shown");
    AddLink(*root, u"L", u"A");
    AddChild(*root, u"B");
    EXPECT_EQ(DescendantsWithDisplays(Root(), u"/x", true),
              "S_OK [/A, /A/A1, /L, /L/A1, /x/B] [/Shown, /Shown/A1, /Shown, /Shown/A1, /B]");
    // Through a link from the start: displays begin with the own display path all the same.
    EXPECT_EQ(DescendantsWithDisplays(Root(), u"L", true),
              "S_OK [L/A, L/A/A1, L/L, L/L/A1, L/B] [/Shown, /Shown/A1, /Shown, /Shown/A1, /B]");
}

}  // namespace
}  // namespace zkhw
