// Notices, the end of registrations and the end of nodes when there is no memory. The ordinary heap takes part in the
// failures.

#include <cstdlib>
#include <memory>
#include <new>

#include <gtest/gtest.h>

#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "support/AllocationFaultScope.h"
#include "support/ChangeLog.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

using support::AllocationFaultScope;

constexpr uint32_t everything = 0xFFFFFFFF;

// Counts its calls and, if it goes with its node, its ends; needs no memory.
class Counter : public ResTreeNodeChangeObserver {
  public:
    explicit Counter(int* ends = nullptr) : ends(ends) {}
    ~Counter() override {
        if (ends != nullptr) {
            ++*ends;
        }
    }
    void OnNodeChanged(ResTreeNode*, uint32_t, int32_t) override { ++calls; }
    bool DeleteWithNode() override { return ends != nullptr; }

    int calls = 0;

  private:
    int* ends;
};

// Root, and below it a chain of nodes of which the last is watched; it watches the names of all above.
class Chain {
  public:
    explicit Chain(int length) {
        for (int i = 0; i < length; ++i) {
            last = AddChild(*last, u"Next");
            AddText(*last, u"Text", u"1");
        }
        last->AddObserver(&counter, everything & ~uint32_t{ReservationChanged}, 0);
        counter.calls = 0;
    }
    ~Chain() { last->RemoveObserver(&counter, -1, false); }

    Counter counter;
    const std::unique_ptr<ResTreeNode> root = MakeRootNode();
    ResTreeNode* last = root.get();
};

// More nodes than a run of notices has room for without the heap.
TEST(NoticesWithoutMemory, HoldNoNodeBack) {
    bool isDone = false;
    uint64_t failures = 0;
    for (uint64_t nth = 1; !isDone; ++nth) {
        ASSERT_LT(nth, 1000U);
        Chain chain(40);
        try {
            const AllocationFaultScope fault(nth, true);
            chain.root->Rename(u"O");
            isDone = qn::dsc::osdep::AllocationCount() < nth;
        } catch (const std::bad_alloc&) {
            ++failures;
        }
        chain.counter.calls = 0;
        chain.root->Rename(u"Once more");
        EXPECT_EQ(chain.counter.calls, 1) << nth;
        for (const ResTreeNode* node = chain.last; node != nullptr; node = node->GetParent()) {
            EXPECT_TRUE(node->HasNoPendingChanges()) << nth;
        }
    }
    EXPECT_GT(failures, 1U);
}

TEST(NoticesWithoutMemory, AreDeliveredOverAFewNodes) {
    Chain chain(3);
    const AllocationFaultScope fault(1, true);
    chain.root->Raise(NodeNameChanged);
    EXPECT_EQ(chain.counter.calls, 1);
}

TEST(RegistrationsWithoutMemory, CanBeEnded) {
    for (uint64_t nth = 1; nth <= 20; ++nth) {
        const auto root = MakeRootNode(true);
        ResTreeNode* const a = AddChild(*root, u"A");
        ResTreeNode* const b = AddChild(*a, u"B");
        AddText(*b, u"Reserves", u"/A");
        Counter above;
        Counter counter;
        a->AddObserver(&above, NodeNameChanged, 3);
        b->AddObserver(&counter, everything, 0);
        {
            const AllocationFaultScope fault(nth, true);
            EXPECT_TRUE(b->RemoveObserver(&counter, 0, false)) << nth;
        }
        // B watches nothing above any more, so A doesn't pass on what it hears.
        above.calls = 0;
        root->Rename(u"Other");
        EXPECT_EQ(above.calls, 0) << nth;
        b->SetProperty(u"Text", u"2");
        EXPECT_EQ(counter.calls, 0) << nth;
        a->RemoveObserver(&above, -1, false);
    }
}

// A subtree of nodes that are watched, some by what goes with them, with links and a name that was lost.
std::unique_ptr<ResTreeNode> MakeWatchedTree(Counter& counter, int& ends) {
    auto root = MakeRootNode();
    for (const char16_t* name : {u"A", u"B", u"C"}) {
        ResTreeNode* const child = AddChild(*root, name);
        AddText(*child, u"Text", u"1");
        AddLink(*child, u"Link", u"../B");
        ResTreeNode* const deep = AddChild(*AddChild(*child, u"Below"), u"Deep");
        deep->AddObserver(&counter, everything, 0);
        auto* const owned = new Counter(&ends);
        for (int32_t context = 0; context < 3; ++context) {
            child->AddObserver(owned, everything, context);
        }
    }
    // What stood under the name is lost.
    root->RenameEntry(u"A", u"B");
    return root;
}

TEST(NodesWithoutMemory, EndWithAllBelow) {
    for (const bool fromThenOn : {false, true}) {
        for (uint64_t nth = 1; nth <= 40; ++nth) {
            Counter counter;
            int ends = 0;
            auto root = MakeWatchedTree(counter, ends);
            {
                const AllocationFaultScope fault(nth, fromThenOn);
                root.reset();
            }
            EXPECT_EQ(ends, 3) << nth;
        }
    }
}

// An observer may give back the last view of a copy.
TEST(NodesWithoutMemory, EndAsRootsInsideAnOperation) {
    for (const bool isWatched : {true, false}) {
        for (uint64_t nth = 1; nth <= 40; ++nth) {
            Counter counter;
            int ends = 0;
            auto root = isWatched ? MakeWatchedTree(counter, ends) : MakeRootNode();
            AddText(*AddChild(*root, u"D"), u"Text", u"1");
            const ReleaseScope scope;
            const AllocationFaultScope fault(nth, true);
            ResTreeNode::Destroy(root.release());
        }
    }
}

// Further up the stack something may still hold what goes.
TEST(NodesWithoutMemory, EndInsideAnOperation) {
    for (const bool fromThenOn : {false, true}) {
        for (uint64_t nth = 1; nth <= 60; ++nth) {
            Counter counter;
            int ends = 0;
            const auto root = MakeWatchedTree(counter, ends);
            const ReleaseScope scope;
            for (const char16_t* name : {u"B", u"C"}) {
                try {
                    const AllocationFaultScope fault(nth, fromThenOn);
                    root->RemoveEntryByName(name);
                } catch (const std::bad_alloc&) {
                    root->RemoveEntryByName(name);
                }
                EXPECT_EQ(root->FindRaw(name), nullptr) << nth;
            }
        }
    }
}

}  // namespace
}  // namespace zkhw
