// Reservations when there is no memory. The ordinary heap takes part in the failures.

#include <algorithm>
#include <functional>
#include <memory>
#include <new>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "restree/ReservedTree.h"
#include "support/AllocationFaultScope.h"
#include "support/ChangeLog.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

// Runs `work` with each allocation failing in turn, on a fresh tree each time, until it comes through. After each
// failure every node shows just what it holds, and once all is released the tree is as at the start.
void FailEachAllocation(const std::function<void(ResTreeNode&)>& work) {
    bool isDone = false;
    uint64_t failures = 0;
    for (uint64_t nth = 1; !isDone; ++nth) {
        ASSERT_LT(nth, 10'000u);
        const auto root = MakeRootNode(true);
        for (const char16_t* name : {u"A", u"B", u"C"}) {
            AddChild(*root, name);
        }
        AddText(*root->Lookup(u"B", nullptr), u"Reserves", u"../A,../C");
        root->Lookup(u"A", nullptr)->ReserveOne(u"first", ReserveRead);
        // It needs no memory itself: a throw from an observer leaves its node held back.
        CountingObserver observer;
        root->Lookup(u"C", nullptr)->AddObserver(&observer, ReservationChanged, 7);
        try {
            const support::AllocationFaultScope faults(nth);
            work(*root);
            // A failure may also have been overcome: a text that can't grow ahead grows as far as it must.
            isDone = qn::dsc::osdep::AllocationCount() < nth;
        } catch (const std::bad_alloc&) {
            ++failures;
        }
        for (const char16_t* name : {u"A", u"B", u"C"}) {
            ResTreeNode& node = *root->Lookup(name, nullptr);
            std::string expected;
            for (const Reservation& record : node.GetReservations()) {
                expected += (expected.empty() ? "" : ",") + qn::dsc::ExactText(record.owner) +
                            (record.mode == 1   ? ":=r"
                             : record.mode == 2 ? ":=w"
                                                : ":=!");
            }
            EXPECT_EQ(ReservationText(node), expected.empty() ? "(none)" : expected) << nth;
            for (const char16_t* owner : {u"first", u"a", u"b", u"c"}) {
                node.ReleaseOne(owner);
            }
            EXPECT_EQ(ReservationText(node), "(none)") << nth;
        }
        // A notice that could not be delivered waits for the next change, and comes ahead of its notice.
        ResTreeNode& watched = *root->Lookup(u"C", nullptr);
        const uint64_t waiting = watched.HasNoPendingChanges() ? 0 : 1;
        observer.calls = 0;
        watched.ReserveOne(u"a", ReserveRead);
        EXPECT_EQ(observer.calls, waiting + 1) << nth;
        EXPECT_TRUE(watched.HasNoPendingChanges()) << nth;
        root->RemoveObserver(&observer, -1, true);
    }
    EXPECT_GT(failures, 50u);
}

TEST(ReservationsWithoutMemory, LeaveEachNodeInOrder) {
    FailEachAllocation([](ResTreeNode& root) {
        ResTreeNode& b = *root.Lookup(u"B", nullptr);
        b.Reserve(u"a", ReserveRead);
        b.Reserve(u"A", ReserveWrite);
        b.Reserve(u"b", ReserveRead);
        b.Release(u"a");
        b.Reserve(u"c", ReserveExclusive);
        b.Reserve(u"a", ReserveRead);
        b.Release(u"c");
    });
}

TEST(ReservationsWithoutMemory, LeaveEachDescendantInOrder) {
    FailEachAllocation([](ResTreeNode& root) {
        root.ReserveAll(u"a", ReserveRead, u"");
        root.ReserveAll(u"b", ReserveWrite, u"");
        root.ReleaseAll(u"a", u"");
        std::vector<String> owners;
        root.GetReservationOwners(owners, true);
        root.GetReservationFlags(nullptr, false);
    });
}

TEST(ReservationsWithoutMemory, KeepManyOwners) {
    bool isDone = false;
    for (uint64_t nth = 1; !isDone; ++nth) {
        ASSERT_LT(nth, 1000u);
        const auto root = MakeRootNode();
        for (char16_t name = u'a'; name <= u'z'; ++name) {
            root->ReserveOne(String(1, name), ReserveRead);
        }
        const std::string before = ReservationText(*root);
        bool isReserved = false;
        bool isReleased = false;
        try {
            const support::AllocationFaultScope faults(nth);
            isReserved = root->ReserveOne(u"new", ReserveWrite) == 3;
            isReleased = root->ReleaseOne(u"b");
            isDone = qn::dsc::osdep::AllocationCount() < nth;
        } catch (const std::bad_alloc&) {
            // What failed is as if it had not been begun.
            isDone = false;
        }
        const std::string expected =
            (isReleased ? "a:=r," + before.substr(10) : before) + (isReserved ? ",new:=w" : "");
        EXPECT_EQ(ReservationText(*root), expected) << nth;
        EXPECT_EQ(root->GetReservations().size(),
                  static_cast<size_t>(std::count(expected.begin(), expected.end(), '=')));
    }
}

TEST(ReservationsWithoutMemory, KeepWhatIsHeldWhileTheTextCannotBeMade) {
    const auto root = MakeRootNode();
    root->ReserveOne(u"a", ReserveRead);
    root->RemoveEntryByName(u"ZKHWReservation");
    uint64_t failures = 0;
    while (ReservationText(*root) == "(none)") {
        ASSERT_LT(failures, 1000u);
        try {
            const support::AllocationFaultScope faults(failures + 1);
            root->RefreshReservationProperty();
        } catch (const std::bad_alloc&) {
            ++failures;
            EXPECT_EQ(ReservationText(*root), "(none)") << failures;
            EXPECT_EQ(root->GetReservations().size(), 1u) << failures;
        }
    }
    EXPECT_GT(failures, 0u);
    EXPECT_EQ(ReservationText(*root), "a:=r");
}

}  // namespace
}  // namespace zkhw
