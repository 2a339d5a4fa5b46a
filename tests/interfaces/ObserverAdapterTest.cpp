// What a host's observer may do while it is being called, and the notices that come from further away.

#include <chrono>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "interfaces/support/HostObserver.h"
#include "interfaces/support/OwnedTree.h"

namespace zkhw {
namespace {

constexpr ULONG all = 0xFFFFFFFF;

// A tree of /a/b and /c, and a log that several observers share.
class ObserverAdapterTest : public ::testing::Test {
  protected:
    ObserverAdapterTest() {
        a = AddChild(tree.Root(), u"a");
        b = AddChild(*a, u"b");
        c = AddChild(tree.Root(), u"c");
    }

    // The observers hear of the end of the tree, when what a test has given them to do is no longer there.
    void TearDown() override {
        for (HostObserver* observer : {&first, &second, &third}) {
            observer->reaction = nullptr;
        }
    }

    ChangeLog log;
    HostObserver first{"first", &log};
    HostObserver second{"second", &log};
    HostObserver third{"third", &log};
    OwnedTree tree;
    ResTreeNode* a;
    ResTreeNode* b;
    ResTreeNode* c;
};

TEST_F(ObserverAdapterTest, AnObserverMayEndItsOwnRegistration) {
    tree.At(u"a")->Advise(&first, all, 1);
    tree.At(u"a")->Advise(&second, all, 2);
    first.reaction = [&](IzkhwResourceTreeNode& node, ULONG) { node.Unadvise(&first, 1, 0); };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(first.References(), 0);
    a->SetProperty(u"p", u"2");
    EXPECT_EQ(log.Take(), "first: PropertyAdded #1\nsecond: PropertyAdded #2\nsecond: PropertyChanged #2\n");
}

TEST_F(ObserverAdapterTest, AnObserverThatEndsAllOfItsIdsHearsNoFurtherOne) {
    const View view = tree.At(u"a");
    for (const ULONG id : {1U, 2U, 3U}) {
        view->Advise(&first, all, id);
    }
    first.reaction = [&](IzkhwResourceTreeNode& node, ULONG) { node.Unadvise(&first, all, 0); };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(log.Take(), "first: PropertyAdded #1\n");
    EXPECT_EQ(first.References(), 0);
}

TEST_F(ObserverAdapterTest, ARegistrationThatIsEndedByAnotherObserverHearsNothingMore) {
    tree.At(u"a")->Advise(&first, all, 1);
    tree.At(u"a")->Advise(&second, all, 2);
    first.reaction = [&](IzkhwResourceTreeNode& node, ULONG) { node.Unadvise(&second, 2, 0); };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(log.Take(), "first: PropertyAdded #1\n");
    EXPECT_EQ(second.References(), 0);
}

TEST_F(ObserverAdapterTest, AnObserverMayEndEveryRegistrationOfTheTree) {
    for (HostObserver* observer : {&first, &second, &third}) {
        tree.At(u"a")->Advise(observer, all, 1);
        tree.At(u"a/b")->Advise(observer, all, 2);
        tree.RootView()->Advise(observer, all, 3);
    }
    second.reaction = [&](IzkhwResourceTreeNode&, ULONG) {
        for (HostObserver* observer : {&first, &second, &third}) {
            tree.RootView()->Unadvise(observer, all, 1);
        }
    };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(log.Take(), "first: PropertyAdded #1\nsecond: PropertyAdded #1\n");
    EXPECT_EQ(first.References() + second.References() + third.References(), 0);
}

TEST_F(ObserverAdapterTest, ANewRegistrationWaitsForTheNextPass) {
    tree.At(u"a")->Advise(&first, all, 1);
    first.reaction = [&](IzkhwResourceTreeNode& node, ULONG changes) {
        if (changes == ZkhwPropertyAdded) {
            node.Advise(&second, all, 2);
            node.SetProperty(Text(u"p"), Text(u"again"));
        }
    };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(log.Take(), "first: PropertyAdded #1\nfirst: PropertyChanged #1\nsecond: PropertyChanged #2\n");
}

TEST_F(ObserverAdapterTest, ARegistrationThatIsRenewedInACallWaitsForTheNextPass) {
    const View view = tree.At(u"a");
    view->Advise(&first, all, 1);
    first.reaction = [&](IzkhwResourceTreeNode& node, ULONG) {
        node.Unadvise(&first, 1, 0);
        node.Advise(&first, all, 1);
    };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(log.Take(), "first: PropertyAdded #1\n");
    a->SetProperty(u"p", u"2");
    EXPECT_EQ(log.Take(), "first: PropertyChanged #1\n");
    EXPECT_EQ(first.References(), 1);
}

TEST_F(ObserverAdapterTest, WhatAnObserverChangesComesInAFurtherCall) {
    tree.At(u"a")->Advise(&first, all, 1);
    int rounds = 0;
    first.reaction = [&](IzkhwResourceTreeNode& node, ULONG) {
        if (++rounds < 3) {
            node.SetProperty(Text(u"p"), Text(u"x"));
            node.SetProperty(Text(u"q"), Text(u"x"));
            EXPECT_EQ(node.HasPendingChanges(), S_OK);
        }
    };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(log.Take(),
              "first: PropertyAdded #1\nfirst: PropertyChanged|PropertyAdded #1\nfirst: PropertyChanged #1\n");
}

TEST_F(ObserverAdapterTest, AnObserverMayRemoveItsNode) {
    tree.At(u"a")->Advise(&first, ZkhwPropertyAdded, 1);
    tree.At(u"a")->Advise(&second, all, 2);
    first.reaction = [&](IzkhwResourceTreeNode&, ULONG) { tree.RootView()->RemoveEntry(Text(u"a")); };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(first.References() + second.References(), 0);
    EXPECT_FALSE(tree.At(u"a"));
}

TEST_F(ObserverAdapterTest, AnObserverMayRemoveTheParentOfItsNode) {
    tree.At(u"a/b")->Advise(&first, ZkhwPropertyAdded, 1);
    tree.At(u"a")->Advise(&second, ZkhwNodeDeleted, 2);
    first.reaction = [&](IzkhwResourceTreeNode&, ULONG) { tree.RootView()->RemoveEntry(Text(u"a")); };
    tree.At(u"a/b")->SetProperty(Text(u"DisplayName"), Text(u"1"));
    EXPECT_EQ(log.Take(), "first: PropertyAdded #1\nsecond: NodeDeleted #2\n");
    EXPECT_EQ(first.References() + second.References(), 0);
}

TEST_F(ObserverAdapterTest, AnObserverMayRemoveEverythingThroughAnyCall) {
    const View root = tree.RootView();
    tree.At(u"a/b")->Advise(&first, all, 1);
    tree.At(u"a")->Advise(&second, all, 2);
    first.reaction = [&](IzkhwResourceTreeNode&, ULONG changes) {
        if (changes == ZkhwReservationChanged) {
            root->RemoveEntry(Text(u"a"));
            root->RemoveEntry(Text(u"c"));
        }
    };
    ULONG granted = 0;
    tree.At(u"a/b")->Reserve(Text(u"me"), ZkhwReserveRead, &granted);
    EXPECT_EQ(first.References() + second.References(), 0);
    EXPECT_EQ(root->HasChildren(), S_FALSE);
}

TEST_F(ObserverAdapterTest, AnObserverMayRemoveItsNodeOnceMoreWhileItIsRemoved) {
    const View root = tree.RootView();
    tree.At(u"a")->Advise(&first, all, 1);
    tree.At(u"a/b")->Advise(&second, all, 2);
    const auto removeAgain = [&](IzkhwResourceTreeNode&, ULONG) { root->RemoveEntry(Text(u"a")); };
    first.reaction = removeAgain;
    second.reaction = removeAgain;
    root->RemoveEntry(Text(u"a"));
    EXPECT_EQ(first.References() + second.References(), 0);
    EXPECT_FALSE(tree.At(u"a"));
}

TEST_F(ObserverAdapterTest, AnObserverMayLoadReserveAndCopy) {
    tree.At(u"a")->Advise(&first, ZkhwPropertyAdded, 1);
    first.reaction = [&](IzkhwResourceTreeNode& node, ULONG) {
        auto& view = static_cast<IzkhwResourceTreeNode5&>(node);
        EXPECT_EQ(view.LoadContent(Text(u"<T name=\"new\"/>")), S_OK);
        ULONG granted = 0;
        EXPECT_EQ(view.Reserve(Text(u"me"), ZkhwReserveWrite, &granted), S_OK);
        EXPECT_EQ(granted, ULONG{ZkhwReserveWrite});
        View copy;
        EXPECT_EQ(view.CloneDetached(Text(u"copy"), reinterpret_cast<IzkhwResourceTreeNode**>(copy.ReceiveAny())),
                  S_OK);
        InterfacePointer<IzkhwResourceTreeNode> found;
        EXPECT_EQ(copy->FindNode(Text(u"new"), nullptr, nullptr, found.Receive()), S_OK);
    };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(first.calls, 1U);
    EXPECT_TRUE(tree.At(u"a/new"));
}

TEST_F(ObserverAdapterTest, AnObserverMayHoldNoticesBack) {
    const View view = tree.At(u"a");
    view->Advise(&first, all, 1);
    ULONG pending = 7;
    first.reaction = [&](IzkhwResourceTreeNode& node, ULONG changes) {
        if (changes == ZkhwPropertyAdded) {
            EXPECT_EQ(node.BeginChange(&pending), S_OK);
            node.SetProperty(Text(u"p"), Text(u"2"));
            node.RemoveEntry(Text(u"p"));
            EXPECT_EQ(node.EndChange(pending, 0), S_OK);
        }
    };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(pending, 0U);
    EXPECT_EQ(log.Take(), "first: PropertyAdded #1\nfirst: PropertyChanged|PropertyRemoved #1\n");
}

TEST_F(ObserverAdapterTest, EndChangeMayPutOtherFlagsInPlaceOfThoseRaised) {
    const View view = tree.At(u"a");
    view->Advise(&first, all, 1);
    ULONG pending = 7;
    view->BeginChange(&pending);
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(view->HasPendingChanges(), S_OK);
    view->EndChange(ZkhwChildAdded, 1);
    EXPECT_EQ(view->HasPendingChanges(), S_FALSE);
    EXPECT_EQ(log.Take(), "first: ChildAdded #1\n");
}

TEST_F(ObserverAdapterTest, AnObserverMayGiveItsViewsBackInTheCall) {
    View view = tree.At(u"a");
    view->Advise(&first, all, 1);
    first.reaction = [&](IzkhwResourceTreeNode& node, ULONG) {
        view.Reset();
        node.Unadvise(&first, 1, 0);
    };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(first.References(), 0);
}

TEST_F(ObserverAdapterTest, AnObserverMayBeGoneWhenItsCallReturns) {
    auto mortal = std::make_unique<HostObserver>("mortal", &log);
    tree.At(u"a")->Advise(mortal.get(), all, 1);
    tree.At(u"a")->Advise(&second, all, 2);
    std::unique_ptr<HostObserver> grave;
    mortal->whenUnreferenced = [&] { grave = std::move(mortal); };
    mortal->reaction = [&](IzkhwResourceTreeNode& node, ULONG) { node.Unadvise(mortal.get(), 1, 0); };
    a->SetProperty(u"p", u"1");
    EXPECT_TRUE(grave);
    grave.reset();
    a->SetProperty(u"p", u"2");
    EXPECT_EQ(log.Take(), "mortal: PropertyAdded #1\nsecond: PropertyAdded #2\nsecond: PropertyChanged #2\n");
}

TEST_F(ObserverAdapterTest, AnObserverMayEndTheCopyThatItHearsOf) {
    View copy;
    tree.At(u"a")->CloneDetached(nullptr, reinterpret_cast<IzkhwResourceTreeNode**>(copy.ReceiveAny()));
    View below;
    copy->FindNode(Text(u"b"), nullptr, nullptr, reinterpret_cast<IzkhwResourceTreeNode**>(below.ReceiveAny()));
    below->Advise(&first, all, 1);
    below->Advise(&second, all, 2);
    first.reaction = [&](IzkhwResourceTreeNode&, ULONG) { copy.Reset(); };
    below->SetProperty(Text(u"DisplayName"), Text(u"B"));
    EXPECT_EQ(log.Take(), "first: PropertyAdded #1\n");
    EXPECT_EQ(first.References() + second.References(), 0);
    EXPECT_EQ(ReferencesOf(below.Get()), 1U);
}

TEST_F(ObserverAdapterTest, AnObserverMayEndTheCopyWhileANodeOfItIsRemoved) {
    View copy;
    tree.At(u"a")->CloneDetached(nullptr, reinterpret_cast<IzkhwResourceTreeNode**>(copy.ReceiveAny()));
    View below;
    copy->FindNode(Text(u"b"), nullptr, nullptr, reinterpret_cast<IzkhwResourceTreeNode**>(below.ReceiveAny()));
    below->Advise(&first, all, 1);
    first.reaction = [&](IzkhwResourceTreeNode&, ULONG) { copy.Reset(); };
    copy->RemoveEntry(Text(u"b"));
    EXPECT_EQ(first.calls, 1U);
    EXPECT_EQ(first.References(), 0);
}

// --- Notices from further away ---

TEST_F(ObserverAdapterTest, WithAncestorChangedARenamingAboveArrivesAsAChangeOfTheName) {
    tree.At(u"a/b")->Advise(&first, ZkhwAncestorChanged | ZkhwNodeNameChanged, 1);
    tree.At(u"a")->SetName(Text(u"z"));
    EXPECT_EQ(log.Take(), "first: NodeNameChanged #1\n");
    // Only a value that changes is a change of the name.
    tree.RootView()->SetProperty(Text(u"DisplayName"), Text(u"Top"));
    EXPECT_EQ(log.Take(), "");
    tree.RootView()->SetProperty(Text(u"displayname"), Text(u"Other"));
    EXPECT_EQ(log.Take(), "first: NodeNameChanged #1\n");
    tree.At(u"c")->SetName(Text(u"d"));
    EXPECT_EQ(log.Take(), "");
}

TEST_F(ObserverAdapterTest, WithoutAncestorChangedOnlyTheOwnNameCounts) {
    tree.At(u"a/b")->Advise(&first, ZkhwNodeNameChanged, 1);
    tree.At(u"a")->SetName(Text(u"z"));
    EXPECT_EQ(log.Take(), "");
    tree.At(u"z/b")->SetName(Text(u"y"));
    EXPECT_EQ(log.Take(), "first: NodeNameChanged #1\n");
}

TEST_F(ObserverAdapterTest, AncestorChangedAloneHearsNothing) {
    tree.At(u"a/b")->Advise(&first, ZkhwAncestorChanged, 1);
    tree.At(u"a")->SetName(Text(u"z"));
    EXPECT_EQ(log.Take(), "");
}

TEST_F(ObserverAdapterTest, AfterUnadviseNodesNoLongerPassARenamingDown) {
    tree.At(u"a/b")->Advise(&first, ZkhwAncestorChanged | ZkhwNodeNameChanged, 1);
    tree.At(u"a/b")->Advise(&second, ZkhwNodeNameChanged, 2);
    tree.At(u"a")->SetName(Text(u"y"));
    EXPECT_EQ(log.Take(), "first: NodeNameChanged #1\nsecond: NodeNameChanged #2\n");
    tree.RootView()->Unadvise(&first, all, 1);
    tree.At(u"y")->SetName(Text(u"z"));
    EXPECT_EQ(log.Take(), "");
}

TEST_F(ObserverAdapterTest, AReservationOfADependantIsHeardAtTheNodeThatDependsOnIt) {
    AddText(*a, u"Reserves", u"/c");
    tree.At(u"a")->Advise(&first, ZkhwReservationChanged, 1);
    tree.At(u"c")->Reserve(Text(u"me"), ZkhwReserveRead, nullptr);
    EXPECT_EQ(log.Take(), "first: ReservationChanged #1\n");
    tree.At(u"c")->Unreserve(Text(u"me"));
    EXPECT_EQ(log.Take(), "first: ReservationChanged #1\n");
    tree.At(u"a")->Unadvise(&first, 1, 0);
    tree.At(u"c")->Reserve(Text(u"me"), ZkhwReserveRead, nullptr);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(ObserverAdapterTest, AReservationIsHeardOverAChainOfDependants) {
    AddText(*a, u"Reserves", u"/c");
    AddText(*c, u"Reserves", u"/a/b");
    tree.At(u"a")->Advise(&first, ZkhwReservationChanged, 1);
    tree.At(u"a/b")->Reserve(Text(u"me"), ZkhwReserveRead, nullptr);
    EXPECT_EQ(log.Take(), "first: ReservationChanged #1\n");
}

TEST_F(ObserverAdapterTest, ACycleOfDependantsIsHeardOncePerChange) {
    AddText(*a, u"Reserves", u"/c");
    AddText(*c, u"Reserves", u"/a");
    tree.At(u"a")->Advise(&first, ZkhwReservationChanged, 1);
    // One by one: Reserve itself would take both.
    c->ReserveOne(u"me", ReserveRead);
    EXPECT_EQ(log.Take(), "first: ReservationChanged #1\n");
    a->ReserveOne(u"me", ReserveRead);
    EXPECT_EQ(log.Take(), "first: ReservationChanged #1\n");
    tree.RootView()->Unadvise(&first, all, 1);
    EXPECT_EQ(first.References(), 0);
}

TEST_F(ObserverAdapterTest, TheMirrorOfAReservationIsNoChangeOfAProperty) {
    tree.At(u"a")->Advise(&first, all, 1);
    tree.At(u"a")->Reserve(Text(u"me"), ZkhwReserveRead, nullptr);
    EXPECT_EQ(log.Take(), "first: ReservationChanged #1\n");
}

TEST_F(ObserverAdapterTest, LoadedContentIsHeardOfOnce) {
    const View view = tree.At(u"a");
    view->Advise(&first, all, 1);
    ASSERT_EQ(view->LoadContent(Text(u"<T name=\"x\"/><T name=\"y\"/><Attribute name=\"p\">1</Attribute>")), S_OK);
    EXPECT_EQ(first.calls, 1U);
}

// --- Many ---

// Ten thousand are ten thousand times the work of one: a square of it would take minutes.
class ManyObserversTest : public ObserverAdapterTest {
  protected:
    static constexpr size_t many = 10000;

    void Begin() { start = std::chrono::steady_clock::now(); }
    void ExpectPrompt() const {
        EXPECT_LT(std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count(), 10.0);
    }

    std::chrono::steady_clock::time_point start;
};

TEST_F(ManyObserversTest, TenThousandRegistrationsAtOneNode) {
    Begin();
    const View view = tree.At(u"a");
    for (ULONG id = 0; id < many; ++id) {
        ASSERT_EQ(view->Advise(&first, ZkhwPropertyChanged | ZkhwPropertyAdded, id), S_OK);
    }
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(first.calls, many);
    for (ULONG id = 0; id < many; id += 2) {
        view->Unadvise(&first, id, 0);
    }
    a->SetProperty(u"p", u"2");
    EXPECT_EQ(first.calls, many + many / 2);
    view->Unadvise(&first, all, 0);
    EXPECT_EQ(first.References(), 0);
    ExpectPrompt();
}

TEST_F(ManyObserversTest, TenThousandRegistrationsAtOneNodeGoWithIt) {
    Begin();
    const View view = tree.At(u"a");
    for (ULONG id = 0; id < many; ++id) {
        view->Advise(&first, ZkhwNodeDeleted | ZkhwReservationChanged, id);
    }
    tree.Root().RemoveEntryByName(u"a");
    EXPECT_EQ(first.calls, many);
    EXPECT_EQ(first.References(), 0);
    ExpectPrompt();
}

TEST_F(ManyObserversTest, OneRegistrationAtEachOfTenThousandNodes) {
    Begin();
    std::vector<ResTreeNode*> nodes;
    for (size_t i = 0; i < many; ++i) {
        const std::string number = std::to_string(i);
        nodes.push_back(AddChild(*c, std::u16string(number.begin(), number.end()).c_str()));
    }
    IzkhwResourceTreeNode** views = nullptr;
    ULONG count = 0;
    ASSERT_EQ(tree.At(u"c")->GetChildren(&count, &views), S_OK);
    ASSERT_EQ(count, many);
    for (ULONG i = 0; i < count; ++i) {
        views[i]->Advise(&first, ZkhwAncestorChanged | ZkhwNodeNameChanged, i);
        views[i]->Release();
    }
    CoTaskMemFree(views);
    c->Rename(u"d");
    EXPECT_EQ(first.calls, many);
    nodes[5]->RemoveEntryByName(u"none");
    tree.Root().RemoveEntryByName(u"d");
    EXPECT_EQ(first.References(), 0);
    ExpectPrompt();
}

TEST_F(ManyObserversTest, TenThousandRegistrationsGoWithTheTree) {
    Begin();
    for (size_t i = 0; i < many; ++i) {
        const std::string number = std::to_string(i);
        AddChild(*c, std::u16string(number.begin(), number.end()).c_str());
    }
    IzkhwResourceTreeNode** views = nullptr;
    ULONG count = 0;
    ASSERT_EQ(tree.At(u"c")->GetChildren(&count, &views), S_OK);
    for (ULONG i = 0; i < count; ++i) {
        views[i]->Advise(&first, 0, i);
        views[i]->Release();
    }
    CoTaskMemFree(views);
    tree.End();
    EXPECT_EQ(first.calls, many);
    EXPECT_EQ(first.References(), 0);
    ExpectPrompt();
}

}  // namespace
}  // namespace zkhw
