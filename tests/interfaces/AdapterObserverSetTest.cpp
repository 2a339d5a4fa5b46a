// Advise and Unadvise: which registrations there are, whom they reach, and what they keep alive.

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "interfaces/support/HostObserver.h"
#include "interfaces/support/OwnedTree.h"

namespace zkhw {
namespace {

constexpr ULONG all = 0xFFFFFFFF;

class AdapterObserverSetTest : public ::testing::Test {
  protected:
    // A tree of /a/b and /c.
    AdapterObserverSetTest() {
        a = AddChild(tree.Root(), u"a");
        b = AddChild(*a, u"b");
        c = AddChild(tree.Root(), u"c");
    }

    // The observers hear of the end of the tree, when what a test has given them to do is no longer there.
    void TearDown() override {
        observer.reaction = nullptr;
        other.reaction = nullptr;
        observer.whenUnreferenced = nullptr;
        other.whenUnreferenced = nullptr;
    }

    HostObserver observer;
    HostObserver other{"other"};
    OwnedTree tree;
    ResTreeNode* a;
    ResTreeNode* b;
    ResTreeNode* c;
};

TEST_F(AdapterObserverSetTest, AnObserverHearsOfTheViewThatItWasRegisteredOn) {
    const View view = tree.At(u"a");
    EXPECT_EQ(view->Advise(&observer, all, 7), S_OK);
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(observer.Take(), "observer: PropertyAdded #7\n");
    EXPECT_EQ(observer.lastNode, view.Get());
}

TEST_F(AdapterObserverSetTest, ARegistrationKeepsOneReferenceToViewAndObserver) {
    const View view = tree.At(u"a");
    ASSERT_EQ(ReferencesOf(view.Get()), 1U);
    view->Advise(&observer, all, 7);
    EXPECT_EQ(ReferencesOf(view.Get()), 2U);
    EXPECT_EQ(observer.References(), 1);
    view->Advise(&observer, all, 8);
    EXPECT_EQ(ReferencesOf(view.Get()), 3U);
    EXPECT_EQ(observer.References(), 2);
    view->Unadvise(&observer, 7, 0);
    view->Unadvise(&observer, 8, 0);
    EXPECT_EQ(ReferencesOf(view.Get()), 1U);
    EXPECT_EQ(observer.References(), 0);
}

TEST_F(AdapterObserverSetTest, ARegistrationKeepsItsViewAlive) {
    tree.At(u"a")->Advise(&observer, all, 7);
    a->SetProperty(u"p", u"1");
    ASSERT_NE(observer.lastNode, nullptr);
    EXPECT_EQ(ReferencesOf(observer.lastNode), 1U);
    OwnedBstr name;
    EXPECT_EQ(observer.lastNode->GetName(name.Receive()), S_OK);
    EXPECT_EQ(name.View(), u"a");
}

TEST_F(AdapterObserverSetTest, TheNoticeBringsNoReferenceWithIt) {
    const View view = tree.At(u"a");
    view->Advise(&observer, all, 7);
    ULONG within = 0;
    observer.reaction = [&](IzkhwResourceTreeNode& node, ULONG) { within = ReferencesOf(&node); };
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(within, 2U);
}

TEST_F(AdapterObserverSetTest, TheSameObserverAndIdOnTwoViewsOfANodeAreOneRegistration) {
    const View first = tree.At(u"a");
    const View second = tree.At(u"a");
    ASSERT_NE(first.Get(), second.Get());
    first->Advise(&observer, all, 7);
    EXPECT_EQ(second->Advise(&observer, all, 7), S_OK);
    EXPECT_EQ(observer.References(), 1);
    EXPECT_EQ(ReferencesOf(second.Get()), 1U);
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(observer.Take(), "observer: PropertyAdded #7\n");
    EXPECT_EQ(observer.lastNode, first.Get());
}

TEST_F(AdapterObserverSetTest, TheMaskOfTheFirstRegistrationStands) {
    const View view = tree.At(u"a");
    view->Advise(&observer, ZkhwPropertyAdded, 7);
    EXPECT_EQ(view->Advise(&observer, ZkhwPropertyChanged, 7), S_OK);
    a->SetProperty(u"p", u"1");
    a->SetProperty(u"p", u"2");
    EXPECT_EQ(observer.Take(), "observer: PropertyAdded #7\n");
}

TEST_F(AdapterObserverSetTest, AnotherIdIsAnotherRegistration) {
    const View view = tree.At(u"a");
    view->Advise(&observer, all, 7);
    view->Advise(&observer, all, 8);
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(observer.Take(), "observer: PropertyAdded #7\nobserver: PropertyAdded #8\n");
}

TEST_F(AdapterObserverSetTest, AnotherNodeIsAnotherRegistration) {
    tree.At(u"a")->Advise(&observer, all, 7);
    tree.At(u"c")->Advise(&observer, all, 7);
    c->SetProperty(u"p", u"1");
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(observer.Take(), "observer: PropertyAdded #7\nobserver: PropertyAdded #7\n");
    EXPECT_EQ(observer.References(), 2);
}

TEST_F(AdapterObserverSetTest, ObserversOfANodeHearInTheOrderOfRegistration) {
    ChangeLog log;
    HostObserver x("x", &log);
    HostObserver y("y", &log);
    HostObserver z("z", &log);
    const View view = tree.At(u"a");
    view->Advise(&z, all, 3);
    view->Advise(&x, all, 2);
    view->Advise(&y, all, 1);
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(log.Take(), "z: PropertyAdded #3\nx: PropertyAdded #2\ny: PropertyAdded #1\n");
    tree.End();
}

TEST_F(AdapterObserverSetTest, AMaskOfNothingHearsNothingWhileTheTreeLives) {
    tree.At(u"a")->Advise(&observer, 0, 7);
    a->SetProperty(u"p", u"1");
    a->Rename(u"z");
    EXPECT_EQ(observer.Take(), "");
}

TEST_F(AdapterObserverSetTest, ANoticeBringsAllThatIsDeliveredTogether) {
    const View view = tree.At(u"a");
    view->Advise(&observer, ZkhwNodeNameChanged, 7);
    ULONG pending = 0;
    view->BeginChange(&pending);
    a->SetProperty(u"p", u"1");
    a->SetProperty(u"DisplayName", u"A");
    view->SetProperty(Text(u"DisplayName"), Text(u"B"));
    EXPECT_EQ(observer.Take(), "");
    view->EndChange(pending, 0);
    EXPECT_EQ(observer.Take(), "observer: NodeNameChanged|PropertyChanged|PropertyAdded #7\n");
}

TEST_F(AdapterObserverSetTest, NumbersOneAndTwoDontMeetThoseThatNodesUse) {
    const View view = tree.At(u"a");
    view->Advise(&observer, ZkhwAncestorChanged | ZkhwReservationChanged, 1);
    view->Advise(&observer, ZkhwAncestorChanged | ZkhwReservationChanged, 2);
    const View below = tree.At(u"a/b");
    below->Advise(&other, ZkhwNodeNameChanged | ZkhwAncestorChanged, 1);
    view->Unadvise(&observer, 1, 0);
    view->Unadvise(&observer, 2, 0);
    // The node below still watches this one.
    a->Rename(u"z");
    EXPECT_EQ(other.Take(), "other: NodeNameChanged #1\n");
    EXPECT_EQ(observer.Take(), "");
}

// --- Unadvise, exact ---

TEST_F(AdapterObserverSetTest, UnadviseEndsTheRegistrationWithThatId) {
    const View view = tree.At(u"a");
    view->Advise(&observer, all, 7);
    view->Advise(&observer, all, 8);
    EXPECT_EQ(view->Unadvise(&observer, 7, 0), S_OK);
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(observer.Take(), "observer: PropertyAdded #8\n");
}

TEST_F(AdapterObserverSetTest, UnadviseFindsARegistrationOfAnotherViewOfTheNode) {
    tree.At(u"a")->Advise(&observer, all, 7);
    EXPECT_EQ(tree.At(u"a")->Unadvise(&observer, 7, 0), S_OK);
    EXPECT_EQ(observer.References(), 0);
}

TEST_F(AdapterObserverSetTest, UnadviseOfWhatIsNotRegisteredDoesNothing) {
    const View view = tree.At(u"a");
    view->Advise(&observer, all, 7);
    EXPECT_EQ(view->Unadvise(&observer, 8, 0), S_OK);
    EXPECT_EQ(view->Unadvise(&other, 7, 0), S_OK);
    EXPECT_EQ(view->Unadvise(nullptr, 7, 0), S_OK);
    EXPECT_EQ(view->Unadvise(nullptr, all, 1), S_OK);
    EXPECT_EQ(tree.At(u"c")->Unadvise(&observer, 7, 0), S_OK);
    EXPECT_EQ(tree.At(u"a/b")->Unadvise(&observer, 7, 0), S_OK);
    EXPECT_EQ(tree.RootView()->Unadvise(&observer, 7, 0), S_OK);
    EXPECT_EQ(observer.References(), 1);
}

TEST_F(AdapterObserverSetTest, AnExactUnadviseDoesntFindTheIdOfAllOnes) {
    const View view = tree.At(u"a");
    view->Advise(&observer, all, all);
    EXPECT_EQ(view->Unadvise(&observer, 7, 0), S_OK);
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(observer.Take(), "observer: PropertyAdded #4294967295\n");
}

TEST_F(AdapterObserverSetTest, TheIdOfAllOnesIsANumberLikeAnyOtherInAdvise) {
    const View view = tree.At(u"a");
    view->Advise(&observer, all, 7);
    view->Advise(&observer, all, all);
    view->Advise(&observer, all, all);
    EXPECT_EQ(observer.References(), 2);
    view->Unadvise(&observer, 7, 0);
    EXPECT_EQ(observer.References(), 1);
}

// --- Unadvise, wide ---

TEST_F(AdapterObserverSetTest, UnadviseWithAllOnesEndsAllIdsOfTheObserverAtTheNodeAlone) {
    const View view = tree.At(u"a");
    for (const ULONG id : std::initializer_list<ULONG>{0, 7, 8, all - 1, all}) {
        view->Advise(&observer, all, id);
    }
    view->Advise(&other, all, 7);
    tree.At(u"a/b")->Advise(&observer, all, 7);
    tree.At(u"c")->Advise(&observer, all, 7);
    tree.RootView()->Advise(&observer, all, 7);
    EXPECT_EQ(view->Unadvise(&observer, all, 0), S_OK);
    EXPECT_EQ(observer.References(), 3);
    EXPECT_EQ(other.References(), 1);
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(observer.Take(), "");
    EXPECT_EQ(other.Take(), "other: PropertyAdded #7\n");
}

TEST_F(AdapterObserverSetTest, UnadviseWithAllOnesFindsEachOfTwoObservers) {
    const View view = tree.At(u"a");
    for (const bool otherFirst : {false, true}) {
        view->Advise(&observer, all, 7);
        view->Advise(&other, all, 7);
        EXPECT_EQ(view->Unadvise(otherFirst ? &other : &observer, all, 0), S_OK);
        EXPECT_EQ(observer.References(), otherFirst ? 1 : 0);
        EXPECT_EQ(other.References(), otherFirst ? 0 : 1);
        EXPECT_EQ(view->Unadvise(otherFirst ? &observer : &other, all, 0), S_OK);
        EXPECT_EQ(observer.References() + other.References(), 0);
    }
}

TEST_F(AdapterObserverSetTest, UnadviseOfTheSubtreeAtTheRootEndsTheObserverEverywhere) {
    for (const char16_t* path : {u"a", u"a/b", u"c", u"/"}) {
        tree.At(path)->Advise(&observer, all, 7);
        tree.At(path)->Advise(&observer, all, 8);
        tree.At(path)->Advise(&other, all, 7);
    }
    EXPECT_EQ(tree.RootView()->Unadvise(&observer, all, 1), S_OK);
    EXPECT_EQ(observer.References(), 0);
    EXPECT_EQ(other.References(), 4);
    c->SetProperty(u"p", u"1");
    EXPECT_EQ(other.Take(), "other: PropertyAdded #7\n");
}

TEST_F(AdapterObserverSetTest, UnadviseOfASubtreeWithAnIdEndsThatIdAndThoseOfAllOnes) {
    for (const char16_t* path : {u"a", u"a/b", u"c", u"/"}) {
        tree.At(path)->Advise(&observer, all, 7);
        tree.At(path)->Advise(&observer, all, 8);
        tree.At(path)->Advise(&observer, all, all);
    }
    EXPECT_EQ(tree.At(u"a")->Unadvise(&observer, 7, 1), S_OK);
    EXPECT_EQ(observer.References(), 8);
    b->SetProperty(u"p", u"1");
    a->SetProperty(u"p", u"1");
    EXPECT_EQ(observer.Take(), "observer: PropertyAdded #8\nobserver: PropertyAdded #8\n");
    c->SetProperty(u"p", u"1");
    EXPECT_EQ(observer.Take(),
              "observer: PropertyAdded #7\nobserver: PropertyAdded #8\nobserver: PropertyAdded #4294967295\n");
}

TEST_F(AdapterObserverSetTest, UnadviseOfASubtreeDoesntGoThroughLinks) {
    AddLink(*a, u"way", u"/c");
    tree.At(u"c")->Advise(&observer, all, 7);
    tree.At(u"a")->Unadvise(&observer, all, 1);
    EXPECT_EQ(observer.References(), 1);
}

TEST_F(AdapterObserverSetTest, UnadviseThroughTheOnlyHolderOfItsViewIsSafe) {
    tree.At(u"a")->Advise(&observer, all, 7);
    a->SetProperty(u"p", u"1");
    // The registration holds the only reference to the view.
    observer.lastNode->Unadvise(&observer, 7, 0);
    EXPECT_EQ(observer.References(), 0);
    tree.At(u"a")->Advise(&observer, all, 7);
    tree.At(u"a")->Advise(&observer, all, 8);
    a->SetProperty(u"p", u"2");
    observer.lastNode->Unadvise(&observer, all, 1);
    EXPECT_EQ(observer.References(), 0);
}

TEST_F(AdapterObserverSetTest, AnObserverThatIsReleasedMayEndOtherRegistrations) {
    const View view = tree.At(u"a");
    view->Advise(&observer, all, 7);
    view->Advise(&other, all, 7);
    tree.At(u"c")->Advise(&other, all, 8);
    observer.whenUnreferenced = [&] { tree.RootView()->Unadvise(&other, all, 1); };
    tree.RootView()->Unadvise(&observer, all, 1);
    EXPECT_EQ(observer.References(), 0);
    EXPECT_EQ(other.References(), 0);
}

TEST_F(AdapterObserverSetTest, AnObserverThatIsReleasedMayEndTheTreeOfItsView) {
    // A copy lives as long as the view that made it, and only the observer holds that.
    View copy;
    ASSERT_EQ(tree.At(u"a")->CloneDetached(nullptr, reinterpret_cast<IzkhwResourceTreeNode**>(copy.ReceiveAny())),
              S_OK);
    View below;
    copy->FindNode(Text(u"b"), nullptr, nullptr, reinterpret_cast<IzkhwResourceTreeNode**>(below.ReceiveAny()));
    ASSERT_TRUE(below);
    below->Advise(&observer, all, 7);
    observer.whenUnreferenced = [&] { copy.Reset(); };
    below->Unadvise(&observer, all, 0);
    EXPECT_FALSE(copy);
    EXPECT_EQ(ReferencesOf(below.Get()), 1U);
}

// --- The end of nodes and trees ---

TEST_F(AdapterObserverSetTest, TheEndOfANodeEndsItsRegistrations) {
    View view = tree.At(u"a");
    view->Advise(&observer, all, 7);
    tree.At(u"a/b")->Advise(&other, all, 8);
    tree.Root().RemoveEntryByName(u"a");
    EXPECT_EQ(observer.Take(), "observer: NodeDeleting #7\nobserver: ChildRemoved #7\nobserver: NodeDeleted #7\n");
    EXPECT_EQ(other.Take(), "other: NodeDeleting #8\nother: NodeDeleted #8\n");
    EXPECT_EQ(observer.References(), 0);
    EXPECT_EQ(other.References(), 0);
    // The view lives as long as the host's own reference, and no longer.
    EXPECT_EQ(ReferencesOf(view.Get()), 1U);
}

TEST_F(AdapterObserverSetTest, ANewNodeStartsWithoutRegistrations) {
    tree.At(u"c")->Advise(&observer, all, 7);
    tree.Root().RemoveEntryByName(u"c");
    observer.Take();
    ResTreeNode* const again = AddChild(tree.Root(), u"c");
    again->SetProperty(u"p", u"1");
    EXPECT_EQ(observer.Take(), "");
    EXPECT_EQ(tree.At(u"c")->Advise(&observer, all, 7), S_OK);
    EXPECT_EQ(observer.References(), 1);
}

TEST_F(AdapterObserverSetTest, AtTheEndOfTheTreeEveryObserverHearsOfItWithTheIdZero) {
    tree.At(u"a")->Advise(&observer, 0, 7);
    tree.At(u"a")->Advise(&observer, ZkhwPropertyAdded, 8);
    tree.At(u"a/b")->Advise(&other, all, all);
    tree.End();
    EXPECT_EQ(observer.Take(), "observer: NodeDeleted #0\nobserver: NodeDeleted #0\n");
    EXPECT_EQ(other.Take(), "other: NodeDeleted #0\n");
    EXPECT_EQ(observer.References(), 0);
    EXPECT_EQ(other.References(), 0);
}

TEST_F(AdapterObserverSetTest, AtTheEndOfTheTreeTheViewsOfTheRegistrationsAreGivenBack) {
    const View view = tree.At(u"a");
    view->Advise(&observer, all, 7);
    const IzkhwResourceTreeNode* heard = nullptr;
    observer.reaction = [&](IzkhwResourceTreeNode& node, ULONG) { heard = &node; };
    tree.End();
    EXPECT_EQ(heard, view.Get());
    EXPECT_EQ(ReferencesOf(view.Get()), 1U);
}

TEST_F(AdapterObserverSetTest, AtTheEndOfTheTreeItStillStandsForTheObserver) {
    tree.At(u"a")->Advise(&observer, all, 7);
    std::u16string path;
    observer.reaction = [&](IzkhwResourceTreeNode& node, ULONG) {
        OwnedBstr text;
        node.GetPath(text.Receive());
        path = text.View();
    };
    tree.End();
    EXPECT_EQ(path, u"/a");
}

TEST_F(AdapterObserverSetTest, AtTheEndOfTheTreeAnObserverMayEndAnyRegistration) {
    tree.At(u"a")->Advise(&observer, all, 7);
    tree.At(u"c")->Advise(&observer, all, 8);
    tree.At(u"a")->Advise(&other, all, 9);
    const View root = tree.RootView();
    const auto endAll = [&](IzkhwResourceTreeNode&, ULONG) {
        root->Unadvise(&observer, all, 1);
        root->Unadvise(&other, all, 1);
    };
    observer.reaction = endAll;
    other.reaction = endAll;
    tree.End();
    EXPECT_EQ(observer.calls + other.calls, 1U);
    EXPECT_EQ(observer.References() + other.References(), 0);
}

TEST_F(AdapterObserverSetTest, AnObserverThatRegistersAtTheEndOfTheTreeHearsOfItToo) {
    tree.At(u"a")->Advise(&observer, all, 7);
    observer.reaction = [&](IzkhwResourceTreeNode& node, ULONG) { node.Advise(&other, 0, 5); };
    tree.End();
    EXPECT_EQ(observer.calls, 1U);
    EXPECT_EQ(other.Take(), "other: NodeDeleted #0\n");
    EXPECT_EQ(other.References(), 0);
}

TEST_F(AdapterObserverSetTest, ARegistrationThatIsRenewedAtTheEndOfTheTreeEndsWithIt) {
    tree.At(u"a")->Advise(&observer, all, 7);
    observer.reaction = [&](IzkhwResourceTreeNode& node, ULONG) {
        const auto view = InterfacePointer<IzkhwResourceTreeNode>::Share(&node);
        view->Unadvise(&observer, 7, 0);
        view->Advise(&observer, all, 7);
    };
    tree.End();
    EXPECT_EQ(observer.calls, 1U);
    EXPECT_EQ(observer.References(), 0);
}

TEST_F(AdapterObserverSetTest, AtTheEndOfTheTreeAnObserverMayRemoveItsNodes) {
    tree.At(u"a/b")->Advise(&observer, all, 7);
    tree.At(u"c")->Advise(&other, all, 8);
    const View root = tree.RootView();
    const auto removeAll = [&](IzkhwResourceTreeNode&, ULONG changes) {
        if (changes == ZkhwNodeDeleted) {
            root->RemoveEntry(Text(u"a"));
            root->RemoveEntry(Text(u"c"));
        }
    };
    observer.reaction = removeAll;
    other.reaction = removeAll;
    tree.End();
    EXPECT_EQ(observer.References() + other.References(), 0);
}

TEST_F(AdapterObserverSetTest, AnOwnerWithoutATreeEndsQuietly) {
    const TestOwner owner;
    EXPECT_EQ(owner.creations, 0);
}

// --- Detached copies ---

class DetachedCopyTest : public AdapterObserverSetTest {
  protected:
    DetachedCopyTest() {
        tree.At(u"a")->CloneDetached(nullptr, reinterpret_cast<IzkhwResourceTreeNode**>(copy.ReceiveAny()));
        copy->FindNode(Text(u"b"), nullptr, nullptr, reinterpret_cast<IzkhwResourceTreeNode**>(below.ReceiveAny()));
    }

    View copy;
    View below;
};

TEST_F(DetachedCopyTest, RegistrationsOfACopyAreItsOwn) {
    below->Advise(&observer, all, 7);
    tree.At(u"a/b")->Advise(&observer, all, 7);
    EXPECT_EQ(observer.References(), 2);
    tree.RootView()->Unadvise(&observer, all, 1);
    EXPECT_EQ(observer.References(), 1);
    below->SetProperty(Text(u"p"), Text(u"1"));
    EXPECT_EQ(observer.Take(), "observer: PropertyAdded #7\n");
}

TEST_F(DetachedCopyTest, TheEndOfACopyEndsItsRegistrationsWithoutAWord) {
    below->Advise(&observer, all, 7);
    below->Advise(&observer, all, all);
    below->Advise(&other, all, 1);
    copy.Reset();
    EXPECT_EQ(observer.Take(), "");
    EXPECT_EQ(other.Take(), "");
    EXPECT_EQ(observer.References() + other.References(), 0);
    EXPECT_EQ(ReferencesOf(below.Get()), 1U);
}

TEST_F(DetachedCopyTest, ARegistrationAtTheOwningViewKeepsTheCopyAlive) {
    copy->Advise(&observer, all, 7);
    IzkhwResourceTreeNode5* const kept = copy.Get();
    copy.Reset();
    kept->SetProperty(Text(u"p"), Text(u"1"));
    EXPECT_EQ(observer.Take(), "observer: PropertyAdded #7\n");
    EXPECT_EQ(kept->Unadvise(&observer, 7, 0), S_OK);
    EXPECT_EQ(observer.References(), 0);
    EXPECT_EQ(observer.Take(), "");
}

TEST_F(DetachedCopyTest, AWideUnadviseMayEndTheCopyThatItRunsOn) {
    copy->Advise(&observer, all, 7);
    below->Advise(&other, all, 7);
    IzkhwResourceTreeNode5* const kept = copy.Get();
    copy.Reset();
    EXPECT_EQ(kept->Unadvise(&observer, all, 1), S_OK);
    EXPECT_EQ(observer.References() + other.References(), 0);
}

TEST_F(DetachedCopyTest, AnObserverThatIsReleasedAtTheEndOfACopyMayEndOthers) {
    below->Advise(&observer, all, 7);
    below->Advise(&other, all, 8);
    observer.whenUnreferenced = [&] { below->Unadvise(&other, all, 0); };
    other.whenUnreferenced = [&] { below->Unadvise(&observer, all, 1); };
    copy.Reset();
    EXPECT_EQ(observer.References() + other.References(), 0);
}

}  // namespace
}  // namespace zkhw
