#include <gtest/gtest.h>

#include "interfaces/support/NodeViewTest.h"
#include "interfaces/support/ProjectItems.h"
#include "qn/dsc/exception/Exception.h"

namespace zkhw {
namespace {

constexpr const char16_t* idA = u"{AAAAAAAA-0000-0000-0000-000000000001}";
constexpr const char16_t* idB = u"{BBBBBBBB-0000-0000-0000-000000000002}";
constexpr const char16_t* idC = u"{CCCCCCCC-0000-0000-0000-000000000003}";

// Three nodes in a row below the root, and a host that knows the items A and B, and C as one that can't be used.
class ResolveReservations : public NodeViewTest {
  protected:
    ResolveReservations() {
        locator.answers[idA] = {&itemA, S_OK};
        locator.answers[idB] = {&itemB, S_OK};
        locator.answers[idC] = {&itemC, E_FAIL};
    }
    ~ResolveReservations() override {
        EXPECT_EQ(locator.references, 0U);
        EXPECT_EQ(itemA.references, 0U);
        EXPECT_EQ(itemB.references, 0U);
        EXPECT_EQ(itemC.references, 0U);
    }

    // "S_OK [A, B] [{CCCC...}]": the items found by their names here, and the missing keys.
    std::string Resolve(ResTreeNode& node, bool activeOnly = false) {
        ULONG foundCount = untouchedNumber;
        ULONG missingCount = untouchedNumber;
        auto* found = Untouched<IUnknown**>();
        auto* missing = Untouched<BSTR*>();
        const HRESULT result =
            View(node)->ResolveReservations(&locator, &foundCount, &found, &missingCount, &missing, activeOnly ? 1 : 0);
        std::string names;
        for (ULONG i = 0; i < foundCount; ++i) {
            names += (i == 0 ? "" : ", ") + std::string(found[i] == &itemA ? "A" : found[i] == &itemB ? "B" : "?");
            found[i]->Release();
        }
        EXPECT_EQ(found == nullptr, foundCount == 0);
        CoTaskMemFree(found);
        return ResultName(result) + " [" + names + "] " + TakeTexts(missingCount, missing);
    }

    FakeProjectItem itemA{{}};
    FakeProjectItem itemB{{}};
    FakeProjectItem itemC{{}};
    FakeLocator locator;
    ResTreeNode* n = AddChild(*root, u"n");
    ResTreeNode* first = AddChild(*root, u"first");
    ResTreeNode* second = AddChild(*root, u"second");
};

TEST_F(ResolveReservations, RefusesAnyNullPointer) {
    const NodeView view = View(*n);
    ULONG foundCount = untouchedNumber;
    ULONG missingCount = untouchedNumber;
    auto* found = Untouched<IUnknown**>();
    auto* missing = Untouched<BSTR*>();
    EXPECT_EQ(view->ResolveReservations(nullptr, &foundCount, &found, &missingCount, &missing, 0), E_POINTER);
    EXPECT_EQ(view->ResolveReservations(&locator, nullptr, &found, &missingCount, &missing, 0), E_POINTER);
    EXPECT_EQ(view->ResolveReservations(&locator, &foundCount, nullptr, &missingCount, &missing, 0), E_POINTER);
    EXPECT_EQ(view->ResolveReservations(&locator, &foundCount, &found, nullptr, &missing, 0), E_POINTER);
    EXPECT_EQ(view->ResolveReservations(&locator, &foundCount, &found, &missingCount, nullptr, 0), E_POINTER);
}

TEST_F(ResolveReservations, OfAFreeNodeAreEmptyArrays) {
    EXPECT_EQ(Resolve(*n), "S_OK [] []");
    EXPECT_TRUE(locator.asked.empty());
}

TEST_F(ResolveReservations, SortsItemsByWhetherTheyCanBeUsed) {
    n->ReserveOne(idB, 1);
    n->ReserveOne(idC, 1);
    n->ReserveOne(idA, 2);
    EXPECT_EQ(Resolve(*n), "S_OK [B, A] [{CCCCCCCC-0000-0000-0000-000000000003}]");
    EXPECT_EQ(locator.asked, (std::vector<std::u16string>{idB, idC, idA}));
}

TEST_F(ResolveReservations, AllOfTheIdIsAskedFor) {
    const char16_t* const id = u"{01234567-89AB-CDEF-FEDC-BA9876543210}";
    n->ReserveOne(id, 1);
    EXPECT_EQ(Resolve(*n), "S_OK [] []");
    EXPECT_EQ(locator.asked, std::vector<std::u16string>{id});
}

TEST_F(ResolveReservations, APositiveResultIsNoSuccessEither) {
    locator.answers[idA].result = S_FALSE;
    n->ReserveOne(idA, 1);
    EXPECT_EQ(Resolve(*n), "S_OK [] [{AAAAAAAA-0000-0000-0000-000000000001}]");
}

TEST_F(ResolveReservations, ItemsThatTheHostDoesNotKnowAreDropped) {
    n->ReserveOne(u"{DDDDDDDD-0000-0000-0000-000000000004}", 1);
    n->ReserveOne(idA, 1);
    EXPECT_EQ(Resolve(*n), "S_OK [A] []");
    locator.answers[idA] = {nullptr, S_OK};
    EXPECT_EQ(Resolve(*n), "S_OK [] []");
}

TEST_F(ResolveReservations, AMissingKeyIsGivenAsItWasWritten) {
    n->ReserveOne(u"{cccccccc-0000-0000-0000-000000000003}", 1);
    EXPECT_EQ(Resolve(*n), "S_OK [] [{cccccccc-0000-0000-0000-000000000003}]");
}

TEST_F(ResolveReservations, ANodeWithRecordsHidesItsDependants) {
    AddText(*n, u"Reserves", u"../first");
    n->ReserveOne(idA, 1);
    first->ReserveOne(idB, 1);
    EXPECT_EQ(Resolve(*n), "S_OK [A] []");
}

TEST_F(ResolveReservations, OfANodeWithoutRecordsAreThoseOfTheFirstDependantThatHasAny) {
    AddText(*n, u"Reserves", u"../nowhere, ../first, ../second");
    EXPECT_EQ(Resolve(*n), "S_OK [] []");
    second->ReserveOne(idB, 1);
    EXPECT_EQ(Resolve(*n), "S_OK [B] []");
    first->ReserveOne(idA, 1);
    EXPECT_EQ(Resolve(*n), "S_OK [A] []");
}

TEST_F(ResolveReservations, DependantsAreSearchedDepthFirst) {
    ResTreeNode* const deep = AddChild(*root, u"deep");
    AddText(*n, u"Reserves", u"../first,../second");
    AddText(*first, u"Reserves", u"../deep");
    deep->ReserveOne(idA, 1);
    second->ReserveOne(idB, 1);
    EXPECT_EQ(Resolve(*n), "S_OK [A] []");
}

TEST_F(ResolveReservations, DependantsThatFormACircleEndTheSearch) {
    AddText(*n, u"Reserves", u"../first");
    AddText(*first, u"Reserves", u"../n,../first,../second");
    EXPECT_EQ(Resolve(*n), "S_OK [] []");
    second->ReserveOne(idB, 1);
    EXPECT_EQ(Resolve(*n), "S_OK [B] []");
}

TEST_F(ResolveReservations, RecordsWithoutAModeCountUnlessOnlyActiveOnesAreWanted) {
    n->ReserveOne(idA, 0);
    n->ReserveOne(idB, 1);
    EXPECT_EQ(Resolve(*n, false), "S_OK [A, B] []");
    EXPECT_EQ(Resolve(*n, true), "S_OK [B] []");
}

TEST_F(ResolveReservations, ModesOutsideOfTheThreeAreNotActive) {
    n->ReserveOne(idA, 8);
    n->ReserveOne(idB, 12);
    EXPECT_EQ(Resolve(*n, true), "S_OK [B] []");
}

// It has records, so the search ends there.
TEST_F(ResolveReservations, ANodeThatHoldsOnlyRecordsWithoutAModeEndsTheSearchOnItsBranch) {
    AddText(*n, u"Reserves", u"../first");
    n->ReserveOne(idA, 0);
    first->ReserveOne(idB, 1);
    EXPECT_EQ(Resolve(*n, true), "S_OK [] []");
    EXPECT_EQ(Resolve(*n, false), "S_OK [A] []");
}

TEST_F(ResolveReservations, TheNextDependantIsAskedBehindOneThatHoldsOnlyRecordsWithoutAMode) {
    ResTreeNode* const deep = AddChild(*root, u"deep");
    AddText(*n, u"Reserves", u"../first,../second");
    AddText(*first, u"Reserves", u"../deep");
    first->ReserveOne(idA, 0);
    deep->ReserveOne(idC, 1);
    second->ReserveOne(idB, 1);
    EXPECT_EQ(Resolve(*n, true), "S_OK [B] []");
    EXPECT_EQ(Resolve(*n, false), "S_OK [A] []");
}

TEST_F(ResolveReservations, AnOwnerThatIsNoGuidThrowsAndGivesNothing) {
    n->ReserveOne(idA, 1);
    n->ReserveOne(idC, 1);
    n->ReserveOne(u"me", 1);
    const NodeView view = View(*n);
    ULONG foundCount = untouchedNumber;
    ULONG missingCount = untouchedNumber;
    auto* found = Untouched<IUnknown**>();
    auto* missing = Untouched<BSTR*>();
    EXPECT_THROW(view->ResolveReservations(&locator, &foundCount, &found, &missingCount, &missing, 0),
                 qn::dsc::exception::BadGuidString);
    EXPECT_EQ(foundCount, 0U);
    EXPECT_EQ(found, nullptr);
    EXPECT_EQ(missingCount, 0U);
    EXPECT_EQ(missing, nullptr);
}

TEST_F(ResolveReservations, AnInactiveOwnerThatIsNoGuidIsNotParsed) {
    n->ReserveOne(u"me", 0);
    n->ReserveOne(idA, 1);
    EXPECT_EQ(Resolve(*n, true), "S_OK [A] []");
}

}  // namespace
}  // namespace zkhw
