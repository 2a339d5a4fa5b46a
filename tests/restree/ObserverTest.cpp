// Observers that change the tree, and who hears of it, from inside their own notices.

#include <functional>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "support/ChangeLog.h"
#include "support/ExactText.h"
#include "support/TreeDump.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

constexpr uint32_t everything = allChanges & ~static_cast<uint32_t>(AncestorChanged | ReservationChanged);

// Root with A, A with B, B with C; the observer "o" is on A.
class Reentrancy : public ::testing::Test {
  protected:
    Reentrancy() {
        a = AddChild(*root, u"A");
        b = AddChild(*a, u"B");
        c = AddChild(*b, u"C");
        AddText(*a, u"text", u"1");
        a->AddObserver(&observer, everything, 0);
    }
    ~Reentrancy() override { observer.reaction = nullptr; }

    // Runs the action at the first notice that has one of `flags`.
    void Once(uint32_t flags, std::function<void()> action) {
        observer.reaction = [this, flags, action = std::move(action), done = false](ResTreeNode&,
                                                                                    uint32_t changes) mutable {
            if (!done && (changes & flags) != 0) {
                done = true;
                // The action may put another reaction in the place of this one.
                const std::function<void()> kept = action;
                kept();
                log.Add("  acted");
            }
        };
    }

    ChangeLog log;
    LoggingObserver observer{log, "o"};
    LoggingObserver second{log, "p"};
    std::unique_ptr<ResTreeNode> root = MakeRootNode();
    ResTreeNode* a;
    ResTreeNode* b;
    ResTreeNode* c;
};

// --- Observers that come and go ---

TEST_F(Reentrancy, ObserverThatRemovesItselfHearsNothingMoreInThatPass) {
    a->AddObserver(&observer, everything, 1000);
    Once(PropertyChanged, [this] { EXPECT_TRUE(a->RemoveObserver(&observer, -1, false)); });
    a->AddObserver(&second, everything, 0);
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n  acted\np: A PropertyChanged #0\n");
    a->SetProperty(u"text", u"3");
    EXPECT_EQ(log.Take(), "p: A PropertyChanged #0\n");
}

TEST_F(Reentrancy, ObserverThatIsAddedHearsFromTheNextPassOn) {
    Once(PropertyChanged, [this] { EXPECT_TRUE(a->AddObserver(&second, everything, 0)); });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n  acted\n");
    a->SetProperty(u"text", u"3");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\np: A PropertyChanged #0\n");
}

TEST_F(Reentrancy, ObserverThatIsAddedHearsAFurtherPassOfTheSameDispatch) {
    Once(PropertyChanged, [this] {
        a->AddObserver(&second, everything, 0);
        AddText(*a, u"more", u"1");
    });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(),
              "o: A PropertyChanged #0\n"
              "  acted\n"
              "o: A PropertyAdded #0\n"
              "p: A PropertyAdded #0\n");
}

TEST_F(Reentrancy, ObserverThatRemovesALaterOneKeepsItFromHearing) {
    a->AddObserver(&second, everything, 0);
    Once(PropertyChanged, [this] { EXPECT_TRUE(a->RemoveObserver(&second, 0, false)); });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n  acted\n");
}

TEST_F(Reentrancy, ObserverThatRemovesAnEarlierOneMissesNothing) {
    a->RemoveObserver(&observer, -1, false);
    LoggingObserver third(log, "q");
    a->AddObserver(&second, everything, 0);
    a->AddObserver(&observer, everything, 0);
    a->AddObserver(&third, everything, 0);
    Once(PropertyChanged, [this] { a->RemoveObserver(&second, 0, false); });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(),
              "p: A PropertyChanged #0\n"
              "o: A PropertyChanged #0\n"
              "  acted\n"
              "q: A PropertyChanged #0\n");
    a->RemoveObserver(&third, -1, false);
}

TEST_F(Reentrancy, ObserverThatIsRemovedAndAddedAgainWaitsForTheNextPass) {
    a->AddObserver(&second, everything, 0);
    Once(PropertyChanged, [this] {
        EXPECT_TRUE(a->RemoveObserver(&second, 0, false));
        EXPECT_TRUE(a->AddObserver(&second, everything, 0));
    });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n  acted\n");
    a->SetProperty(u"text", u"3");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\np: A PropertyChanged #0\n");
}

TEST_F(Reentrancy, ObserverThatIsAddedAndRemovedInOneNoticeMayDieAtOnce) {
    Once(PropertyChanged, [this] {
        LoggingObserver brief(log, "brief");
        a->AddObserver(&brief, everything, 0);
        a->RemoveObserver(&brief, 0, false);
    });
    a->SetProperty(u"text", u"2");
    a->SetProperty(u"text", u"3");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n  acted\no: A PropertyChanged #0\n");
}

TEST_F(Reentrancy, MaskThatIsReplacedCountsAtOnce) {
    a->AddObserver(&second, everything, 0);
    Once(PropertyChanged, [this] { EXPECT_FALSE(a->AddObserver(&second, ChildAdded, 0)); });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n  acted\n");
}

TEST_F(Reentrancy, ManyObserversAddedInANoticeAllHearTheNext) {
    std::vector<std::unique_ptr<CountingObserver>> many;
    for (int i = 0; i < 1000; ++i) {
        many.push_back(std::make_unique<CountingObserver>());
    }
    Once(PropertyChanged, [&] {
        for (const auto& counter : many) {
            a->AddObserver(counter.get(), everything, 0);
        }
    });
    a->SetProperty(u"text", u"2");
    for (const auto& counter : many) {
        EXPECT_EQ(counter->calls, 0u);
    }
    a->SetProperty(u"text", u"3");
    for (const auto& counter : many) {
        EXPECT_EQ(counter->calls, 1u);
        a->RemoveObserver(counter.get(), -1, false);
    }
}

TEST_F(Reentrancy, ObserverMayEndTheWatchOfTheNodesAboveFromInside) {
    c->AddObserver(&second, NodeNameChanged | AncestorChanged, 5);
    second.reaction = [this](ResTreeNode&, uint32_t) { c->RemoveObserver(&second, -1, false); };
    a->Rename(u"A2");
    root->Rename(u"Root2");
    EXPECT_EQ(log.Take(), "o: A2 NodeNameChanged #0\np: C NodeNameChanged #5\n");
}

TEST_F(Reentrancy, ObserverMayBeginToWatchTheNodesAboveFromInside) {
    Once(NodeNameChanged, [this] { c->AddObserver(&second, NodeNameChanged | AncestorChanged, 5); });
    a->Rename(u"A2");
    EXPECT_EQ(log.Take(), "o: A2 NodeNameChanged #0\n  acted\n");
    a->Rename(u"A3");
    EXPECT_EQ(log.Take(), "o: A3 NodeNameChanged #0\np: C NodeNameChanged #5\n");
    c->RemoveObserver(&second, -1, false);
}

// --- Observers that change the tree ---

TEST_F(Reentrancy, ObserverMayRemoveTheNodeItself) {
    a->AddObserver(&second, everything, 0);
    Once(PropertyChanged, [this] { root->RemoveEntryByName(u"A"); });
    a->SetProperty(u"text", u"2");
    // The node is held back while it tells of a change, so its removal is silent.
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n  acted\n");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST_F(Reentrancy, ObserverMayRemoveTheNodesParent) {
    b->AddObserver(&second, PropertyAdded, 0);
    second.reaction = [this](ResTreeNode&, uint32_t) { root->RemoveEntryByName(u"A"); };
    AddText(*b, u"x", u"1");
    EXPECT_EQ(log.Take(),
              "p: B PropertyAdded #0\n"
              "o: A NodeDeleting #0\n"
              "o: A ChildRemoved #0\n"
              "o: A NodeDeleted #0\n"
              "o: A PropertyRemoved #0\n");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST_F(Reentrancy, ObserverMayRemoveAChildOfTheNode) {
    Once(PropertyChanged, [this] { a->RemoveChildNodes(); });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n  acted\no: A ChildRemoved #0\n");
    EXPECT_EQ(DumpTree(*a), "A:T\n  text=2\n");
}

TEST_F(Reentrancy, ObserverMayRemoveAWatchingChildAndThenTheNode) {
    c->AddObserver(&second, NodeNameChanged | AncestorChanged, 5);
    Once(NodeNameChanged, [this] {
        a->RemoveEntryByName(u"B");
        root->RemoveEntryByName(u"A2");
    });
    a->Rename(u"A2");
    EXPECT_EQ(log.Take(), "o: A2 NodeNameChanged #0\n  acted\n");
}

TEST_F(Reentrancy, ObserverMayRemoveTheEntryThatWasJustAdded) {
    Once(PropertyAdded, [this] { a->RemoveEntryByName(u"new"); });
    const ResTreeNode::Added added = AddText(*a, u"new", u"1");
    EXPECT_TRUE(added.isNew);
    EXPECT_EQ(log.Take(), "o: A PropertyAdded #0\n  acted\no: A PropertyRemoved #0\n");
    EXPECT_TRUE(a->FindEntryRaw(u"new").IsEnd());
}

TEST_F(Reentrancy, ObserverMayRemoveTheChildThatWasJustAdded) {
    Once(ChildAdded, [this] { a->RemoveEntryByName(u"new"); });
    ResTreeNode* child = nullptr;
    EXPECT_TRUE(a->AddChildEntry(u"new", u"T", false, child).isNew);
    EXPECT_EQ(DumpTree(*a), "A:T\n  B:T\n    C:T\n  text=1\n");
}

TEST_F(Reentrancy, ObserverMayRemoveTheNodeWhoseDisplayNameChanges) {
    AddText(*a, u"DisplayName", u"1");
    log.Take();
    Once(PropertyChanged, [this] { root->RemoveEntryByName(u"A"); });
    root->AddObserver(&second, everything, 0);
    EXPECT_TRUE(a->SetProperty(u"DisplayName", u"2"));
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\np: Root ChildRemoved #0\n  acted\n");
}

TEST_F(Reentrancy, ObserverMayRemoveTheNodeThatIsRenamed) {
    Once(NodeNameChanged, [this] { root->RemoveEntryByName(u"New"); });
    root->AddObserver(&second, everything, 0);
    EXPECT_TRUE(a->Rename(u"New"));
    EXPECT_EQ(log.Take(), "o: New NodeNameChanged #0\np: Root ChildRemoved #0\n  acted\n");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST_F(Reentrancy, ObserverMayRenameTheNodeInANoticeOfItsName) {
    Once(NodeNameChanged, [this] { a->Rename(u"Third"); });
    root->AddObserver(&second, everything, 0);
    a->Rename(u"Second");
    EXPECT_EQ(log.Take(),
              "o: Second NodeNameChanged #0\n"
              "p: Root ChildNameChanged #0\n"
              "  acted\n"
              "o: Third NodeNameChanged #0\n"
              "p: Root ChildNameChanged #0\n");
}

TEST_F(Reentrancy, ObserverMayChangeAnotherNodeWhichTellsAtOnce) {
    b->AddObserver(&second, everything, 0);
    Once(PropertyChanged, [this] { AddText(*b, u"x", u"1"); });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\np: B PropertyAdded #0\n  acted\n");
}

TEST_F(Reentrancy, ObserverMayHoldTheNodeBackFromInside) {
    Once(PropertyChanged, [this] {
        const uint32_t saved = a->BeginChanges();
        AddText(*a, u"x", u"1");
        AddChild(*a, u"y");
        a->EndChanges(saved, false);
    });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n  acted\no: A PropertyAdded|ChildAdded #0\n");
}

// --- During a removal ---

TEST_F(Reentrancy, ObserverMayRemoveTheNodeAgainWhileItIsRemoved) {
    Once(NodeDeleting, [this] { root->RemoveEntryByName(u"A"); });
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(log.Take(), "o: A NodeDeleting #0\n  acted\n");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST_F(Reentrancy, ObserverMayRemoveTheNodeAgainAtItsEnd) {
    Once(NodeDeleted, [this] { root->RemoveEntryByName(u"A"); });
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(log.Take(), "o: A NodeDeleting #0\no: A ChildRemoved #0\no: A NodeDeleted #0\n  acted\n");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST_F(Reentrancy, ObserverMayRemoveTheParentWhileANodeIsRemoved) {
    b->AddObserver(&second, NodeDeleting | NodeDeleted, 0);
    second.reaction = [this](ResTreeNode&, uint32_t) { root->RemoveEntryByName(u"A"); };
    a->RemoveEntryByName(u"B");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
    EXPECT_EQ(log.Take(),
              "p: B NodeDeleting #0\n"
              "o: A NodeDeleting #0\n"
              "o: A ChildRemoved #0\n"
              "o: A NodeDeleted #0\n"
              "o: A PropertyRemoved #0\n");
}

TEST_F(Reentrancy, ObserverMayRemoveAChildWhileTheNodeIsRemoved) {
    Once(NodeDeleting, [this] { a->RemoveChildNodes(); });
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(log.Take(),
              "o: A NodeDeleting #0\n"
              "  acted\n"
              "o: A ChildRemoved #0\n"
              "o: A NodeDeleted #0\n"
              "o: A PropertyRemoved #0\n");
}

TEST_F(Reentrancy, ObserverMayRemoveASiblingThatIsStillToBeRemoved) {
    ResTreeNode* first = AddChild(*b, u"1");
    AddChild(*b, u"2");
    log.Take();
    first->AddObserver(&second, NodeDeleting, 0);
    second.reaction = [this](ResTreeNode&, uint32_t) { b->RemoveEntryByName(u"2"); };
    a->RemoveChildNodes();
    EXPECT_EQ(log.Take(), "p: 1 NodeDeleting #0\no: A ChildRemoved #0\n");
    EXPECT_EQ(DumpTree(*a), "A:T\n  text=1\n");
}

TEST_F(Reentrancy, ObserverMayAddAChildToTheNodeThatIsRemoved) {
    Once(NodeDeleting | NodeDeleted, [this] { AddText(*AddChild(*a, u"late"), u"x", u"1"); });
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST_F(Reentrancy, ObserverMayAddAChildAtTheVeryEnd) {
    Once(NodeDeleted, [this] { AddText(*AddChild(*a, u"late"), u"x", u"1"); });
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST_F(Reentrancy, ObserverMayAddToANodeWhoseTextsAreGoing) {
    Once(PropertyRemoved, [this] {
        AddText(*a, u"late", u"1");
        AddChild(*a, u"later");
    });
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST_F(Reentrancy, ObserverMayLoseTheNodeThatIsRemovedByRenamingItOverASibling) {
    for (const int siblings : {1, 100}) {
        LoggingObserver watcher(log, "w");
        const auto top = MakeRootNode();
        for (int i = 0; i < siblings; ++i) {
            const std::string number = std::to_string(i);
            AddChild(*top, (u"s" + std::u16string(number.begin(), number.end())).c_str());
        }
        ResTreeNode* node = AddChild(*top, u"x");
        AddChild(*node, u"below");
        watcher.reaction = [](ResTreeNode& removed, uint32_t) { EXPECT_FALSE(removed.Rename(u"s0")); };
        node->AddObserver(&watcher, NodeDeleting, 0);
        top->RemoveEntryByName(u"x");
        EXPECT_EQ(log.Take(), "w: x NodeDeleting #0\n");
        EXPECT_TRUE(top->FindEntryRaw(u"x").IsEnd());
        EXPECT_FALSE(top->FindEntryRaw(u"s0").IsEnd());
    }
}

TEST_F(Reentrancy, ObserverMayLoseAChildWhileAllChildrenAreRemoved) {
    const auto top = MakeRootNode();
    ResTreeNode* first = AddChild(*top, u"1");
    ResTreeNode* last = AddChild(*top, u"3");
    AddChild(*top, u"2");
    first->AddObserver(&second, NodeDeleting, 0);
    second.reaction = [last](ResTreeNode&, uint32_t) { EXPECT_FALSE(last->Rename(u"2")); };
    top->RemoveChildNodes();
    EXPECT_EQ(DumpTree(*top), "Root:Root\n");
}

TEST_F(Reentrancy, ObserverOfADyingRootMayChangeIt) {
    second.reaction = [this](ResTreeNode& dying, uint32_t changes) {
        if ((changes & PropertyRemoved) != 0) {
            dying.RemoveChildNodes();
        }
    };
    AddText(*root, u"0", u"first to go");
    root->AddObserver(&second, everything, 0);
    root.reset();
    EXPECT_EQ(log.Take(),
              "p: Root PropertyRemoved #0\n"
              "o: A NodeDeleting #0\n"
              "o: A ChildRemoved #0\n"
              "o: A NodeDeleted #0\n"
              "o: A PropertyRemoved #0\n"
              "p: Root ChildRemoved #0\n");
}

TEST_F(Reentrancy, ObserverOfADyingNodeMayWatchItAgain) {
    Once(PropertyRemoved, [this] {
        a->AddObserver(&second, everything | AncestorChanged | ReservationChanged, 0);
        root->AddObserver(&second, everything, 0);
    });
    root->RemoveEntryByName(u"A");
    log.Take();
    AddText(*root, u"x", u"1");
    EXPECT_EQ(log.Take(), "p: Root PropertyAdded #0\n");
}

TEST_F(Reentrancy, OwnedObserverMayDieWhileItsNodeTells) {
    b->AddObserver(new LoggingObserver(log, "owned", true), PropertyAdded, 0);
    b->AddObserver(&second, PropertyAdded, 0);
    second.reaction = [this](ResTreeNode&, uint32_t) { a->RemoveEntryByName(u"B"); };
    AddText(*b, u"x", u"1");
    EXPECT_EQ(log.Take(),
              "owned: B PropertyAdded #0\n"
              "p: B PropertyAdded #0\n"
              "owned: gone\n"
              "o: A ChildRemoved #0\n");
}

// --- Dispatch from inside a dispatch ---

TEST_F(Reentrancy, DispatchFromInsideLeavesNobodyOut) {
    LoggingObserver third(log, "q");
    a->AddObserver(&second, everything, 0);
    a->AddObserver(&third, everything, 0);
    Once(PropertyChanged, [this] {
        a->RemoveObserver(&observer, 0, false);
        AddText(*a, u"x", u"1");
        a->DispatchChanges(allChanges);
    });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(),
              "o: A PropertyChanged #0\n"
              "p: A PropertyAdded #0\n"
              "q: A PropertyAdded #0\n"
              "  acted\n"
              "p: A PropertyChanged #0\n"
              "q: A PropertyChanged #0\n");
    a->RemoveObserver(&third, -1, false);
}

TEST_F(Reentrancy, EndWithoutABeginFromInsideDeliversAtOnce) {
    Once(PropertyChanged, [this] {
        AddText(*a, u"x", u"1");
        // The dispatch itself counts as one that holds back.
        a->EndChanges(0, false);
    });
    a->SetProperty(u"text", u"2");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\no: A PropertyAdded #0\n  acted\n");
    a->SetProperty(u"text", u"3");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n");
}

TEST_F(Reentrancy, DispatchFromInsideDoesNotOpenACycleAgain) {
    AddText(*a, u"Reserves", u"../D");
    ResTreeNode* d = AddChild(*root, u"D");
    AddText(*d, u"Reserves", u"../A");
    log.Take();
    a->AddObserver(&second, ReservationChanged, 5);
    int calls = 0;
    second.reaction = [&](ResTreeNode& node, uint32_t) {
        ++calls;
        if (calls < 100) {
            node.DispatchChanges(allChanges);
        }
    };
    const uint32_t saved = a->BeginChanges();
    a->EndChanges(saved | ReservationChanged, true);
    EXPECT_EQ(calls, 1);
    a->RemoveObserver(&second, -1, false);
}

// --- Observers that throw ---

class Throwing : public Reentrancy {
  protected:
    // Throws at the first notice that has one of `flags`.
    void ThrowOnce(uint32_t flags) {
        observer.reaction = [flags, done = false](ResTreeNode&, uint32_t changes) mutable {
            if (!done && (changes & flags) != 0) {
                done = true;
                throw std::runtime_error("thrown by an observer");
            }
        };
    }
};

TEST_F(Throwing, ExceptionPassesThroughToTheChange) {
    ThrowOnce(PropertyChanged);
    EXPECT_THROW(a->SetProperty(u"text", u"2"), std::runtime_error);
    EXPECT_EQ(DumpTree(*a), "A:T\n  B:T\n    C:T\n  text=2\n");
}

TEST_F(Throwing, NodeStaysHeldBackUntilABracketIsClosed) {
    ThrowOnce(PropertyChanged);
    EXPECT_THROW(a->SetProperty(u"text", u"2"), std::runtime_error);
    log.Take();
    AddText(*a, u"x", u"1");
    EXPECT_EQ(log.Take(), "");
    EXPECT_FALSE(a->HasNoPendingChanges());
    a->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "o: A PropertyAdded #0\n");
    a->SetProperty(u"text", u"3");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n");
}

TEST_F(Throwing, WhatWasToBeDeliveredIsLost) {
    ThrowOnce(PropertyChanged);
    a->AddObserver(&second, everything, 0);
    EXPECT_THROW(a->SetProperty(u"text", u"2"), std::runtime_error);
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #0\n");
    EXPECT_TRUE(a->HasNoPendingChanges());
    a->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(Throwing, RecordsAddedAfterwardsWaitForTheNextPass) {
    // The node still counts as one that is telling.
    ThrowOnce(PropertyChanged);
    EXPECT_THROW(a->SetProperty(u"text", u"2"), std::runtime_error);
    log.Take();
    a->AddObserver(&second, everything, 0);
    AddText(*a, u"x", u"1");
    a->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "o: A PropertyAdded #0\n");
    AddText(*a, u"y", u"1");
    EXPECT_EQ(log.Take(), "o: A PropertyAdded #0\np: A PropertyAdded #0\n");
}

TEST_F(Throwing, WatchingNodesStayHeldBackToo) {
    c->AddObserver(&second, NodeNameChanged | AncestorChanged, 5);
    second.reaction = [](ResTreeNode&, uint32_t) { throw std::runtime_error("thrown by an observer"); };
    for (int i = 0; i < 3; ++i) {
        EXPECT_THROW(a->Rename(u"A2"), std::runtime_error);
        log.Take();
        // A, B and C are all in the midst of telling; what they hear now waits.
        root->Rename(u"Root2");
        a->Rename(u"A3");
        EXPECT_EQ(log.Take(), "");
        EXPECT_FALSE(a->HasNoPendingChanges());
        EXPECT_TRUE(b->HasNoPendingChanges());
        b->OnNodeChanged(a, NodeNameChanged, 1);
        EXPECT_FALSE(b->HasNoPendingChanges());
        EXPECT_EQ(log.Take(), "");
        second.reaction = nullptr;
        c->EndChanges(0, true);
        b->EndChanges(0, false);
        EXPECT_EQ(log.Take(), "p: C NodeNameChanged #5\n");
        a->EndChanges(0, false);
        EXPECT_EQ(log.Take(), "o: A3 NodeNameChanged #0\np: C NodeNameChanged #5\n");
        second.reaction = [](ResTreeNode&, uint32_t) { throw std::runtime_error("thrown by an observer"); };
    }
    second.reaction = nullptr;
    c->RemoveObserver(&second, -1, false);
}

TEST_F(Throwing, NodeWhoseObserverThrowsAtItsRemovalStays) {
    ThrowOnce(NodeDeleting);
    EXPECT_THROW(root->RemoveEntryByName(u"A"), std::runtime_error);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  A:T\n    B:T\n      C:T\n    text=1\n");
}

TEST_F(Throwing, NodeWhoseObserverThrowsAtItsEndHasLostItsChildren) {
    ThrowOnce(NodeDeleted);
    EXPECT_THROW(root->RemoveEntryByName(u"A"), std::runtime_error);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  A:T\n    text=1\n");
}

TEST_F(Throwing, HeldBackNodeThrowsAtTheEndOfTheBracket) {
    ThrowOnce(PropertyChanged);
    a->BeginChanges();
    a->SetProperty(u"text", u"2");
    EXPECT_THROW(a->EndChanges(0, false), std::runtime_error);
}

}  // namespace
}  // namespace zkhw
