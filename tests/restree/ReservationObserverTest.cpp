// Who hears of reservations, and what observers and deferred loads may do in the midst of them.

#include <functional>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"
#include "restree/ResTreeNode.h"
#include "restree/ReservedTree.h"
#include "support/ChangeLog.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

constexpr uint32_t everything = allChanges & ~static_cast<uint32_t>(AncestorChanged);

class ReservationNotices : public ReservedTree {
  protected:
    ~ReservationNotices() override {
        root->RemoveObserver(&observer, -1, true);
        root->RemoveObserver(&second, -1, true);
    }

    // Runs the action at the first notice that the observer hears.
    void Once(std::function<void()> action) {
        observer.reaction = [action = std::move(action), done = false](ResTreeNode&, uint32_t) mutable {
            if (!done) {
                done = true;
                action();
            }
        };
    }

    ChangeLog log;
    LoggingObserver observer{log, "o"};
    LoggingObserver second{log, "p"};
};

// --- Who hears ---

TEST_F(ReservationNotices, EachChangeIsToldOnceAndTheTextNotAtAll) {
    ResTreeNode* n = Make(u"N");
    n->AddObserver(&observer, everything, 7);
    n->ReserveOne(u"a", ReserveRead);
    n->ReserveOne(u"a", ReserveWrite);
    n->ReserveOne(u"b", ReserveExclusive);
    n->ReleaseOne(u"b");
    EXPECT_EQ(log.Take(),
              "o: N ReservationChanged #7\no: N ReservationChanged #7\n"
              "o: N ReservationChanged #7\no: N ReservationChanged #7\n");
}

TEST_F(ReservationNotices, NothingIsToldOfWhatChangesNothing) {
    ResTreeNode* n = Make(u"N");
    n->ReserveOne(u"x", ReserveExclusive);
    n->AddObserver(&observer, everything, 7);
    n->ReserveOne(u"a", ReserveRead);
    n->ReleaseOne(u"a");
    n->ReleaseOne(u"x");
    log.Take();
    n->ReserveOne(u"a", 0);
    n->RefreshReservationProperty();
    EXPECT_EQ(log.Take(), "");
}

// N watches B, B watches C, and only then does N come to watch C itself.
TEST_F(ReservationNotices, ADependantIsWatchedThroughTheEarlierOnesOfTheListFirst) {
    ResTreeNode* n = Make(u"N", u"../B,../C");
    ResTreeNode* b = Make(u"B", u"../C");
    ResTreeNode* c = Make(u"C");
    n->AddObserver(&observer, ReservationChanged, 7);
    b->AddObserver(&second, ReservationChanged, 8);
    c->ReserveOne(u"a", ReserveRead);
    EXPECT_EQ(log.Take(),
              "o: N ReservationChanged #7\np: B ReservationChanged #8\n"
              "o: N ReservationChanged #7\n");
}

TEST_F(ReservationNotices, HeldBackChangesArriveTogetherWithWhatWasPending) {
    ResTreeNode* n = Make(u"N");
    n->AddObserver(&observer, everything, 7);
    const uint32_t saved = n->BeginChanges();
    AddText(*n, u"x", u"1");
    n->ReserveOne(u"a", ReserveRead);
    n->ReserveOne(u"b", ReserveWrite);
    n->ReleaseOne(u"a");
    EXPECT_EQ(log.Take(), "");
    n->EndChanges(saved, false);
    EXPECT_EQ(log.Take(), "o: N PropertyAdded|ReservationChanged #7\n");
}

TEST_F(ReservationNotices, DependantsAreToldInTheOrderInWhichTheyAreTakenAndDropped) {
    ResTreeNode* a = Make(u"A");
    ResTreeNode* b = Make(u"B");
    ResTreeNode* n = Make(u"N", u"../A,../B");
    for (ResTreeNode* node : {a, b}) {
        node->AddObserver(&observer, ReservationChanged, 7);
    }
    n->AddObserver(&observer, ReservationChanged, 5);
    // N also hears of both dependants.
    n->Reserve(u"a", ReserveRead);
    EXPECT_EQ(log.Take(),
              "o: A ReservationChanged #7\no: N ReservationChanged #5\n"
              "o: B ReservationChanged #7\no: N ReservationChanged #5\n"
              "o: N ReservationChanged #5\n");
    n->Release(u"a");
    EXPECT_EQ(log.Take(),
              "o: N ReservationChanged #5\n"
              "o: B ReservationChanged #7\no: N ReservationChanged #5\n"
              "o: A ReservationChanged #7\no: N ReservationChanged #5\n");
    const uint32_t saved = n->BeginChanges();
    n->Reserve(u"a", ReserveRead);
    n->EndChanges(saved, false);
    EXPECT_EQ(log.Take(), "o: A ReservationChanged #7\no: B ReservationChanged #7\no: N ReservationChanged #5\n");
}

TEST_F(ReservationNotices, UndoIsToldInReverse) {
    ResTreeNode* a = Make(u"A");
    ResTreeNode* b = Make(u"B", u"../A");
    ResTreeNode* n = Make(u"N", u"../B,../C");
    Make(u"C")->ReserveOne(u"x", ReserveExclusive);
    a->AddObserver(&observer, everything, 1000);
    b->AddObserver(&observer, everything & ~static_cast<uint32_t>(ReservationChanged), 1000);
    b->AddObserver(&second, ReservationChanged, 1000);
    n->Reserve(u"a", ReserveRead);
    // A tells itself and B; B tells itself. First as they are taken, then from B to A as they are dropped.
    EXPECT_EQ(log.Take(),
              "o: A ReservationChanged #1000\np: B ReservationChanged #1000\n"
              "p: B ReservationChanged #1000\n"
              "p: B ReservationChanged #1000\n"
              "o: A ReservationChanged #1000\np: B ReservationChanged #1000\n");
}

TEST_F(ReservationNotices, DependantNamedTwiceIsTakenAndToldTwice) {
    Make(u"A")->AddObserver(&observer, ReservationChanged, 7);
    ResTreeNode* n = Make(u"N", u"../A,../A");
    n->Reserve(u"a", ReserveRead);
    EXPECT_EQ(log.Take(), "o: A ReservationChanged #7\no: A ReservationChanged #7\n");
    n->Release(u"a");
    EXPECT_EQ(log.Take(), "o: A ReservationChanged #7\n");
}

TEST_F(ReservationNotices, ChangeOfANodeInACircleIsHeardOnceByEachOther) {
    ResTreeNode* a = Make(u"A", u"../B");
    ResTreeNode* b = Make(u"B", u"../A");
    a->AddObserver(&observer, ReservationChanged, 7);
    b->AddObserver(&second, ReservationChanged, 8);
    b->ReserveOne(u"x", ReserveRead);
    const std::string heard = log.Take();
    EXPECT_NE(heard.find("o: A ReservationChanged #7\n"), std::string::npos);
    EXPECT_NE(heard.find("p: B ReservationChanged #8\n"), std::string::npos);
    EXPECT_EQ(heard.size(), std::string("o: A ReservationChanged #7\np: B ReservationChanged #8\n").size());
}

TEST_F(ReservationNotices, RemovedObserverHearsNothingOfDependants) {
    ResTreeNode* a = Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A");
    n->AddObserver(&observer, ReservationChanged, 5);
    n->RemoveObserver(&observer, 5, false);
    a->ReserveOne(u"a", ReserveRead);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(ReservationNotices, EntryInThePlaceOfTheTextIsRemovedWithItsNotices) {
    ResTreeNode* n = Make(u"N");
    ResTreeNode* child = AddChild(*n, u"ZKHWReservation");
    n->ReserveOne(u"a", ReserveRead);
    n->AddObserver(&observer, everything, 7);
    child->AddObserver(&second, everything, 8);
    EXPECT_TRUE(n->ReleaseOne(u"a"));
    EXPECT_EQ(log.Take(),
              "p: ZKHWReservation NodeDeleting #8\np: ZKHWReservation NodeDeleted #8\n"
              "o: N ReservationChanged #7\n");
}

// --- What observers do ---

TEST_F(ReservationNotices, ObserverMayReleaseWhatWasJustTaken) {
    ResTreeNode* a = Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A");
    a->AddObserver(&observer, ReservationChanged, 7);
    Once([&] { a->ReleaseOne(u"a"); });
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 2u);
    EXPECT_EQ(Held(), "N(a:=w)");
}

TEST_F(ReservationNotices, ObserverMayTakeWhatIsStillToBeTaken) {
    ResTreeNode* a = Make(u"A");
    ResTreeNode* b = Make(u"B");
    ResTreeNode* n = Make(u"N", u"../A,../B");
    a->AddObserver(&observer, ReservationChanged, 7);
    Once([&] { b->ReserveOne(u"thief", ReserveExclusive); });
    EXPECT_EQ(n->Reserve(u"a", ReserveRead), 0u);
    EXPECT_EQ(Held(), "B(thief:=!)");
}

TEST_F(ReservationNotices, ObserverMayReserveAndReleaseTheSameNodeFromInside) {
    ResTreeNode* n = Make(u"N");
    n->AddObserver(&observer, ReservationChanged, 7);
    Once([&] {
        EXPECT_EQ(n->Reserve(u"b", ReserveRead), 3u);
        EXPECT_EQ(n->Reserve(u"c", ReserveExclusive), 4u);
        EXPECT_TRUE(n->Release(u"c"));
        EXPECT_EQ(n->Reserve(u"d", ReserveRead), 1u);
    });
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 2u);
    EXPECT_EQ(Held(), "N(d:=r)");
    // What it did comes in one further pass.
    EXPECT_EQ(log.Take(), "o: N ReservationChanged #7\no: N ReservationChanged #7\n");
}

TEST_F(ReservationNotices, NodeThatLeavesBeforeItsTurnIsPassedOver) {
    ResTreeNode* a = Make(u"A");
    Make(u"B");
    ResTreeNode* n = Make(u"N", u"../A,../B");
    a->AddObserver(&observer, ReservationChanged, 7);
    Once([&] { root->RemoveEntryByName(u"B"); });
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 2u);
    EXPECT_EQ(Held(), "A(a:=w) N(a:=w)");
}

TEST_F(ReservationNotices, NodeThatLeavesWhileItsDependantsAreTakenCountsAsRefused) {
    Make(u"A");
    ResTreeNode* b = Make(u"B");
    Make(u"C", u"../B");
    ResTreeNode* n = Make(u"N", u"../A,../C,../D");
    Make(u"D");
    b->AddObserver(&observer, ReservationChanged, 7);
    Once([&] { root->RemoveEntryByName(u"C"); });
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 0u);
    EXPECT_EQ(Held(), "");
}

TEST_F(ReservationNotices, NodeThatRemovesItselfAsItIsTakenStillCountsAsTaken) {
    ResTreeNode* a = Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A");
    a->AddObserver(&observer, ReservationChanged, 7);
    Once([&] { root->RemoveEntryByName(u"A"); });
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 2u);
    EXPECT_EQ(Held(), "N(a:=w)");
}

TEST_F(ReservationNotices, TopOfTheWalkMayLeave) {
    ResTreeNode* a = Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A");
    a->AddObserver(&observer, ReservationChanged, 7);
    Once([&] { root->RemoveEntryByName(u"N"); });
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 0u);
    EXPECT_EQ(Held(), "");
}

TEST_F(ReservationNotices, NodesMayLeaveWhileTheyAreReleased) {
    ResTreeNode* a = Make(u"A");
    Make(u"B", u"../A");
    ResTreeNode* n = Make(u"N", u"../A,../B");
    n->Reserve(u"a", ReserveRead);
    a->AddObserver(&observer, ReservationChanged, 7);
    Once([&] { root->RemoveChildNodes(); });
    EXPECT_TRUE(n->Release(u"a"));
    EXPECT_EQ(Held(), "");
    EXPECT_EQ(root->Begin().IsEnd(), true);
}

TEST_F(ReservationNotices, AllNodesMayLeaveInTheMidstOfAWalkOverThem) {
    ResTreeNode* a = Make(u"A");
    AddChild(*AddChild(*a, u"B"), u"C");
    ResTreeNode* d = Make(u"D");
    a->AddObserver(&observer, ReservationChanged, 7);
    Once([&] { root->RemoveEntryByName(u"A"); });
    EXPECT_TRUE(root->ReserveAll(u"a", ReserveRead, u""));
    EXPECT_EQ(Held(), "D(a:=r)");
    d->AddObserver(&observer, ReservationChanged, 7);
    Once([&] { root->RemoveEntryByName(u"D"); });
    EXPECT_TRUE(root->ReleaseAll(u"a", u""));
    EXPECT_EQ(Held(), "");
}

TEST_F(ReservationNotices, OwnerMayGoWhileItIsReleased) {
    ResTreeNode* b = Make(u"B");
    ResTreeNode* n = Make(u"N", u"../B");
    n->Reserve(u"a", ReserveRead);
    // The owner's text is the very record that is dropped first.
    EXPECT_TRUE(n->Release(n->GetReservations()[0].owner));
    EXPECT_TRUE(b->GetReservations().empty());
}

TEST_F(ReservationNotices, ListMayChangeInTheMidstOfAWalk) {
    ResTreeNode* a = Make(u"A");
    Make(u"B");
    ResTreeNode* n = Make(u"N", u"../A");
    a->AddObserver(&observer, ReservationChanged, 7);
    Once([&] { n->SetProperty(u"Reserves", u"../B"); });
    EXPECT_EQ(n->Reserve(u"a", ReserveRead), 1u);
    EXPECT_EQ(Held(), "A(a:=r) N(a:=r)");
}

TEST_F(ReservationNotices, ExceptionPassesThroughAndLeavesWhatWasTaken) {
    ResTreeNode* a = Make(u"A");
    ResTreeNode* b = Make(u"B");
    ResTreeNode* n = Make(u"N", u"../A,../B");
    b->AddObserver(&observer, ReservationChanged, 7);
    Once([] { throw std::runtime_error("no"); });
    EXPECT_THROW(n->Reserve(u"a", ReserveRead), std::runtime_error);
    EXPECT_EQ(Held(), "A(a:=r) B(a:=r)");
    EXPECT_TRUE(a->HasNoPendingChanges());
    EXPECT_TRUE(n->Release(u"a"));
    EXPECT_EQ(Held(), "");
}

// --- Deferred loads ---

class DeferredReservations : public ResourceFiles {
  protected:
    DeferredReservations() : root(MakeUnnamedRoot()) {
        Load(*root, "<R ordered='true'><N name='a'/><N name='b'><C name='c'/></N><N name='s'><V>0</V></N></R>");
        stub = &At(*root, u"s");
        stub->SetProperty(u":DeferredLoadPath", u"stub.xml");
    }
    bool IsLoaded() const { return stub->FindRaw(u":DeferredLoadPath") == nullptr; }

    std::unique_ptr<ResTreeNode> root;
    ResTreeNode* stub;
};

TEST_F(DeferredReservations, ReservingReadsTheDependants) {
    Write("stub.xml", "<N><Reserves>../a</Reserves></N>");
    EXPECT_EQ(stub->Reserve(u"x", ReserveWrite), 2u);
    EXPECT_EQ(ReservationText(At(*root, u"a")), "x:=w");
}

TEST_F(DeferredReservations, ReleasingDoesNotReadThem) {
    Write("stub.xml", "<N><Reserves>../a</Reserves></N>");
    At(*root, u"a").ReserveOne(u"x", ReserveRead);
    EXPECT_FALSE(stub->Release(u"x"));
    EXPECT_FALSE(stub->ReleaseDependants(u"x"));
    EXPECT_FALSE(IsLoaded());
    EXPECT_EQ(stub->GetReservationFlags(nullptr, false), 1u);
    EXPECT_TRUE(IsLoaded());
    EXPECT_TRUE(stub->Release(u"x"));
}

TEST_F(DeferredReservations, RefusalReadsNothingButTheTextDoes) {
    Write("stub.xml", "<N><ZKHWReservation>file</ZKHWReservation></N>");
    EXPECT_EQ(stub->ReserveOne(u"x", 0), 0u);
    EXPECT_EQ(stub->GetOwnReservationFlags(nullptr, false), 0u);
    EXPECT_FALSE(IsLoaded());
    ChangeLog log;
    LoggingObserver observer(log, "o");
    stub->AddObserver(&observer, allChanges & ~static_cast<uint32_t>(AncestorChanged | ReservationChanged), 7);
    EXPECT_EQ(stub->ReserveOne(u"y", ReserveRead), 1u);
    EXPECT_TRUE(IsLoaded());
    EXPECT_EQ(ReservationText(*stub), "x:=,y:=r");
    // What the load has changed goes unreported with the text.
    EXPECT_EQ(log.Take(), "");
    stub->RemoveObserver(&observer, -1, false);
}

TEST_F(DeferredReservations, WatchingReservationsReadsTheDependants) {
    Write("stub.xml", "<N><Reserves>../a</Reserves></N>");
    ChangeLog log;
    LoggingObserver observer(log, "o");
    EXPECT_TRUE(stub->AddObserver(&observer, ReservationChanged, 7));
    EXPECT_TRUE(IsLoaded());
    At(*root, u"a").ReserveOne(u"x", ReserveRead);
    EXPECT_EQ(log.Take(), "o: s ReservationChanged #7\n");
    EXPECT_TRUE(stub->RemoveObserver(&observer, -1, false));
}

// The search for the text loads, and what hears of the load takes the node away: nothing is held then. A node goes in
// another way while anything else in the process is observed.
class RemovingLoad : public DeferredReservations, public ::testing::WithParamInterface<bool> {};

INSTANTIATE_TEST_SUITE_P(WithAndWithoutOtherObservers, RemovingLoad, ::testing::Bool());

TEST_P(RemovingLoad, NodeThatItsOwnLoadTakesAwayIsRefused) {
    Write("stub.xml", "<N><Reserves>../a</Reserves><Z name='z'/></N>");
    ResTreeNode* z = AddChild(*stub, u"z", u"Other");
    ChangeLog log;
    LoggingObserver observer(log, "o");
    observer.reaction = [this](ResTreeNode&, uint32_t) { root->RemoveEntryByName(u"s"); };
    z->AddObserver(&observer, NodeDeleting, 7);
    CountingObserver other;
    if (GetParam()) {
        At(*root, u"b").AddObserver(&other, NodeNameChanged, 0);
    }
    EXPECT_EQ(stub->ReserveOne(u"x", ReserveWrite), 0u);
    EXPECT_EQ(log.Take(), "o: z NodeDeleting #7\n");
    EXPECT_EQ(root->FindRaw(u"s"), nullptr);
    At(*root, u"b").RemoveObserver(&other, -1, false);
    EXPECT_EQ(ReservationText(At(*root, u"a")), "(none)");
}

TEST_F(DeferredReservations, DescendantsAreRead) {
    Write("stub.xml", "<N><Z name='z'/></N>");
    EXPECT_TRUE(root->ReserveAll(u"x", ReserveWrite, u""));
    EXPECT_EQ(ReservationText(At(*root, u"s/z")), "x:=w");
}

// The stub passes the request up to the root, whose file puts another node in the place of "b".
class ReplacingLoad : public DeferredReservations {
  protected:
    ReplacingLoad() {
        Write("root.xml", "<R><Other name='b'/></R>");
        root->SetProperty(u":DeferredLoadPath", u"root.xml");
        stub->SetProperty(u":DeferredLoadPath", u"..");
        At(*root, u"a").SetProperty(u"Reserves", u"../b/c,../b,../s/missing");
    }
    bool IsReplaced() { return At(*root, u"b").IsA(u"Other"); }
};

TEST_F(ReplacingLoad, ListHoldsWhatStandsAfterALookupOnTheWayHasLoaded) {
    std::vector<ResTreeNode*> list;
    At(*root, u"a").GetDependants(list, true);
    EXPECT_TRUE(IsReplaced());
    EXPECT_EQ(list, (std::vector<ResTreeNode*>{&At(*root, u"b")}));
}

TEST_F(ReplacingLoad, NodeThatItPutsInPlaceOfANamedOneIsTaken) {
    EXPECT_EQ(At(*root, u"a").Reserve(u"x", ReserveWrite), 2u);
    EXPECT_TRUE(IsReplaced());
    EXPECT_EQ(ReservationText(At(*root, u"b")), "x:=w");
}

TEST_F(ReplacingLoad, NodeThatItRemovesIsPassedOverOnItsTurn) {
    At(*root, u"a").SetProperty(u"Reserves", u"../s,../b");
    EXPECT_EQ(At(*root, u"a").Reserve(u"x", ReserveWrite), 2u);
    EXPECT_TRUE(IsReplaced());
    EXPECT_EQ(ReservationText(At(*root, u"b")), "(none)");
    EXPECT_EQ(ReservationText(*stub), "x:=w");
}

TEST_F(ReplacingLoad, NothingIsGivenBelowANodeThatItRemoves) {
    ResTreeNode& b = At(*root, u"b");
    AddText(b, u":DeferredLoadPath", u"..");
    std::vector<ResTreeNode*> list;
    b.CollectMatchingDescendants(u"", list);
    EXPECT_TRUE(IsReplaced());
    EXPECT_TRUE(list.empty());
}

TEST_F(ReplacingLoad, DescendantsThatItRemovesAreLeftOut) {
    // The root's own contents are there, so only what "s" defers to it is still to come when the walk gets there.
    ResTreeNode& b = At(*root, u"b");
    AddText(b, u":DeferredLoadPath", u"b.xml");
    Write("b.xml", "<N><Other name='c'/><N name='d'/></N>");
    At(b, u"c").SetProperty(u":DeferredLoadPath", u"..");
    std::vector<ResTreeNode*> list;
    b.CollectMatchingDescendants(u"", list);
    EXPECT_EQ(list, (std::vector<ResTreeNode*>{&At(b, u"c"), &At(b, u"d")}));
    EXPECT_TRUE(At(b, u"c").IsA(u"Other"));
}

}  // namespace
}  // namespace zkhw
