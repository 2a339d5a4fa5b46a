#include <gtest/gtest.h>

#include "interfaces/support/NodeViewTest.h"
#include "interfaces/support/ProjectItems.h"

namespace zkhw {
namespace {

constexpr const char16_t* itemKey = u"{01234567-89AB-CDEF-0123-456789ABCDEF}";

// "A", which takes "Partner" along, with the children "B:T", "C:U", and "D:T" below "C".
class NodeReservations : public NodeViewTest {
  protected:
    NodeReservations() {
        AddText(*a, u"Reserves", u"../Partner");
        view = View(*a);
    }

    std::string Get(const char16_t* owners) {
        return GivenNumber([&](ULONG* mode) { return view->GetReservation(In(owners), mode); });
    }
    std::string GetEx(const char16_t* owners, BOOL except) {
        return GivenNumber([&](ULONG* mode) { return view->GetReservationEx(In(owners), except, mode); });
    }
    std::string Reserve(const char16_t* owner, ULONG mode) {
        return GivenNumber([&](ULONG* granted) { return view->Reserve(In(owner), mode, granted); });
    }
    static uint32_t Held(const ResTreeNode* node) { return node->GetOwnReservationFlags(nullptr, false); }

    ResTreeNode* a = AddChild(*root, u"A");
    ResTreeNode* partner = AddChild(*root, u"Partner");
    ResTreeNode* b = AddChild(*a, u"B");
    ResTreeNode* c = AddChild(*a, u"C", u"U");
    ResTreeNode* d = AddChild(*c, u"D");
    FakeProjectItem item{IdFrom(itemKey)};
    NodeView view;
};

TEST_F(NodeReservations, ReserveTakesTheNodeAndItsDependants) {
    EXPECT_EQ(Reserve(u"me", 2), "S_OK 2");
    EXPECT_EQ(Held(a), 2U);
    EXPECT_EQ(Held(partner), 2U);
}

TEST_F(NodeReservations, ReserveGivesTheModesThatTheNodeIsHeldInNow) {
    EXPECT_EQ(Reserve(u"me", 1), "S_OK 1");
    EXPECT_EQ(Reserve(u"you", 2), "S_OK 3");
}

TEST_F(NodeReservations, ARefusedReserveGivesZeroAndTakesNothing) {
    partner->ReserveOne(u"other", 4);
    EXPECT_EQ(Reserve(u"me", 1), "S_FALSE 0");
    EXPECT_EQ(Held(a), 0U);
    EXPECT_EQ(Held(partner), 4U);
}

TEST_F(NodeReservations, OutArgumentsOfModesAreOptional) {
    EXPECT_EQ(view->Reserve(In(u"me"), 2, nullptr), S_OK);
    EXPECT_EQ(view->Reserve(In(u"me"), 2, nullptr), S_FALSE);
    EXPECT_EQ(view->GetReservation(In(u"me"), nullptr), S_OK);
    EXPECT_EQ(view->GetReservation(In(u"you"), nullptr), S_FALSE);
    EXPECT_EQ(view->GetReservationEx(In(u"you"), 1, nullptr), S_OK);
    EXPECT_EQ(view->GetReservationForItem(&item, nullptr), S_FALSE);
    EXPECT_EQ(view->ReserveForItem(&item, 1, nullptr), S_OK);
}

TEST_F(NodeReservations, GetReservationOfAFreeNodeGivesZero) {
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return view->GetReservation(nullptr, mode); }), "S_FALSE 0");
    EXPECT_EQ(Get(u"me"), "S_FALSE 0");
}

TEST_F(NodeReservations, GetReservationKnowsEachOwnerOfAList) {
    Reserve(u"me", 1);
    Reserve(u"you", 2);
    EXPECT_EQ(Get(u"ME"), "S_OK 1");
    EXPECT_EQ(Get(u"x, you"), "S_OK 2");
    EXPECT_EQ(Get(u"x"), "S_FALSE 0");
    EXPECT_EQ(Get(u""), "S_FALSE 0");
}

TEST_F(NodeReservations, WithoutOwnersEveryHolderCounts) {
    Reserve(u"me", 1);
    Reserve(u"you", 2);
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return view->GetReservation(nullptr, mode); }), "S_OK 3");
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return view->GetReservationEx(nullptr, 1, mode); }), "S_OK 3");
}

TEST_F(NodeReservations, GetReservationSeesWhatDependantsAreHeldIn) {
    partner->ReserveOne(u"me", 2);
    EXPECT_EQ(Get(u"me"), "S_OK 2");
}

TEST_F(NodeReservations, GetReservationExWithExceptLooksAtTheOthers) {
    Reserve(u"me", 1);
    Reserve(u"you", 2);
    EXPECT_EQ(GetEx(u"me", 1), "S_OK 2");
    EXPECT_EQ(GetEx(u"me", 0), "S_OK 1");
    EXPECT_EQ(GetEx(u"me,you", 1), "S_FALSE 0");
    EXPECT_EQ(GetEx(u"", 1), "S_OK 1");
}

TEST_F(NodeReservations, UnreserveDropsOnTheDependantsToo) {
    Reserve(u"me", 2);
    EXPECT_EQ(view->Unreserve(In(u"ME")), S_OK);
    EXPECT_EQ(Held(a), 0U);
    EXPECT_EQ(Held(partner), 0U);
    EXPECT_EQ(view->Unreserve(In(u"me")), S_FALSE);
}

TEST_F(NodeReservations, ANullOwnerIsTheEmptyName) {
    EXPECT_EQ(view->Reserve(nullptr, 2, nullptr), S_OK);
    EXPECT_EQ(Get(u""), "S_FALSE 0");
    EXPECT_EQ(view->Unreserve(In(u"")), S_OK);
}

TEST_F(NodeReservations, ReserveDescendantsWithoutATypeTakesAllBelow) {
    EXPECT_EQ(view->ReserveDescendants(In(u"me"), 2, nullptr), S_OK);
    EXPECT_EQ(Held(a), 0U);
    EXPECT_EQ(Held(b), 2U);
    EXPECT_EQ(Held(c), 2U);
    EXPECT_EQ(Held(d), 2U);
    EXPECT_EQ(view->UnreserveDescendants(In(u"me"), In(u"")), S_OK);
    EXPECT_EQ(Held(d), 0U);
    EXPECT_EQ(view->UnreserveDescendants(In(u"me"), In(u"")), S_FALSE);
}

TEST_F(NodeReservations, AChildOfAnotherTypeEndsItsBranch) {
    EXPECT_EQ(view->ReserveDescendants(In(u"me"), 2, In(u"T")), S_OK);
    EXPECT_EQ(Held(b), 2U);
    EXPECT_EQ(Held(c), 0U);
    EXPECT_EQ(Held(d), 0U);
    EXPECT_EQ(view->UnreserveDescendants(In(u"me"), In(u"U")), S_FALSE);
    EXPECT_EQ(view->UnreserveDescendants(In(u"me"), In(u"T")), S_OK);
    EXPECT_EQ(Held(b), 0U);
}

TEST_F(NodeReservations, ARefusedReserveDescendantsTakesNothing) {
    c->ReserveOne(u"other", 4);
    EXPECT_EQ(view->ReserveDescendants(In(u"me"), 2, In(u"")), S_FALSE);
    EXPECT_EQ(Held(b), 0U);
    EXPECT_EQ(Held(d), 0U);
}

TEST_F(NodeReservations, ReserveDescendantsWithNothingBelowSucceeds) {
    view = View(*b);
    EXPECT_EQ(view->ReserveDescendants(In(u"me"), 2, In(u"")), S_OK);
    EXPECT_EQ(view->UnreserveDescendants(In(u"me"), In(u"")), S_FALSE);
}

// --- By project item ---

TEST_F(NodeReservations, AnItemIsAskedWithAClearedRecordThatTellsItsSize) {
    view->ReserveForItem(&item, 1, nullptr);
    const ProjectItemRecord& record = item.received;
    EXPECT_EQ(record.size, sizeof(ProjectItemRecord));
    EXPECT_EQ(record.name, nullptr);
    EXPECT_TRUE(record.id == GUID{});
    for (const ULONG number : record.reserved1) {
        EXPECT_EQ(number, 0U);
    }
    EXPECT_EQ(record.data, nullptr);
    EXPECT_EQ(record.reserved2, 0U);
    EXPECT_EQ(item.references, 0U);
}

TEST_F(NodeReservations, AnItemHoldsUnderTheTextOfItsId) {
    EXPECT_EQ(GivenNumber([&](ULONG* granted) { return view->ReserveForItem(&item, 6, granted); }), "S_OK 6");
    EXPECT_EQ(Get(itemKey), "S_OK 6");
    EXPECT_EQ(*a->GetProperty(u"ZKHWReservation"), u"{01234567-89AB-CDEF-0123-456789ABCDEF}:=!w");
}

TEST_F(NodeReservations, WhatAnItemTellsIsFreed) {
    // The leak check of the sanitized build sees to it.
    item.givesMemory = true;
    EXPECT_EQ(view->ReserveForItem(&item, 2, nullptr), S_OK);
    EXPECT_EQ(view->UnreserveForItem(&item), S_OK);
}

TEST_F(NodeReservations, AnItemThatFailsToTellAnythingIsTheZeroId) {
    item.id = {};
    item.result = E_FAIL;
    EXPECT_EQ(view->ReserveForItem(&item, 1, nullptr), S_OK);
    EXPECT_EQ(Get(u"{00000000-0000-0000-0000-000000000000}"), "S_OK 1");
}

TEST_F(NodeReservations, ARefusedReserveForAnItemGivesZero) {
    partner->ReserveOne(u"other", 4);
    EXPECT_EQ(GivenNumber([&](ULONG* granted) { return view->ReserveForItem(&item, 1, granted); }), "S_FALSE 0");
}

TEST_F(NodeReservations, GetReservationForItemSeesThatItemAlone) {
    Reserve(u"other", 1);
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return view->GetReservationForItem(&item, mode); }), "S_FALSE 0");
    view->ReserveForItem(&item, 2, nullptr);
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return view->GetReservationForItem(&item, mode); }), "S_OK 2");
}

TEST_F(NodeReservations, GetReservationForNoItemSeesEveryOwner) {
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return view->GetReservationForItem(nullptr, mode); }), "S_FALSE 0");
    Reserve(u"other", 1);
    view->ReserveForItem(&item, 2, nullptr);
    EXPECT_EQ(GivenNumber([&](ULONG* mode) { return view->GetReservationForItem(nullptr, mode); }), "S_OK 3");
}

TEST_F(NodeReservations, UnreserveForItemDropsWhatTheItemHolds) {
    Reserve(u"other", 1);
    EXPECT_EQ(view->UnreserveForItem(&item), S_FALSE);
    view->ReserveForItem(&item, 2, nullptr);
    EXPECT_EQ(view->UnreserveForItem(&item), S_OK);
    EXPECT_EQ(Held(a), 1U);
}

TEST_F(NodeReservations, DescendantsAreReservedForAnItem) {
    EXPECT_EQ(view->ReserveDescendantsForItem(&item, 2, In(u"T")), S_OK);
    EXPECT_EQ(Held(b), 2U);
    EXPECT_EQ(Held(c), 0U);
    EXPECT_EQ(view->ReserveDescendantsForItem(&item, 2, nullptr), S_FALSE);
    EXPECT_EQ(Held(c), 0U);
}

TEST_F(NodeReservations, DescendantsAreUnreservedForAnItem) {
    view->ReserveDescendantsForItem(&item, 2, nullptr);
    EXPECT_EQ(view->UnreserveDescendantsForItem(&item, In(u"U")), S_OK);
    EXPECT_EQ(Held(b), 2U);
    EXPECT_EQ(Held(c), 0U);
    EXPECT_EQ(view->UnreserveDescendantsForItem(&item, nullptr), S_OK);
    EXPECT_EQ(Held(b), 0U);
    EXPECT_EQ(view->UnreserveDescendantsForItem(&item, nullptr), S_FALSE);
}

TEST_F(NodeReservations, NoItemReservesNothing) {
    EXPECT_EQ(GivenNumber([&](ULONG* granted) { return view->ReserveForItem(nullptr, 1, granted); }),
              "E_POINTER untouched");
    EXPECT_EQ(view->UnreserveForItem(nullptr), E_POINTER);
    EXPECT_EQ(view->ReserveDescendantsForItem(nullptr, 1, nullptr), E_POINTER);
    EXPECT_EQ(view->UnreserveDescendantsForItem(nullptr, nullptr), E_POINTER);
    EXPECT_EQ(Held(a), 0U);
}

}  // namespace
}  // namespace zkhw
