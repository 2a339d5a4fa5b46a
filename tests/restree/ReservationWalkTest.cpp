// Reservations that take dependants or descendants along.

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "restree/ReservedTree.h"
#include "support/ExactText.h"
#include "support/SmallStack.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::RunOnSmallStack;

class ReservationWalks : public ReservedTree {
  protected:
    static std::vector<std::string> Owners(ResTreeNode& node, bool activeOnly = false) {
        std::vector<String> list;
        node.GetReservationOwners(list, activeOnly);
        return qn::dsc::ExactTexts(list);
    }
    static std::string Matching(ResTreeNode& node, const char16_t* filter) {
        std::vector<ResTreeNode*> list;
        node.CollectMatchingDescendants(filter, list);
        std::string names;
        for (const ResTreeNode* found : list) {
            names += qn::dsc::ExactText(found->GetName());
        }
        return names;
    }
};

using Texts = std::vector<std::string>;

// --- Dependants ---

TEST_F(ReservationWalks, DependantsAreTakenAtAnyDistance) {
    Make(u"A");
    Make(u"B", u"../A");
    ResTreeNode* n = Make(u"N", u" ../B , ../Nobody,/A/..,../D");
    Make(u"D");
    EXPECT_EQ(n->Reserve(u"a", ReserveRead), 1u);
    EXPECT_EQ(Held(), "Root(a:=r) A(a:=r) B(a:=r) N(a:=r) D(a:=r)");
    EXPECT_TRUE(n->Release(u"A"));
    EXPECT_EQ(Held(), "");
    EXPECT_FALSE(n->Release(u"a"));
}

TEST_F(ReservationWalks, ResultIsThatOfTheNodeItself) {
    Make(u"A")->ReserveOne(u"x", ReserveWrite);
    ResTreeNode* n = Make(u"N", u"../A");
    n->ReserveOne(u"y", 16);
    EXPECT_EQ(n->Reserve(u"a", ReserveRead), 17u);
    EXPECT_EQ(Held(), "A(x:=w,a:=r) N(y:=,a:=r)");
}

TEST_F(ReservationWalks, PathThatLeadsNowhereIsAsIfNotListed) {
    ResTreeNode* n = Make(u"N", u"../Nobody,/x/y,../../..");
    EXPECT_EQ(n->Reserve(u"a", ReserveExclusive), 4u);
    EXPECT_EQ(Held(), "N(a:=!)");
    EXPECT_TRUE(n->ReserveDependants(u"b", ReserveWrite));
    EXPECT_FALSE(n->ReleaseDependants(u"b"));
}

TEST_F(ReservationWalks, LinkLeadsToADependant) {
    Make(u"A");
    AddLink(*root, u"L", u"A");
    ResTreeNode* n = Make(u"N", u"../L");
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 2u);
    EXPECT_EQ(Held(), "A(a:=w) N(a:=w)");
}

TEST_F(ReservationWalks, ReservesThatIsALinkNamesNobody) {
    Make(u"A");
    ResTreeNode* n = Make(u"N");
    AddLink(*n, u"Reserves", u"../A");
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 2u);
    EXPECT_EQ(Held(), "N(a:=w)");
}

TEST_F(ReservationWalks, DependantMayBeTheNodesOwnChildAndItsParent) {
    ResTreeNode* n = Make(u"N", u"C,..");
    Make(u"C", u"..", n);
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 2u);
    EXPECT_EQ(Held(), "Root(a:=w) N(a:=w) C(a:=w)");
    EXPECT_TRUE(n->Release(u"a"));
    EXPECT_EQ(Held(), "");
}

TEST_F(ReservationWalks, DependantsAloneLeaveTheNodeFree) {
    Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A");
    EXPECT_TRUE(n->ReserveDependants(u"a", ReserveWrite));
    EXPECT_EQ(Held(), "A(a:=w)");
    EXPECT_FALSE(n->ReserveDependants(u"b", ReserveWrite));
    EXPECT_EQ(n->ReserveOne(u"b", ReserveWrite), 2u);
    EXPECT_TRUE(n->ReleaseDependants(u"a"));
    EXPECT_EQ(Held(), "N(b:=w)");
    EXPECT_FALSE(n->ReleaseDependants(u"b"));
}

TEST_F(ReservationWalks, ReleaseReportsADependantThoughTheNodeWasFree) {
    Make(u"A")->ReserveOne(u"a", ReserveRead);
    EXPECT_TRUE(Make(u"N", u"../A")->Release(u"a"));
    EXPECT_EQ(Held(), "");
}

TEST_F(ReservationWalks, ReleaseReportsTheNodeThoughItsDependantsWereFree) {
    Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A");
    n->ReserveOne(u"a", ReserveRead);
    EXPECT_TRUE(n->Release(u"a"));
}

TEST_F(ReservationWalks, ReleaseOfOneLeavesTheOthersHeld) {
    Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A");
    n->Reserve(u"a", ReserveRead);
    n->Reserve(u"b", ReserveRead);
    EXPECT_TRUE(n->ReleaseOne(u"a"));
    EXPECT_EQ(Held(), "A(a:=r,b:=r) N(b:=r)");
    EXPECT_TRUE(n->Release(u"a"));
    EXPECT_EQ(Held(), "A(b:=r) N(b:=r)");
}

TEST_F(ReservationWalks, DependantThatWasRemovedIsNoLongerTaken) {
    Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A");
    n->Reserve(u"a", ReserveRead);
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(Held(), "N(a:=r)");
    EXPECT_TRUE(n->Release(u"a"));
    EXPECT_EQ(n->Reserve(u"b", ReserveWrite), 2u);
}

// --- Refusals ---

TEST_F(ReservationWalks, BlockedDependantInTheMiddleUndoesTheOnesBefore) {
    Make(u"A");
    Make(u"B")->ReserveOne(u"x", ReserveExclusive);
    Make(u"C");
    ResTreeNode* n = Make(u"N", u"../A,../B,../C");
    EXPECT_EQ(n->Reserve(u"a", ReserveRead), 0u);
    EXPECT_EQ(Held(), "B(x:=!)");
}

TEST_F(ReservationWalks, BlockedDependantIsTheFirstOrTheLast) {
    for (const char16_t* blocked : {u"A", u"C"}) {
        root = MakeRootNode(true);
        for (const char16_t* name : {u"A", u"B", u"C"}) {
            Make(name);
        }
        root->Lookup(blocked, nullptr)->ReserveOne(u"x", ReserveWrite);
        const std::string before = Held();
        EXPECT_EQ(Make(u"N", u"../A,../B,../C")->Reserve(u"a", ReserveWrite), 0u);
        EXPECT_EQ(Held(), before);
    }
}

TEST_F(ReservationWalks, BlockedNodeUndoesAllItsDependants) {
    Make(u"A");
    Make(u"B", u"../A");
    ResTreeNode* n = Make(u"N", u"../B");
    n->ReserveOne(u"x", ReserveExclusive);
    EXPECT_EQ(n->Reserve(u"a", ReserveRead), 0u);
    EXPECT_EQ(Held(), "N(x:=!)");
}

TEST_F(ReservationWalks, BlockedNodeDeepInTheMiddleUndoesEveryLevel) {
    // N takes P (with A), then Q, which takes B and then R, which takes C and is blocked itself.
    Make(u"A");
    Make(u"B");
    Make(u"C");
    Make(u"P", u"../A");
    Make(u"Q", u"../B,../R,../D");
    Make(u"R", u"../C")->ReserveOne(u"x", ReserveExclusive);
    Make(u"D");
    EXPECT_EQ(Make(u"N", u"../P,../Q")->Reserve(u"a", ReserveRead), 0u);
    EXPECT_EQ(Held(), "R(x:=!)");
}

TEST_F(ReservationWalks, UndoAlsoDropsWhatTheOwnerHadHeldBefore) {
    Make(u"A")->ReserveOne(u"a", ReserveRead);
    Make(u"B")->ReserveOne(u"x", ReserveExclusive);
    Make(u"C")->ReserveOne(u"a", ReserveRead);
    ResTreeNode* n = Make(u"N", u"../A,../B,../C");
    n->ReserveOne(u"a", ReserveRead);
    EXPECT_EQ(n->Reserve(u"a", ReserveRead), 0u);
    EXPECT_EQ(Held(), "B(x:=!) C(a:=r) N(a:=r)");
}

TEST_F(ReservationWalks, RefusedNodeKeepsWhatTheOwnerHeldOnIt) {
    Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A");
    n->ReserveOne(u"a", ReserveWrite);
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 0u);
    EXPECT_EQ(Held(), "N(a:=w)");
}

TEST_F(ReservationWalks, ExclusiveRequestThatFailsLaterHasDroppedOthersForGood) {
    Make(u"A")->ReserveOne(u"y", ReserveRead);
    Make(u"B")->ReserveOne(u"x", ReserveExclusive);
    EXPECT_EQ(Make(u"N", u"../A,../B")->Reserve(u"a", ReserveExclusive), 0u);
    EXPECT_EQ(Held(), "B(x:=!)");
}

TEST_F(ReservationWalks, ModeOfZeroIsRefusedByTheFirstFreeDependant) {
    ResTreeNode* a = Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A");
    EXPECT_EQ(n->Reserve(u"a", 0), 0u);
    // The record of the dependant stays: a refused node is not released.
    EXPECT_EQ(a->GetReservations().size(), 1u);
    EXPECT_TRUE(n->GetReservations().empty());
}

TEST_F(ReservationWalks, DependantNamedTwiceCanBeReadButNotWritten) {
    Make(u"A");
    ResTreeNode* n = Make(u"N", u"../A,../A");
    EXPECT_EQ(n->Reserve(u"a", ReserveRead), 1u);
    EXPECT_EQ(Held(), "A(a:=r) N(a:=r)");
    n->Release(u"a");
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 0u);
    EXPECT_EQ(Held(), "");
    EXPECT_EQ(n->Reserve(u"a", ReserveExclusive), 0u);
    EXPECT_EQ(Held(), "");
}

TEST_F(ReservationWalks, DependantReachedInTwoWaysCanBeReadButNotWritten) {
    Make(u"A");
    Make(u"B", u"../A");
    Make(u"C", u"../A");
    ResTreeNode* n = Make(u"N", u"../B,../C");
    EXPECT_EQ(n->Reserve(u"a", ReserveRead), 1u);
    EXPECT_EQ(Held(), "A(a:=r) B(a:=r) C(a:=r) N(a:=r)");
    EXPECT_TRUE(n->Release(u"a"));
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 0u);
    EXPECT_EQ(Held(), "");
}

// --- Circles ---

TEST_F(ReservationWalks, NodeThatReservesItselfIsTakenOnce) {
    ResTreeNode* n = Make(u"N", u".,,../N");
    EXPECT_EQ(n->Reserve(u"a", ReserveWrite), 2u);
    EXPECT_EQ(Held(), "N(a:=w)");
    EXPECT_EQ(n->GetReservationFlags(nullptr, false), 2u);
    EXPECT_EQ(Owners(*n), Texts{"a"});
    EXPECT_TRUE(n->Release(u"a"));
    EXPECT_TRUE(n->ReserveDependants(u"a", ReserveWrite));
    EXPECT_EQ(Held(), "");
    n->ReserveOne(u"a", ReserveWrite);
    EXPECT_FALSE(n->ReleaseDependants(u"a"));
    EXPECT_EQ(Held(), "N(a:=w)");
}

TEST_F(ReservationWalks, CircleIsTakenOnceAroundFromWhereItIsEntered) {
    ResTreeNode* a = Make(u"A", u"../B");
    ResTreeNode* b = Make(u"B", u"../C");
    ResTreeNode* c = Make(u"C", u"../A");
    for (ResTreeNode* entered : {a, b, c}) {
        EXPECT_EQ(entered->Reserve(u"x", ReserveExclusive), 4u);
        EXPECT_EQ(Held(), "A(x:=!) B(x:=!) C(x:=!)");
        EXPECT_EQ(a->GetReservationFlags(nullptr, false), 4u);
        EXPECT_TRUE(entered->Release(u"x"));
        EXPECT_EQ(Held(), "");
        EXPECT_EQ(a->GetReservationFlags(nullptr, false), 0u);
        EXPECT_EQ(Owners(*entered), Texts());
    }
}

TEST_F(ReservationWalks, CircleThatIsBlockedLeavesNothingBehind) {
    ResTreeNode* a = Make(u"A", u"../B");
    Make(u"B", u"../A,../D,../C");
    Make(u"C", u"../A")->ReserveOne(u"x", ReserveExclusive);
    Make(u"D", u"../B");
    EXPECT_EQ(a->Reserve(u"a", ReserveWrite), 0u);
    EXPECT_EQ(Held(), "C(x:=!)");
}

TEST_F(ReservationWalks, RefusedCircleKeepsWhatTheOwnerHeldOnTheWay) {
    // A is being walked over when B is refused, and so isn't entered by the release that follows.
    ResTreeNode* a = Make(u"A", u"../B");
    Make(u"B", u"../A")->ReserveOne(u"x", ReserveExclusive);
    a->ReserveOne(u"a", ReserveRead);
    EXPECT_EQ(a->Reserve(u"a", ReserveRead), 0u);
    EXPECT_EQ(Held(), "A(a:=r) B(x:=!)");
}

TEST_F(ReservationWalks, MeshOfNodesThatAllNameEachOtherEnds) {
    std::u16string all;
    for (char16_t name = u'A'; name <= u'Z'; ++name) {
        all += u"../";
        all += name;
        all += u',';
    }
    ResTreeNode* first = nullptr;
    for (char16_t name = u'Z'; name >= u'A'; --name) {
        const char16_t text[] = {name, 0};
        first = Make(text, all.c_str());
    }
    EXPECT_EQ(first->Reserve(u"a", ReserveRead), 1u);
    for (EntryIterator entry = root->Begin(); !entry.IsEnd(); ++entry) {
        EXPECT_EQ(ReservationText(*entry->Child()), "a:=r");
    }
    EXPECT_EQ(first->GetReservationFlags(nullptr, false), 1u);
    EXPECT_EQ(first->Reserve(u"b", ReserveWrite), 0u);
    EXPECT_TRUE(first->Release(u"a"));
    EXPECT_EQ(Held(), "");
    EXPECT_EQ(Owners(*first), Texts());
}

// --- Questions ---

TEST_F(ReservationWalks, FlagsAreThoseOfTheNodeAndAllDependants) {
    Make(u"A")->ReserveOne(u"a", ReserveWrite);
    Make(u"B", u"../A");
    ResTreeNode* n = Make(u"N", u"../B,../C");
    EXPECT_EQ(n->GetReservationFlags(nullptr, false), 2u);
    Make(u"C")->ReserveOne(u"c", 16);
    EXPECT_EQ(n->GetReservationFlags(nullptr, false), 18u);
    n->ReserveOne(u"n", ReserveRead);
    EXPECT_EQ(n->GetReservationFlags(nullptr, true), 19u);
    const String owners(u"a,c");
    EXPECT_EQ(n->GetReservationFlags(&owners, false), 18u);
    EXPECT_EQ(n->GetReservationFlags(&owners, true), 1u);
    EXPECT_EQ(n->GetOwnReservationFlags(nullptr, false), 1u);
}

TEST_F(ReservationWalks, OwnersComeFromTheNodeIfItHasAny) {
    Make(u"A")->ReserveOne(u"x", ReserveRead);
    ResTreeNode* n = Make(u"N", u"../A");
    n->ReserveOne(u"b", ReserveRead);
    n->ReserveOne(u"a", ReserveWrite);
    EXPECT_EQ(Owners(*n), (Texts{"b", "a"}));
}

TEST_F(ReservationWalks, OwnersComeFromTheFirstDependantThatHasAny) {
    Make(u"A")->ReserveOne(u"deep", ReserveRead);
    Make(u"B", u"../A");
    Make(u"C")->ReserveOne(u"near", ReserveRead);
    ResTreeNode* n = Make(u"N", u"../Empty,../B,../C");
    Make(u"Empty");
    EXPECT_EQ(Owners(*n), Texts{"deep"});
    n->SetProperty(u"Reserves", u"../C,../B");
    EXPECT_EQ(Owners(*n), Texts{"near"});
}

TEST_F(ReservationWalks, InactiveOwnersAreLeftOutOnDemand) {
    Make(u"A")->ReserveOne(u"x", ReserveRead);
    ResTreeNode* n = Make(u"N", u"../A");
    n->ReserveOne(u"zero", 0);
    n->ReserveOne(u"high", 8);
    EXPECT_EQ(Owners(*n), (Texts{"zero", "high"}));
    EXPECT_EQ(Owners(*n, true), Texts{"x"});
    n->ReserveOne(u"w", ReserveWrite);
    EXPECT_EQ(Owners(*n, true), Texts{"w"});
}

TEST_F(ReservationWalks, ListOfOwnersThatIsNotEmptyStaysAsItIs) {
    ResTreeNode* n = Make(u"N");
    n->ReserveOne(u"a", ReserveRead);
    std::vector<String> list{u"old"};
    n->GetReservationOwners(list, false);
    EXPECT_EQ(qn::dsc::ExactTexts(list), Texts{"old"});
}

// --- Descendants ---

class ReservedDescendants : public ReservationWalks {
  protected:
    // A has B and C, B has D; E has F. B, D, E and F are of type "Module", which is a "Resource".
    ReservedDescendants() {
        ResTreeNode* a = Make(u"A");
        ResTreeNode* b = AddChild(*a, u"B", u"Module");
        AddChild(*a, u"C");
        AddChild(*b, u"D", u"Module");
        ResTreeNode* e = AddChild(*root, u"E", u"Module");
        AddChild(*e, u"F", u"Module");
        AddLink(*root, u"L", u"A");
        AddText(*root, u"T", u"A");
    }
    ResTreeNode& At(const char16_t* path) const { return *root->Lookup(path, nullptr); }
};

TEST_F(ReservedDescendants, AreListedParentsFirstWithoutTheNodeItself) {
    EXPECT_EQ(Matching(*root, u""), "ABDCEF");
    EXPECT_EQ(Matching(At(u"A/C"), u""), "");
}

TEST_F(ReservedDescendants, ChildThatDoesNotMatchEndsItsBranch) {
    EXPECT_EQ(Matching(*root, u"resource"), "EF");
    EXPECT_EQ(Matching(At(u"A"), u"Module"), "BD");
    AddText(At(u"A"), u"Protocols", u"Module,resource");
    // Letter by letter in "Protocols".
    EXPECT_EQ(Matching(*root, u"resource"), "ABDEF");
    EXPECT_EQ(Matching(*root, u"Resource"), "EF");
}

TEST_F(ReservedDescendants, AreAppendedToTheList) {
    std::vector<ResTreeNode*> list{root.get()};
    At(u"E").CollectMatchingDescendants(u"", list);
    EXPECT_EQ(list, (std::vector<ResTreeNode*>{root.get(), &At(u"E/F")}));
}

TEST_F(ReservedDescendants, AreTakenAndDroppedTogether) {
    EXPECT_TRUE(root->ReserveAll(u"a", ReserveWrite, u""));
    EXPECT_EQ(Held(), "A(a:=w) B(a:=w) D(a:=w) C(a:=w) E(a:=w) F(a:=w)");
    EXPECT_FALSE(root->ReserveAll(u"b", ReserveWrite, u""));
    EXPECT_TRUE(root->ReleaseAll(u"a", u"Resource"));
    EXPECT_EQ(Held(), "A(a:=w) B(a:=w) D(a:=w) C(a:=w)");
    EXPECT_FALSE(root->ReleaseAll(u"a", u"Resource"));
    EXPECT_TRUE(root->ReleaseAll(u"a", u""));
    EXPECT_EQ(Held(), "");
}

TEST_F(ReservedDescendants, AreNotTakenIfOneIsBlocked) {
    for (const char16_t* blocked : {u"A", u"A/C", u"E/F"}) {
        At(blocked).ReserveOne(u"x", ReserveExclusive);
        const std::string before = Held();
        EXPECT_FALSE(root->ReserveAll(u"a", ReserveRead, u""));
        EXPECT_EQ(Held(), before);
        At(blocked).ReleaseOne(u"x");
    }
}

TEST_F(ReservedDescendants, FilterPassesABlockedOneBy) {
    At(u"A/C").ReserveOne(u"x", ReserveExclusive);
    EXPECT_TRUE(At(u"A").ReserveAll(u"a", ReserveRead, u"Module"));
    EXPECT_EQ(Held(), "B(a:=r) D(a:=r) C(x:=!)");
}

TEST_F(ReservedDescendants, TakeTheirDependantsAlongEvenTheNodeItself) {
    AddText(At(u"A/B"), u"Reserves", u"../..,/E");
    EXPECT_TRUE(At(u"A").ReserveAll(u"a", ReserveWrite, u"Module"));
    EXPECT_EQ(Held(), "Root(a:=w) B(a:=w) D(a:=w) E(a:=w)");
    EXPECT_TRUE(At(u"A").ReleaseAll(u"a", u"Module"));
    EXPECT_EQ(Held(), "");
}

TEST_F(ReservedDescendants, ThatReserveEachOtherCanOnlyBeRead) {
    AddText(At(u"A/B"), u"Reserves", u"../C");
    EXPECT_TRUE(root->ReserveAll(u"a", ReserveRead, u""));
    EXPECT_TRUE(root->ReleaseAll(u"a", u""));
    EXPECT_FALSE(root->ReserveAll(u"a", ReserveWrite, u""));
    EXPECT_EQ(Held(), "");
}

TEST_F(ReservedDescendants, OfALeafAreTakenWithoutAnyEffect) {
    EXPECT_TRUE(At(u"A/C").ReserveAll(u"a", ReserveExclusive, u""));
    EXPECT_FALSE(At(u"A/C").ReleaseAll(u"a", u""));
    EXPECT_EQ(Held(), "");
}

// --- Long and wide ---

constexpr int levels = 100'000;

// Root with 100,000 levels of "x" below; each reserves the next, and the last one the root if that is wanted.
struct LongChain {
    explicit LongChain(bool isCircle) {
        ResTreeNode* node = root.get();
        for (int i = 0; i < levels; ++i) {
            AddText(*node, u"Reserves", u"x");
            node = AddChild(*node, u"x");
        }
        last = node;
        if (isCircle) {
            AddText(*last, u"Reserves", u"/");
        }
    }
    std::unique_ptr<ResTreeNode> root = MakeRootNode();
    ResTreeNode* last;
};

TEST(LongReservations, ChainsAndCirclesOfManyNodesAreTakenAskedAndReleased) {
    RunOnSmallStack([] {
        for (const bool isCircle : {false, true}) {
            const LongChain chain(isCircle);
            EXPECT_EQ(chain.root->Reserve(u"a", ReserveWrite), 2u);
            EXPECT_EQ(ReservationText(*chain.last), "a:=w");
            EXPECT_EQ(chain.root->Reserve(u"b", ReserveWrite), 0u);
            EXPECT_TRUE(chain.root->ReleaseOne(u"a"));
            EXPECT_EQ(chain.root->GetReservationFlags(nullptr, false), 2u);
            EXPECT_TRUE(chain.root->Release(u"a"));
            EXPECT_EQ(ReservationText(*chain.last), "(none)");
            chain.last->ReserveOne(u"z", ReserveExclusive);
            std::vector<String> owners;
            chain.root->GetReservationOwners(owners, false);
            EXPECT_EQ(qn::dsc::ExactTexts(owners), Texts{"z"});
            EXPECT_EQ(chain.root->Reserve(u"b", ReserveRead), 0u);
        }
    });
}

TEST(LongReservations, RefusalAtTheTopUndoesAChainOfManyNodes) {
    RunOnSmallStack([] {
        const LongChain chain(false);
        chain.root->ReserveOne(u"z", ReserveExclusive);
        EXPECT_EQ(chain.root->Reserve(u"a", ReserveRead), 0u);
        EXPECT_EQ(ReservationText(*chain.last), "(none)");
    });
}

TEST(LongReservations, DescendantsOfADeepTreeAreTakenAndReleased) {
    RunOnSmallStack([] {
        LongChain chain(false);
        for (ResTreeNode* node = chain.root.get(); node != nullptr; node = node->Lookup(u"x", nullptr)) {
            node->RemoveEntryByName(u"Reserves");
        }
        EXPECT_TRUE(chain.root->ReserveAll(u"a", ReserveWrite, u""));
        EXPECT_EQ(ReservationText(*chain.last), "a:=w");
        EXPECT_FALSE(chain.root->ReserveAll(u"a", ReserveWrite, u"T"));
        EXPECT_TRUE(chain.root->ReleaseAll(u"a", u"T"));
        EXPECT_EQ(ReservationText(*chain.last), "(none)");
    });
}

String Numbered(const char* name, int number) {
    return String(qn::dsc::NarrowString((name + std::to_string(number)).c_str()));
}

TEST(WideReservations, ManyDependantsOfOneNodeAreTakenAndReleased) {
    constexpr int count = 20'000;
    const auto root = MakeRootNode();
    std::u16string reserves;
    for (int i = 0; i < count; ++i) {
        const String name = Numbered("n", i);
        AddChild(*root, name.CStr());
        reserves.append(i == 0 ? u"" : u",").append(name.View());
    }
    root->SetProperty(u"Reserves", reserves);
    EXPECT_EQ(root->Reserve(u"a", ReserveWrite), 2u);
    EXPECT_EQ(root->Reserve(u"b", ReserveWrite), 0u);
    EXPECT_TRUE(root->Release(u"a"));
    root->Lookup(Numbered("n", count - 1).View(), nullptr)->ReserveOne(u"x", ReserveExclusive);
    EXPECT_EQ(root->Reserve(u"a", ReserveWrite), 0u);
    EXPECT_EQ(root->GetReservationFlags(nullptr, false), 4u);
}

TEST(WideReservations, NodeWithManyOwnersTakesAndReleasesThem) {
    constexpr int count = 20'000;
    const auto root = MakeRootNode();
    size_t length = 0;
    for (int i = 0; i < count; ++i) {
        EXPECT_EQ(root->ReserveOne(Numbered("Owner", i), ReserveRead), 1u);
        length += Numbered("Owner", i).Length() + 4;
    }
    EXPECT_EQ(ReservationText(*root).size(), length - 1);
    for (int i = 0; i < count; i += 100) {
        EXPECT_EQ(root->ReserveOne(Numbered("OWNER", i), ReserveRead | 8) & 1, 1u);
    }
    for (int i = 0; i < count - 1; ++i) {
        EXPECT_TRUE(root->ReleaseOne(Numbered("owner", i)));
    }
    EXPECT_EQ(ReservationText(*root), "Owner19999:=r");
}

TEST(WideReservations, ManyWaysToOneChainAreWalkedInTime) {
    // A ladder of 60 steps, each of which names the next one twice, has 2 to the 60th ways to its end.
    const auto root = MakeRootNode();
    for (int i = 0; i < 60; ++i) {
        const String next = u"../" + Numbered("s", i + 1);
        AddText(*AddChild(*root, Numbered("s", i).CStr()), u"Reserves", (next + u"," + next).CStr());
    }
    ResTreeNode* end = AddChild(*root, u"s60");
    ResTreeNode* top = root->Lookup(u"s0", nullptr);
    EXPECT_EQ(top->Reserve(u"a", ReserveRead), 1u);
    EXPECT_EQ(ReservationText(*end), "a:=r");
    EXPECT_EQ(top->GetReservationFlags(nullptr, false), 1u);
    EXPECT_EQ(top->Reserve(u"b", ReserveWrite), 0u);
    EXPECT_TRUE(top->Release(u"a"));
    EXPECT_EQ(ReservationText(*end), "(none)");
}

}  // namespace
}  // namespace zkhw
