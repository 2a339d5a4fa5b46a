#include <cstdint>
#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "support/ChangeLog.h"
#include "support/ExactText.h"
#include "support/TreeDump.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

constexpr uint32_t everything = allChanges & ~static_cast<uint32_t>(AncestorChanged | ReservationChanged);

// A root with one watched child, "A", and observers of both that log all that is raised on the node itself.
class NodeChanges : public ::testing::Test {
  protected:
    NodeChanges() : root(MakeRootNode()), node(AddChild(*root, u"A")) {
        root->AddObserver(&rootWatcher, everything, 0);
        node->AddObserver(&watcher, everything, 0);
    }

    ChangeLog log;
    LoggingObserver rootWatcher{log, "r"};
    LoggingObserver watcher{log, "a"};
    std::unique_ptr<ResTreeNode> root;
    ResTreeNode* node;
};

// --- What is raised where ---

TEST_F(NodeChanges, AddingATextRaisesPropertyAdded) {
    AddText(*node, u"x", u"1");
    AddText(*node, u"y", u"1", LocalizedTextEntry);
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\na: A PropertyAdded #0\n");
}

TEST_F(NodeChanges, AddingALinkOrAChildRaisesChildAdded) {
    AddLink(*node, u"x", u"/");
    AddChild(*node, u"y");
    EXPECT_EQ(log.Take(), "a: A ChildAdded #0\na: A ChildAdded #0\n");
}

TEST_F(NodeChanges, AddingWhatIsThereRaisesNothing) {
    AddText(*node, u"x", u"1");
    log.Take();
    AddText(*node, u"X", u"2");
    AddLink(*node, u"X", u"2");
    AddChild(*node, u"X");
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeChanges, InsertEntryRaisesNothing) {
    node->InsertEntry(node->End(), u"x", TextEntry, u"1");
    node->InsertEntry(node->End(), u"y", std::make_unique<ResTreeNode>(u"y", u"T", false, noTable));
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeChanges, SettingAPropertyRaisesPropertyAddedThenPropertyChanged) {
    node->SetProperty(u"x", u"1");
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\n");
    node->SetProperty(u"x", u"2");
    EXPECT_EQ(log.Take(), "a: A PropertyChanged #0\n");
}

TEST_F(NodeChanges, SettingTheSameValueIsAChange) {
    node->SetProperty(u"x", u"1");
    log.Take();
    node->SetProperty(u"x", u"1");
    EXPECT_EQ(log.Take(), "a: A PropertyChanged #0\n");
}

TEST_F(NodeChanges, SettingALinkRaisesNothing) {
    AddLink(*node, u"x", u"/");
    log.Take();
    EXPECT_FALSE(node->SetProperty(u"x", u"1"));
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeChanges, SettingTheDisplayNameInAnyCaseIsAChangeOfName) {
    AddText(*node, u"dIsPlAyNaMe", u"1");
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\n");
    node->SetProperty(u"displayname", u"2");
    EXPECT_EQ(log.Take(),
              "a: A PropertyChanged #0\n"
              "a: A NodeNameChanged #0\n"
              "r: Root ChildNameChanged #0\n");
}

TEST_F(NodeChanges, SettingTheDisplayNameOfARootHasNoParentToTell) {
    AddText(*root, u"DisplayName", u"1");
    log.Take();
    root->SetProperty(u"DisplayName", u"2");
    EXPECT_EQ(log.Take(), "r: Root PropertyChanged #0\nr: Root NodeNameChanged #0\n");
}

TEST_F(NodeChanges, RenamingRaisesNodeNameChangedThenChildNameChanged) {
    node->Rename(u"B");
    EXPECT_EQ(log.Take(), "a: B NodeNameChanged #0\nr: Root ChildNameChanged #0\n");
}

TEST_F(NodeChanges, RenamingThatFailsRaisesNothing) {
    AddChild(*root, u"B");
    log.Take();
    EXPECT_FALSE(node->Rename(u"B"));
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeChanges, RenamingAnEntryRaisesNothing) {
    EXPECT_TRUE(root->RenameEntry(u"A", u"B"));
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeChanges, RemovingATextOrALinkRaisesOneFlag) {
    AddText(*node, u"x", u"1");
    AddText(*node, u"y", u"1", LocalizedTextEntry);
    AddLink(*node, u"z", u"/");
    log.Take();
    node->RemoveEntryByName(u"x");
    node->RemoveEntryByName(u"y");
    node->RemoveEntryByName(u"z");
    EXPECT_EQ(log.Take(), "a: A PropertyRemoved #0\na: A PropertyRemoved #0\na: A ChildRemoved #0\n");
}

// --- Masks and contexts ---

TEST_F(NodeChanges, ObserverHearsOnlyOfItsMask) {
    LoggingObserver other(log, "o");
    node->AddObserver(&other, PropertyChanged | ChildAdded, 5);
    node->RemoveObserver(&watcher, -1, false);
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "");
    node->SetProperty(u"x", u"2");
    EXPECT_EQ(log.Take(), "o: A PropertyChanged #5\n");
    node->RemoveObserver(&other, -1, false);
}

TEST_F(NodeChanges, ObserverGetsTheWholeSetThatIsDelivered) {
    LoggingObserver other(log, "o");
    node->AddObserver(&other, ChildAdded, 5);
    node->RemoveObserver(&watcher, -1, false);
    node->BeginChanges();
    AddText(*node, u"x", u"1");
    AddChild(*node, u"y");
    node->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "o: A PropertyAdded|ChildAdded #5\n");
    node->RemoveObserver(&other, -1, false);
}

TEST_F(NodeChanges, ObserversAreCalledInTheOrderOfTheirRegistration) {
    LoggingObserver second(log, "b");
    LoggingObserver third(log, "c");
    node->AddObserver(&second, everything, 1000);
    node->AddObserver(&third, everything, -7);
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\nb: A PropertyAdded #1000\nc: A PropertyAdded #-7\n");
    node->RemoveObserver(&second, -1, false);
    node->RemoveObserver(&third, -1, false);
}

TEST_F(NodeChanges, SecondRegistrationReplacesTheMaskAndKeepsThePlace) {
    LoggingObserver second(log, "b");
    EXPECT_TRUE(node->AddObserver(&second, everything, 0));
    EXPECT_FALSE(node->AddObserver(&watcher, PropertyAdded, 0));
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\nb: A PropertyAdded #0\n");
    node->SetProperty(u"x", u"2");
    EXPECT_EQ(log.Take(), "b: A PropertyChanged #0\n");
    node->RemoveObserver(&second, 0, false);
}

TEST_F(NodeChanges, OtherContextIsAnotherRegistration) {
    EXPECT_TRUE(node->AddObserver(&watcher, everything, 3));
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\na: A PropertyAdded #3\n");
    EXPECT_TRUE(node->RemoveObserver(&watcher, 3, false));
    AddText(*node, u"y", u"1");
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\n");
}

TEST_F(NodeChanges, RegistrationForAnyContextFindsAnExistingOne) {
    EXPECT_FALSE(node->AddObserver(&watcher, PropertyChanged, -1));
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "");
    node->SetProperty(u"x", u"2");
    EXPECT_EQ(log.Take(), "a: A PropertyChanged #0\n");
}

TEST_F(NodeChanges, RemovalForAnyContextTakesAll) {
    node->AddObserver(&watcher, everything, 3);
    node->AddObserver(&watcher, everything, 4);
    EXPECT_TRUE(node->RemoveObserver(&watcher, -1, false));
    EXPECT_FALSE(node->RemoveObserver(&watcher, -1, false));
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeChanges, RemovalOfAnUnknownObserverOrContextIsFalse) {
    LoggingObserver other(log, "o");
    EXPECT_FALSE(node->RemoveObserver(&other, -1, false));
    EXPECT_FALSE(node->RemoveObserver(&watcher, 9, false));
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\n");
}

TEST_F(NodeChanges, RecursiveRemovalReachesAllChildNodes) {
    ResTreeNode* deep = AddChild(*AddChild(*node, u"B"), u"C");
    deep->AddObserver(&watcher, everything, 0);
    log.Take();
    EXPECT_TRUE(root->RemoveObserver(&watcher, 0, true));
    AddText(*deep, u"x", u"1");
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "");
    EXPECT_FALSE(root->RemoveObserver(&watcher, 0, true));
}

TEST_F(NodeChanges, RemovalStaysOnTheNodeUnlessItIsRecursive) {
    EXPECT_FALSE(root->RemoveObserver(&watcher, 0, false));
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\n");
}

TEST_F(NodeChanges, RecursiveRemovalDoesNotFollowLinks) {
    ResTreeNode* branch = AddChild(*root, u"B");
    AddLink(*branch, u"link", u"../A");
    log.Take();
    EXPECT_FALSE(branch->RemoveObserver(&watcher, 0, true));
}

// --- Holding back ---

TEST_F(NodeChanges, HeldBackFlagsArriveOnceAndTogether) {
    EXPECT_EQ(node->BeginChanges(), 0u);
    for (int i = 0; i < 10; ++i) {
        node->SetProperty(u"x", u"1");
    }
    EXPECT_FALSE(node->HasNoPendingChanges());
    EXPECT_EQ(log.Take(), "");
    node->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "a: A PropertyChanged|PropertyAdded #0\n");
    EXPECT_TRUE(node->HasNoPendingChanges());
}

TEST_F(NodeChanges, OtherNodesAreNotHeldBack) {
    node->BeginChanges();
    node->Rename(u"B");
    EXPECT_EQ(log.Take(), "r: Root ChildNameChanged #0\n");
    node->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "a: B NodeNameChanged #0\n");
}

TEST_F(NodeChanges, BracketsNest) {
    node->BeginChanges();
    AddText(*node, u"x", u"1");
    const uint32_t saved = node->BeginChanges();
    EXPECT_EQ(saved, static_cast<uint32_t>(PropertyAdded));
    EXPECT_TRUE(node->HasNoPendingChanges());
    AddChild(*node, u"y");
    node->EndChanges(saved, false);
    EXPECT_EQ(log.Take(), "");
    node->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "a: A PropertyAdded|ChildAdded #0\n");
}

TEST_F(NodeChanges, BracketsAreCountedInMoreThan29Bits) {
    for (uint32_t i = 0; i < 1U << 29; ++i) {
        node->BeginChanges();
    }
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "");
    node->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeChanges, ReplacingDropsWhatWasRaisedInTheBracket) {
    node->BeginChanges();
    AddText(*node, u"x", u"1");
    const uint32_t saved = node->BeginChanges();
    AddChild(*node, u"y");
    node->EndChanges(saved, true);
    node->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\n");
}

TEST_F(NodeChanges, ReplacingWithNothingSilencesTheBracket) {
    const uint32_t saved = node->BeginChanges();
    AddText(*node, u"x", u"1");
    node->EndChanges(saved, true);
    EXPECT_EQ(log.Take(), "");
    EXPECT_TRUE(node->HasNoPendingChanges());
}

TEST_F(NodeChanges, FlagsGivenAtTheEndAreDelivered) {
    node->BeginChanges();
    node->EndChanges(ReservationChanged | ChildRemoved, true);
    EXPECT_EQ(log.Take(), "a: A ReservationChanged|ChildRemoved #0\n");
}

TEST_F(NodeChanges, HeldBackFlagsWithoutAnObserverAreForgotten) {
    ResTreeNode* lonely = AddChild(*root, u"B");
    lonely->BeginChanges();
    AddText(*lonely, u"x", u"1");
    EXPECT_FALSE(lonely->HasNoPendingChanges());
    lonely->EndChanges(0, false);
    EXPECT_TRUE(lonely->HasNoPendingChanges());
    log.Take();
    lonely->AddObserver(&watcher, everything, 8);
    lonely->BeginChanges();
    lonely->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeChanges, ObserverThatComesWhileFlagsAreHeldBackHearsOfThem) {
    ResTreeNode* lonely = AddChild(*root, u"B");
    log.Take();
    lonely->BeginChanges();
    AddText(*lonely, u"x", u"1");
    lonely->AddObserver(&watcher, everything, 8);
    lonely->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "a: B PropertyAdded #8\n");
}

TEST_F(NodeChanges, NodeThatIsHeldBackWhenItGoesTellsNothing) {
    node->BeginChanges();
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(log.Take(), "r: Root ChildRemoved #0\n");
}

// --- DispatchChanges ---

TEST_F(NodeChanges, DispatchDeliversOnlyItsMask) {
    node->BeginChanges();
    AddText(*node, u"x", u"1");
    AddChild(*node, u"y");
    node->DispatchChanges(ChildAdded);
    EXPECT_EQ(log.Take(), "a: A ChildAdded #0\n");
    EXPECT_FALSE(node->HasNoPendingChanges());
    node->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\n");
}

TEST_F(NodeChanges, DispatchOfNothingCallsNobody) {
    node->DispatchChanges(allChanges);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeChanges, WhatAnObserverRaisesArrivesInAFurtherPass) {
    LoggingObserver second(log, "b");
    node->AddObserver(&second, everything, 0);
    watcher.reaction = [](ResTreeNode& changed, uint32_t changes) {
        if ((changes & PropertyAdded) != 0) {
            AddChild(changed, u"y");
        }
    };
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(),
              "a: A PropertyAdded #0\n"
              "b: A PropertyAdded #0\n"
              "a: A ChildAdded #0\n"
              "b: A ChildAdded #0\n");
    node->RemoveObserver(&second, -1, false);
}

TEST_F(NodeChanges, DispatchInsideABracketKeepsWhatObserversRaise) {
    watcher.reaction = [](ResTreeNode& changed, uint32_t changes) {
        if ((changes & PropertyAdded) != 0) {
            AddChild(changed, u"y");
        }
    };
    node->BeginChanges();
    AddText(*node, u"x", u"1");
    node->DispatchChanges(allChanges);
    EXPECT_EQ(log.Take(), "a: A PropertyAdded #0\n");
    node->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "a: A ChildAdded #0\n");
}

TEST_F(NodeChanges, DispatchSetsADeeperBracketBackToOne) {
    node->BeginChanges();
    node->BeginChanges();
    AddText(*node, u"x", u"1");
    node->DispatchChanges(allChanges);
    log.Take();
    AddChild(*node, u"y");
    node->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "a: A ChildAdded #0\n");
}

TEST_F(NodeChanges, EndWithoutABeginHoldsEverythingBack) {
    // The count wraps around.
    node->EndChanges(0, false);
    AddText(*node, u"x", u"1");
    EXPECT_EQ(log.Take(), "");
    node->BeginChanges();
    AddChild(*node, u"y");
    EXPECT_EQ(log.Take(), "a: A ChildAdded #0\n");
}

// --- Watching the nodes above ---

TEST_F(NodeChanges, RenamingAboveArrivesAsAChangeOfTheNodesName) {
    ResTreeNode* middle = AddChild(*node, u"B");
    ResTreeNode* deep = AddChild(*middle, u"C");
    LoggingObserver other(log, "c");
    EXPECT_TRUE(deep->AddObserver(&other, AncestorChanged | NodeNameChanged, 9));
    log.Take();
    node->Rename(u"A2");
    EXPECT_EQ(log.Take(),
              "a: A2 NodeNameChanged #0\n"
              "c: C NodeNameChanged #9\n"
              "r: Root ChildNameChanged #0\n");
    root->Rename(u"Root2");
    EXPECT_EQ(log.Take(),
              "r: Root2 NodeNameChanged #0\n"
              "a: A2 NodeNameChanged #0\n"
              "c: C NodeNameChanged #9\n");
    deep->RemoveObserver(&other, 9, false);
}

TEST_F(NodeChanges, RenamingBelowIsNoConcernOfTheNodesAbove) {
    ResTreeNode* deep = AddChild(*node, u"B");
    LoggingObserver other(log, "c");
    node->AddObserver(&other, AncestorChanged | NodeNameChanged, 9);
    log.Take();
    deep->Rename(u"C");
    EXPECT_EQ(log.Take(), "a: A ChildNameChanged #0\n");
    node->RemoveObserver(&other, -1, false);
}

TEST_F(NodeChanges, OtherChangesAboveAreIgnored) {
    LoggingObserver other(log, "c");
    node->AddObserver(&other, everything | AncestorChanged, 9);
    root->SetProperty(u"x", u"1");
    root->SetProperty(u"x", u"2");
    root->RemoveEntryByName(u"x");
    AddChild(*root, u"y");
    EXPECT_EQ(log.Take(),
              "r: Root PropertyAdded #0\n"
              "r: Root PropertyChanged #0\n"
              "r: Root PropertyRemoved #0\n"
              "r: Root ChildAdded #0\n");
    node->RemoveObserver(&other, -1, false);
}

TEST_F(NodeChanges, DisplayNameOfANodeAboveCountsAsItsName) {
    AddText(*root, u"DisplayName", u"1");
    LoggingObserver other(log, "c");
    node->AddObserver(&other, AncestorChanged | NodeNameChanged, 9);
    log.Take();
    root->SetProperty(u"DisplayName", u"2");
    EXPECT_EQ(log.Take(),
              "r: Root PropertyChanged #0\n"
              "r: Root NodeNameChanged #0\n"
              "a: A NodeNameChanged #0\n"
              "c: A NodeNameChanged #9\n");
    node->RemoveObserver(&other, -1, false);
}

TEST_F(NodeChanges, ObserverThatAsksForAncestorsAloneIsToldOfNothing) {
    // AncestorChanged is never raised by itself, and the name arrives as NodeNameChanged.
    LoggingObserver other(log, "c");
    node->AddObserver(&other, AncestorChanged, 9);
    root->Rename(u"Root2");
    EXPECT_EQ(log.Take(), "r: Root2 NodeNameChanged #0\na: A NodeNameChanged #0\n");
    node->RemoveObserver(&other, -1, false);
}

TEST_F(NodeChanges, WatchingTheNodesAboveTwiceRegistersThemOnce) {
    LoggingObserver other(log, "c");
    EXPECT_TRUE(node->AddObserver(&other, AncestorChanged | NodeNameChanged, 9));
    EXPECT_FALSE(node->AddObserver(&other, AncestorChanged | NodeNameChanged, 9));
    root->Rename(u"Root2");
    EXPECT_EQ(log.Take(),
              "r: Root2 NodeNameChanged #0\n"
              "a: A NodeNameChanged #0\n"
              "c: A NodeNameChanged #9\n");
    node->RemoveObserver(&other, -1, false);
}

TEST_F(NodeChanges, NewWatchOfTheNodesAboveIsSomethingNewOnAnOldRecord) {
    LoggingObserver other(log, "c");
    EXPECT_TRUE(node->AddObserver(&other, NodeNameChanged, 9));
    EXPECT_TRUE(node->AddObserver(&other, AncestorChanged | NodeNameChanged, 9));
    EXPECT_FALSE(node->AddObserver(&other, AncestorChanged | NodeNameChanged, 9));
    node->RemoveObserver(&other, -1, false);
}

TEST_F(NodeChanges, LastObserverThatAskedForTheNodesAboveEndsTheirWatching) {
    LoggingObserver other(log, "c");
    LoggingObserver third(log, "d");
    node->AddObserver(&other, AncestorChanged | NodeNameChanged, 9);
    node->AddObserver(&third, AncestorChanged | NodeNameChanged, 9);
    EXPECT_TRUE(node->RemoveObserver(&other, 9, false));
    root->Rename(u"2");
    EXPECT_EQ(log.Take(), "r: 2 NodeNameChanged #0\na: A NodeNameChanged #0\nd: A NodeNameChanged #9\n");
    EXPECT_TRUE(node->RemoveObserver(&third, 9, false));
    root->Rename(u"3");
    EXPECT_EQ(log.Take(), "r: 3 NodeNameChanged #0\n");
}

TEST_F(NodeChanges, WatchingOfANodeBelowKeepsTheOnesAboveWatched) {
    ResTreeNode* deep = AddChild(*node, u"B");
    LoggingObserver other(log, "c");
    deep->AddObserver(&other, AncestorChanged | NodeNameChanged, 9);
    node->AddObserver(&other, AncestorChanged | NodeNameChanged, 9);
    node->RemoveObserver(&other, 9, false);
    log.Take();
    root->Rename(u"2");
    EXPECT_EQ(log.Take(), "r: 2 NodeNameChanged #0\na: A NodeNameChanged #0\nc: B NodeNameChanged #9\n");
    deep->RemoveObserver(&other, 9, false);
    root->Rename(u"3");
    EXPECT_EQ(log.Take(), "r: 3 NodeNameChanged #0\n");
}

TEST_F(NodeChanges, BothNameFlagsArePassedOnAsReceived) {
    ResTreeNode* deep = AddChild(*node, u"B");
    LoggingObserver other(log, "c");
    deep->AddObserver(&other, AncestorChanged | NodeNameChanged, 9);
    log.Take();
    node->BeginChanges();
    node->EndChanges(AncestorChanged, false);
    EXPECT_EQ(log.Take(), "c: B AncestorChanged #9\n");
    node->BeginChanges();
    node->EndChanges(AncestorChanged | NodeNameChanged | PropertyChanged, false);
    EXPECT_EQ(log.Take(),
              "a: A NodeNameChanged|PropertyChanged|AncestorChanged #0\n"
              "c: B NodeNameChanged|AncestorChanged #9\n");
    deep->RemoveObserver(&other, 9, false);
}

// --- A node as an observer ---

TEST_F(NodeChanges, NodeRaisesWhatItHearsOfNamesAndReservations) {
    node->OnNodeChanged(nullptr, NodeNameChanged | AncestorChanged | PropertyChanged, 77);
    EXPECT_EQ(log.Take(), "a: A NodeNameChanged|AncestorChanged #0\n");
    LoggingObserver other(log, "o");
    node->AddObserver(&other, ReservationChanged, 5);
    node->OnNodeChanged(nullptr, ReservationChanged, 0);
    EXPECT_EQ(log.Take(), "o: A ReservationChanged #5\n");
    node->OnNodeChanged(nullptr, ReservationChanged | NodeNameChanged, 0);
    EXPECT_EQ(log.Take(), "a: A NodeNameChanged #0\no: A ReservationChanged #5\n");
    node->RemoveObserver(&other, -1, false);
}

TEST_F(NodeChanges, NodeIgnoresAllElse) {
    node->OnNodeChanged(root.get(), ~static_cast<uint32_t>(NodeNameChanged | AncestorChanged | ReservationChanged), 1);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeChanges, NodeDoesNotDieWithWhatItWatches) {
    EXPECT_FALSE(node->DeleteWithNode());
}

TEST_F(NodeChanges, NodeMayBeRegisteredLikeAnyObserver) {
    ResTreeNode* other = AddChild(*root, u"B");
    log.Take();
    other->AddObserver(node, NodeNameChanged, 50);
    other->Rename(u"C");
    EXPECT_EQ(log.Take(), "a: A NodeNameChanged #0\nr: Root ChildNameChanged #0\n");
    EXPECT_TRUE(other->RemoveObserver(node, 50, false));
    other->Rename(u"D");
    EXPECT_EQ(log.Take(), "r: Root ChildNameChanged #0\n");
}

TEST_F(NodeChanges, NodeThatDiesNoLongerWatchesItsParent) {
    root->AddObserver(node, PropertyAdded | NodeNameChanged, 50);
    root->RemoveEntryByName(u"A");
    log.Take();
    root->SetProperty(u"x", u"1");
    root->Rename(u"2");
    EXPECT_EQ(log.Take(), "r: Root PropertyAdded #0\nr: 2 NodeNameChanged #0\n");
}

// --- Watching dependants ---

class Dependants : public NodeChanges {
  protected:
    // A node below the root whose "Reserves" is `reserves`.
    ResTreeNode* Make(const char16_t* name, const char16_t* reserves) {
        ResTreeNode* made = AddChild(*root, name);
        if (reserves != nullptr) {
            AddText(*made, u"Reserves", reserves);
        }
        log.Take();
        return made;
    }

    static void Reserve(ResTreeNode& reserved) {
        const uint32_t saved = reserved.BeginChanges();
        reserved.EndChanges(saved | ReservationChanged, true);
    }

    LoggingObserver observer{log, "o"};
};

TEST_F(Dependants, ListGivesTheNodesInOrderWithoutDeadPaths) {
    ResTreeNode* b = Make(u"B", nullptr);
    ResTreeNode* c = Make(u"C", u" ../B , ../nobody,/A,,../B");
    std::vector<ResTreeNode*> list = {root.get()};
    c->GetDependants(list, false);
    // The empty piece is the node itself.
    EXPECT_EQ(list, (std::vector<ResTreeNode*>{root.get(), b, node, c, b}));
    list.clear();
    c->GetDependants(list, true);
    EXPECT_EQ(list, (std::vector<ResTreeNode*>{b, node, c, b}));
}

TEST_F(Dependants, ListOfANodeThatReservesNothingIsEmpty) {
    std::vector<ResTreeNode*> list;
    node->GetDependants(list, false);
    AddLink(*node, u"Reserves", u"..");
    node->GetDependants(list, false);
    EXPECT_TRUE(list.empty());
}

TEST_F(Dependants, ReservationOfADependantIsRaisedOnTheNode) {
    ResTreeNode* b = Make(u"B", nullptr);
    ResTreeNode* c = Make(u"C", u"../B");
    EXPECT_TRUE(c->AddObserver(&observer, ReservationChanged, 5));
    Reserve(*b);
    EXPECT_EQ(log.Take(), "o: C ReservationChanged #5\n");
    EXPECT_FALSE(c->AddObserver(&observer, ReservationChanged, 5));
    c->RemoveObserver(&observer, 5, false);
    Reserve(*b);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(Dependants, ReservationArrivesOverAnyNumberOfNodes) {
    ResTreeNode* b = Make(u"B", nullptr);
    Make(u"C", u"../B");
    Make(u"D", u"../C");
    ResTreeNode* e = Make(u"E", u"../D");
    EXPECT_TRUE(e->AddObserver(&observer, ReservationChanged, 5));
    Reserve(*b);
    EXPECT_EQ(log.Take(), "o: E ReservationChanged #5\n");
    EXPECT_TRUE(e->RemoveObserver(&observer, 5, false));
    Reserve(*b);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(Dependants, WithoutTheFlagNoDependantIsWatched) {
    ResTreeNode* b = Make(u"B", nullptr);
    ResTreeNode* c = Make(u"C", u"../B");
    c->AddObserver(&observer, everything, 5);
    Reserve(*b);
    EXPECT_EQ(log.Take(), "");
    c->RemoveObserver(&observer, -1, false);
}

TEST_F(Dependants, NameOfADependantArrivesOnlyBesideAReservation) {
    ResTreeNode* b = Make(u"B", nullptr);
    ResTreeNode* c = Make(u"C", u"../B");
    c->AddObserver(&observer, ReservationChanged | NodeNameChanged, 5);
    b->Rename(u"B2");
    EXPECT_EQ(log.Take(), "r: Root ChildNameChanged #0\n");
    // The whole delivered set reaches the watching node, which raises both kinds in turn.
    b->BeginChanges();
    b->EndChanges(ReservationChanged | NodeNameChanged, true);
    EXPECT_EQ(log.Take(), "o: C NodeNameChanged #5\no: C ReservationChanged #5\n");
    c->RemoveObserver(&observer, -1, false);
}

TEST_F(Dependants, DiamondIsPassedOnOverEachOfItsWays) {
    ResTreeNode* z = Make(u"Z", nullptr);
    Make(u"X", u"../Z");
    Make(u"Y", u"../Z");
    ResTreeNode* n = Make(u"N", u"../X,../Y");
    n->AddObserver(&observer, ReservationChanged, 5);
    Reserve(*z);
    EXPECT_EQ(log.Take(), "o: N ReservationChanged #5\no: N ReservationChanged #5\n");
    n->BeginChanges();
    Reserve(*z);
    n->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "o: N ReservationChanged #5\n");
    EXPECT_TRUE(n->RemoveObserver(&observer, -1, false));
    Reserve(*z);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(Dependants, CycleIsPassedRoundOnce) {
    ResTreeNode* b = Make(u"B", u"../C");
    ResTreeNode* c = Make(u"C", u"../D");
    ResTreeNode* d = Make(u"D", u"../B");
    LoggingObserver second(log, "p");
    EXPECT_TRUE(b->AddObserver(&observer, ReservationChanged, 5));
    EXPECT_FALSE(b->AddObserver(&observer, ReservationChanged, 5));
    EXPECT_TRUE(d->AddObserver(&second, ReservationChanged, 6));
    Reserve(*c);
    // B watches C and D watches B.
    EXPECT_EQ(log.Take(), "o: B ReservationChanged #5\np: D ReservationChanged #6\n");
    Reserve(*b);
    EXPECT_EQ(log.Take(), "o: B ReservationChanged #5\np: D ReservationChanged #6\n");
    Reserve(*d);
    // D tells C, then its own observer; C tells B.
    EXPECT_EQ(log.Take(), "o: B ReservationChanged #5\np: D ReservationChanged #6\n");
    d->RemoveObserver(&second, -1, false);
    b->RemoveObserver(&observer, -1, false);
    Reserve(*b);
    Reserve(*c);
    Reserve(*d);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(Dependants, NodeMayReserveItself) {
    ResTreeNode* b = Make(u"B", u".");
    b->AddObserver(&observer, ReservationChanged, 5);
    Reserve(*b);
    EXPECT_EQ(log.Take(), "o: B ReservationChanged #5\n");
    b->RemoveObserver(&observer, -1, false);
    Reserve(*b);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(Dependants, NodeMayReserveItsParentAndItsChild) {
    ResTreeNode* b = Make(u"B", u"..,C");
    ResTreeNode* c = AddChild(*b, u"C");
    AddText(*c, u"Reserves", u"..");
    b->AddObserver(&observer, ReservationChanged | AncestorChanged | NodeNameChanged, 5);
    log.Take();
    root->Rename(u"Root2");
    EXPECT_EQ(log.Take(), "r: Root2 NodeNameChanged #0\no: B NodeNameChanged #5\n");
    Reserve(*root);
    EXPECT_EQ(log.Take(), "o: B ReservationChanged #5\n");
    Reserve(*c);
    EXPECT_EQ(log.Take(), "o: B ReservationChanged #5\n");
    root->RemoveEntryByName(u"B");
    Reserve(*root);
    log.Take();
}

TEST_F(Dependants, NodeThatDiesNoLongerWatchesItsDependants) {
    ResTreeNode* b = Make(u"B", nullptr);
    ResTreeNode* c = Make(u"C", u"../B");
    c->AddObserver(&observer, ReservationChanged, 5);
    root->RemoveEntryByName(u"C");
    log.Take();
    Reserve(*b);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(Dependants, NodeThatDiesIsNoLongerWatched) {
    Make(u"B", nullptr);
    ResTreeNode* c = Make(u"C", u"../B");
    c->AddObserver(&observer, ReservationChanged, 5);
    root->RemoveEntryByName(u"B");
    log.Take();
    Reserve(*c);
    EXPECT_EQ(log.Take(), "o: C ReservationChanged #5\n");
    EXPECT_TRUE(c->RemoveObserver(&observer, 5, false));
}

TEST_F(Dependants, ChangedListLeavesNoNodeBehindThatIsWatchedByADeadOne) {
    ResTreeNode* b = Make(u"B", nullptr);
    ResTreeNode* c = Make(u"C", u"../B");
    c->AddObserver(&observer, ReservationChanged, 5);
    c->SetProperty(u"Reserves", u"../A");
    root->RemoveEntryByName(u"C");
    log.Take();
    Reserve(*b);
    EXPECT_EQ(log.Take(), "");
}

// --- Observers that the node owns ---

TEST(DeleteWithNode, OwnedObserverDiesWithItsNode) {
    ChangeLog log;
    auto root = MakeRootNode();
    ResTreeNode* node = AddChild(*root, u"A");
    node->AddObserver(new LoggingObserver(log, "o", true), NodeDeleted, 5);
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(log.Take(), "o: A NodeDeleted #5\no: gone\n");
}

TEST(DeleteWithNode, OwnedObserversOfARootDieInTheOrderOfTheirRegistration) {
    ChangeLog log;
    auto root = MakeRootNode();
    root->AddObserver(new LoggingObserver(log, "o", true), NodeDeleted, 5);
    root->AddObserver(new LoggingObserver(log, "p", true), NodeDeleted, 5);
    root.reset();
    EXPECT_EQ(log.Take(), "o: gone\np: gone\n");
}

TEST(DeleteWithNode, ObserverThatWasRemovedIsNotDeleted) {
    ChangeLog log;
    auto root = MakeRootNode();
    LoggingObserver observer(log, "o", true);
    root->AddObserver(&observer, NodeDeleted, 5);
    root->RemoveObserver(&observer, 5, false);
    root.reset();
    EXPECT_EQ(log.Take(), "");
}

TEST(DeleteWithNode, OwnedObserverWithTwoContextsDiesOnce) {
    ChangeLog log;
    auto root = MakeRootNode();
    auto* observer = new LoggingObserver(log, "o", true);
    root->AddObserver(observer, NodeDeleted, 5);
    root->AddObserver(observer, NodeDeleted, 6);
    root.reset();
    EXPECT_EQ(log.Take(), "o: gone\n");
}

// Takes itself off the node as it dies, as an observer should.
class SelfRemovingObserver : public LoggingObserver {
  public:
    SelfRemovingObserver(ChangeLog& log, std::string label, ResTreeNode& node)
        : LoggingObserver(log, std::move(label), true), node(node) {}
    ~SelfRemovingObserver() override { node.RemoveObserver(this, -1, false); }

  private:
    ResTreeNode& node;
};

TEST(DeleteWithNode, OwnedObserverMayTakeItselfOffInItsDestructor) {
    ChangeLog log;
    auto root = MakeRootNode();
    root->AddObserver(new SelfRemovingObserver(log, "o", *root), allChanges, 5);
    root->AddObserver(new SelfRemovingObserver(log, "p", *root), allChanges, 5);
    AddText(*root, u"x", u"1");
    log.Take();
    root.reset();
    EXPECT_EQ(log.Take(), "o: Root PropertyRemoved #5\np: Root PropertyRemoved #5\no: gone\np: gone\n");
}

// Takes another observer with it.
class PairedObserver : public LoggingObserver {
  public:
    using LoggingObserver::LoggingObserver;
    ~PairedObserver() override {
        if (partner != nullptr) {
            node->RemoveObserver(partner, -1, false);
            delete partner;
        }
    }

    ResTreeNode* node = nullptr;
    ResTreeNodeChangeObserver* partner = nullptr;
};

TEST(DeleteWithNode, OwnedObserverMayTakeAnotherWithIt) {
    ChangeLog log;
    auto root = MakeRootNode();
    auto* first = new PairedObserver(log, "o", true);
    first->node = root.get();
    first->partner = new LoggingObserver(log, "p", true);
    root->AddObserver(first, NodeDeleted, 5);
    root->AddObserver(first->partner, NodeDeleted, 5);
    root.reset();
    EXPECT_EQ(log.Take(), "p: gone\no: gone\n");
}

}  // namespace
}  // namespace zkhw
