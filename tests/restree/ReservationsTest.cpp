// The reservations of one node, and the text that shows them.

#include <memory>
#include <set>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "restree/ReservedTree.h"
#include "support/ExactText.h"
#include "support/TreeDump.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

class Reservations : public ReservedTree {
  protected:
    uint32_t Flags(const std::set<String>& owners, bool except) const {
        return node->GetOwnReservationFlags(&owners, except);
    }
    std::string Text() const { return ReservationText(*node); }

    ResTreeNode* node = Make(u"N");
};

TEST_F(Reservations, FreshNodeIsHeldByNobody) {
    EXPECT_EQ(node->GetOwnReservationFlags(nullptr, false), 0u);
    EXPECT_TRUE(node->GetReservations().empty());
    EXPECT_EQ(Text(), "(none)");
}

TEST_F(Reservations, ReaderAndWriterHoldTogetherUntilAnExclusiveRequestDropsBoth) {
    EXPECT_EQ(node->Reserve(u"a", ReserveRead), 1u);
    EXPECT_EQ(Text(), "a:=r");
    EXPECT_EQ(node->Reserve(u"b", ReserveWrite), 3u);
    EXPECT_EQ(Text(), "a:=r,b:=w");
    EXPECT_EQ(node->Reserve(u"c", ReserveExclusive), 4u);
    EXPECT_EQ(Text(), "c:=!");
}

TEST_F(Reservations, ExclusiveHolderKeepsEverybodyOutAndThenFreesTheNode) {
    EXPECT_EQ(node->Reserve(u"c", ReserveExclusive), 4u);
    for (const char16_t* owner : {u"c", u"d"}) {
        for (const uint32_t mode : {0u, 1u, 2u, 4u, 7u, 8u}) {
            EXPECT_EQ(node->Reserve(owner, mode), 0u) << mode;
        }
    }
    EXPECT_EQ(Text(), "c:=!");
    EXPECT_TRUE(node->Release(u"c"));
    EXPECT_EQ(Text(), "(none)");
    EXPECT_FALSE(node->Release(u"c"));
    EXPECT_EQ(node->Reserve(u"d", ReserveRead), 1u);
}

TEST_F(Reservations, SecondWriterIsRefusedAlsoIfItIsTheFirst) {
    EXPECT_EQ(node->Reserve(u"a", ReserveWrite), 2u);
    EXPECT_EQ(node->Reserve(u"a", ReserveWrite), 0u);
    EXPECT_EQ(node->Reserve(u"b", ReserveWrite), 0u);
    EXPECT_EQ(node->Reserve(u"b", ReserveWrite | ReserveRead), 0u);
    EXPECT_EQ(Text(), "a:=w");
}

TEST_F(Reservations, NewModeReplacesTheOldOneButTheResultKeepsIt) {
    EXPECT_EQ(node->ReserveOne(u"a", ReserveRead), 1u);
    EXPECT_EQ(node->ReserveOne(u"a", ReserveWrite), 3u);
    ASSERT_EQ(node->GetReservations().size(), 1u);
    EXPECT_EQ(node->GetReservations()[0].mode, 2u);
    EXPECT_EQ(Text(), "a:=w");
    EXPECT_EQ(node->ReserveOne(u"a", ReserveRead), 3u);
    EXPECT_EQ(Text(), "a:=r");
}

TEST_F(Reservations, ResultForANewOwnerHoldsWhatOthersHold) {
    EXPECT_EQ(node->ReserveOne(u"a", ReserveWrite), 2u);
    EXPECT_EQ(node->ReserveOne(u"b", ReserveRead), 3u);
    EXPECT_EQ(node->ReserveOne(u"c", 0), 3u);
    EXPECT_EQ(Text(), "a:=w,b:=r,c:=");
}

TEST_F(Reservations, ExclusiveModeMayHaveOthersBesideIt) {
    EXPECT_EQ(node->ReserveOne(u"a", ReserveWrite), 2u);
    EXPECT_EQ(node->ReserveOne(u"a", ReserveExclusive | ReserveWrite | ReserveRead), 7u);
    EXPECT_EQ(Text(), "a:=!wr");
}

TEST_F(Reservations, EveryModeHasItsLetters) {
    const char* const letters[] = {"x:=", "x:=r", "x:=w", "x:=wr", "x:=!", "x:=!r", "x:=!w", "x:=!wr"};
    EXPECT_EQ(node->ReserveOne(u"x", 8), 8u);
    EXPECT_EQ(Text(), "x:=");
    for (uint32_t mode = 1; mode < 8; ++mode) {
        node->ReleaseOne(u"x");
        EXPECT_EQ(node->ReserveOne(u"x", mode), mode);
        EXPECT_EQ(Text(), letters[mode]);
    }
}

TEST_F(Reservations, UnknownBitsAreKeptAndGivenBack) {
    EXPECT_EQ(node->ReserveOne(u"a", 0x80000000), 0x80000000u);
    EXPECT_EQ(Text(), "a:=");
    EXPECT_EQ(node->ReserveOne(u"b", 0xFFFFFFF8 | ReserveRead), 0xFFFFFFF9u);
    EXPECT_EQ(Text(), "a:=,b:=r");
    EXPECT_EQ(node->GetOwnReservationFlags(nullptr, false), 0xFFFFFFF9u);
    EXPECT_EQ(node->ReserveOne(u"c", 0xFFFFFFFF), 0xFFFFFFFFu);
    EXPECT_EQ(Text(), "c:=!wr");
}

TEST_F(Reservations, ModeOfZeroOnAFreeNodeIsRefusedButLeavesARecord) {
    EXPECT_EQ(node->ReserveOne(u"a", 0), 0u);
    ASSERT_EQ(node->GetReservations().size(), 1u);
    EXPECT_EQ(Text(), "(none)");
    EXPECT_EQ(node->ReserveOne(u"A", 0), 0u);
    EXPECT_EQ(node->GetReservations().size(), 1u);
    EXPECT_EQ(node->ReserveOne(u"b", ReserveRead), 1u);
    EXPECT_EQ(Text(), "a:=,b:=r");
}

TEST_F(Reservations, RecordOfModeZeroIsReleasedLikeAnyOther) {
    EXPECT_EQ(node->Reserve(u"a", 0), 0u);
    EXPECT_TRUE(node->Release(u"a"));
    EXPECT_TRUE(node->GetReservations().empty());
    EXPECT_EQ(Text(), "(none)");
}

TEST_F(Reservations, ModeOfZeroReplacesAHeldOne) {
    node->ReserveOne(u"a", ReserveRead);
    EXPECT_EQ(node->ReserveOne(u"a", 0), 1u);
    EXPECT_EQ(Text(), "a:=");
    EXPECT_EQ(node->GetOwnReservationFlags(nullptr, false), 0u);
}

TEST_F(Reservations, OwnersThatDifferInCaseAreOne) {
    EXPECT_EQ(node->ReserveOne(u"Item1", ReserveRead), 1u);
    EXPECT_EQ(node->ReserveOne(u"ITEM1", ReserveWrite), 3u);
    // The record keeps the spelling that came first.
    EXPECT_EQ(Text(), "Item1:=w");
    EXPECT_TRUE(node->ReleaseOne(u"iTEM1"));
    EXPECT_EQ(Text(), "(none)");
}

TEST_F(Reservations, OwnersOutsideAsciiAreBlindToCaseToo) {
    EXPECT_EQ(node->ReserveOne(u"\u00C4rger \u65E5\u672C", ReserveRead), 1u);
    EXPECT_EQ(node->ReserveOne(u"\u00E4RGER \u65E5\u672C", ReserveWrite), 3u);
    EXPECT_EQ(Text(), "{00C4}rger {65E5}{672C}:=w");
    EXPECT_EQ(node->ReserveOne(u"Arger \u65E5\u672C", ReserveRead), 3u);
    EXPECT_EQ(Text(), "{00C4}rger {65E5}{672C}:=w,Arger {65E5}{672C}:=r");
}

TEST_F(Reservations, OwnerIsWrittenAsItIs) {
    node->ReserveOne(u"", ReserveRead);
    node->ReserveOne(u"a,b:=\\w", ReserveRead);
    node->ReserveOne(String(u"x\0y", 3), ReserveRead);
    EXPECT_EQ(Text(), ":=r,a,b:=\\w:=r,x{0000}y:=r");
    EXPECT_TRUE(node->ReleaseOne(u""));
    EXPECT_EQ(Text(), "a,b:=\\w:=r,x{0000}y:=r");
}

TEST_F(Reservations, OwnerMayBeTheTextOfARecord) {
    node->ReserveOne(u"a", ReserveRead);
    EXPECT_EQ(node->ReserveOne(node->GetReservations()[0].owner, ReserveExclusive), 4u);
    EXPECT_EQ(Text(), "a:=!");
    EXPECT_TRUE(node->Release(node->GetReservations()[0].owner));
    EXPECT_EQ(Text(), "(none)");
}

TEST_F(Reservations, ReleaseTakesTheOwnersRecordFromAnyPlace) {
    for (const char16_t* owner : {u"a", u"b", u"c", u"d"}) {
        node->ReserveOne(owner, ReserveRead);
    }
    EXPECT_TRUE(node->ReleaseOne(u"b"));
    EXPECT_EQ(Text(), "a:=r,c:=r,d:=r");
    EXPECT_FALSE(node->ReleaseOne(u"b"));
    EXPECT_TRUE(node->ReleaseOne(u"a"));
    EXPECT_EQ(Text(), "c:=r,d:=r");
    EXPECT_TRUE(node->ReleaseOne(u"d"));
    EXPECT_EQ(Text(), "c:=r");
    node->ReserveOne(u"b", ReserveWrite);
    EXPECT_EQ(Text(), "c:=r,b:=w");
}

TEST_F(Reservations, ManyOwnersBehaveLikeFew) {
    std::vector<std::string> names;
    const auto expected = [&names] {
        std::string text;
        for (const std::string& name : names) {
            text += (text.empty() ? "" : ",") + name;
        }
        return text;
    };
    for (int i = 0; i < 100; ++i) {
        const std::string digits = std::to_string(i * 37 % 100);
        names.push_back("Owner" + digits + ":=r");
        EXPECT_EQ(node->ReserveOne(String(qn::dsc::NarrowString(("Owner" + digits).c_str())), ReserveRead), 1u);
    }
    EXPECT_EQ(Text(), expected());
    // Record 0 is "Owner0", record 1 "Owner37", record 50 "Owner50".
    EXPECT_EQ(node->ReserveOne(u"OWNER50", ReserveWrite | ReserveRead), 3u);
    names[50] = "Owner50:=wr";
    EXPECT_EQ(node->ReserveOne(u"new", ReserveWrite), 0u);
    EXPECT_TRUE(node->ReleaseOne(u"owner37"));
    names.erase(names.begin() + 1);
    EXPECT_TRUE(node->ReleaseOne(u"owner0"));
    names.erase(names.begin());
    EXPECT_FALSE(node->ReleaseOne(u"owner37"));
    EXPECT_EQ(Text(), expected());
    EXPECT_TRUE(node->ReleaseOne(u"owner50"));
    names.erase(names.begin() + 48);
    EXPECT_EQ(node->GetOwnReservationFlags(nullptr, false), 1u);
    EXPECT_EQ(node->ReserveOne(u"new", ReserveWrite), 3u);
    names.emplace_back("new:=w");
    EXPECT_EQ(Text(), expected());
    EXPECT_EQ(node->ReserveOne(u"x", ReserveExclusive), 4u);
    EXPECT_EQ(Text(), "x:=!");
}

// --- The text and what others do with it ---

TEST_F(Reservations, TextIsMadeAnewIfSomebodyHasChangedIt) {
    node->ReserveOne(u"a", ReserveRead);
    node->SetProperty(u"zkhwRESERVATION", u"mine");
    node->ReserveOne(u"b", ReserveRead);
    EXPECT_EQ(Text(), "a:=r,b:=r");
    // The same text again, then as long a one.
    node->SetProperty(u"ZKHWReservation", u"a:=r,b:=r");
    node->SetProperty(u"ZKHWReservation", u"A:=r,B:=w");
    node->ReleaseOne(u"a");
    EXPECT_EQ(Text(), "b:=r");
    node->SetProperty(u"ZKHWReservation", u"");
    node->ReserveOne(u"b", ReserveWrite);
    EXPECT_EQ(Text(), "b:=w");
}

TEST_F(Reservations, TextIsMadeAnewIfItWasRemoved) {
    node->ReserveOne(u"a", ReserveRead);
    node->RemoveEntryByName(u"ZKHWReservation");
    node->ReserveOne(u"b", ReserveRead);
    EXPECT_EQ(Text(), "a:=r,b:=r");
    node->RemoveEntryByName(u"ZKHWReservation");
    EXPECT_TRUE(node->ReleaseOne(u"a"));
    EXPECT_EQ(Text(), "b:=r");
    node->RemoveEntryByName(u"ZKHWReservation");
    EXPECT_TRUE(node->ReleaseOne(u"b"));
    EXPECT_EQ(Text(), "(none)");
}

TEST_F(Reservations, TextThatCameBackUnderItsNameIsMadeAnew) {
    node->ReserveOne(u"a", ReserveRead);
    node->RenameEntry(u"ZKHWReservation", u"Kept");
    node->ReserveOne(u"b", ReserveRead);
    node->ReserveOne(u"c", ReserveRead);
    node->RemoveEntryByName(u"ZKHWReservation");
    node->RenameEntry(u"Kept", u"ZKHWReservation");
    EXPECT_EQ(Text(), "a:=r");
    node->ReserveOne(u"d", ReserveRead);
    EXPECT_EQ(Text(), "a:=r,b:=r,c:=r,d:=r");
}

TEST_F(Reservations, TextStandsAtTheEndOfAnOrderedNodeAndKeepsItsKindThere) {
    AddText(*root, u"ZKHWReservation", u"x", LocalizedTextEntry);
    AddText(*root, u"Behind", u"1");
    root->ReserveOne(u"a", ReserveRead);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  N:T\n  ZKHWReservation~a:=r\n  Behind=1\n");
    root->ReleaseOne(u"a");
    root->ReserveOne(u"b", ReserveRead);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  N:T\n  Behind=1\n  ZKHWReservation=b:=r\n");
}

TEST_F(Reservations, FirstOfSeveralTextsShowsTheRecords) {
    AddText(*root, u"ZKHWReservation", u"1");
    AddText(*root, u"ZKHWReservation", u"2");
    root->ReserveOne(u"a", ReserveRead);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  N:T\n  ZKHWReservation=a:=r\n  ZKHWReservation=2\n");
    root->ReleaseOne(u"a");
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  N:T\n  ZKHWReservation=2\n");
}

TEST_F(Reservations, EntryThatIsNoTextStaysUntilTheLastRecordGoes) {
    for (const bool isChild : {false, true}) {
        if (isChild) {
            AddChild(*node, u"ZKHWReservation");
        } else {
            AddLink(*node, u"ZKHWReservation", u"..");
        }
        const std::string before = DumpTree(*node);
        EXPECT_EQ(node->ReserveOne(u"a", ReserveRead), 1u);
        EXPECT_EQ(node->ReserveOne(u"b", ReserveRead), 1u);
        EXPECT_TRUE(node->ReleaseOne(u"a"));
        EXPECT_EQ(DumpTree(*node), before);
        EXPECT_TRUE(node->ReleaseOne(u"b"));
        EXPECT_EQ(DumpTree(*node), "N:T\n");
    }
}

TEST_F(Reservations, RefreshMakesAndRemovesTheText) {
    node->ReserveOne(u"a", 0);
    node->RefreshReservationProperty();
    EXPECT_EQ(Text(), "a:=");
    node->SetProperty(u"ZKHWReservation", u"x");
    node->RefreshReservationProperty();
    EXPECT_EQ(Text(), "a:=");
    root->SetProperty(u"ZKHWReservation", u"x");
    root->RefreshReservationProperty();
    EXPECT_EQ(ReservationText(*root), "(none)");
}

TEST_F(Reservations, CopiesTakeTheTextButNotTheRecords) {
    node->ReserveOne(u"a", ReserveExclusive);
    const std::unique_ptr<ResTreeNode> copy = node->Clone();
    EXPECT_EQ(ReservationText(*copy), "a:=!");
    EXPECT_TRUE(copy->GetReservations().empty());
    EXPECT_EQ(copy->ReserveOne(u"b", ReserveRead), 1u);
    EXPECT_EQ(ReservationText(*copy), "b:=r");
    EXPECT_EQ(Text(), "a:=!");
}

TEST_F(Reservations, NodeThatIsRemovedTakesItsRecordsAlong) {
    node->ReserveOne(u"a", ReserveExclusive);
    root->RemoveEntryByName(u"N");
    EXPECT_EQ(Make(u"N")->ReserveOne(u"b", ReserveExclusive), 4u);
    EXPECT_EQ(Held(), "N(b:=!)");
}

// --- How the node is held ---

TEST_F(Reservations, FlagsOfEverybodyAreOneSet) {
    node->ReserveOne(u"a", ReserveRead);
    node->ReserveOne(u"b", ReserveWrite | 16);
    EXPECT_EQ(node->GetOwnReservationFlags(nullptr, false), 19u);
    EXPECT_EQ(node->GetOwnReservationFlags(nullptr, true), 19u);
}

TEST_F(Reservations, FlagsOfOwnersAreThoseOfTheFirstRecordThatMatches) {
    node->ReserveOne(u"a", ReserveRead);
    node->ReserveOne(u"b", ReserveWrite);
    node->ReserveOne(u"c", 16);
    EXPECT_EQ(Flags({u"b"}, false), 2u);
    EXPECT_EQ(Flags({u"C", u"B"}, false), 2u);
    EXPECT_EQ(Flags({u"x"}, false), 0u);
    EXPECT_EQ(Flags({}, false), 0u);
    EXPECT_EQ(Flags({u"a"}, true), 2u);
    EXPECT_EQ(Flags({u"A", u"B"}, true), 16u);
    EXPECT_EQ(Flags({u"b"}, true), 1u);
    EXPECT_EQ(Flags({}, true), 1u);
    EXPECT_EQ(Flags({u"a", u"b", u"c"}, true), 0u);
}

TEST_F(Reservations, FirstRecordThatMatchesCountsAlsoWithAModeOfZero) {
    node->ReserveOne(u"a", 0);
    node->ReserveOne(u"b", ReserveWrite);
    EXPECT_EQ(Flags({u"a", u"b"}, false), 0u);
    EXPECT_EQ(Flags({u"x"}, true), 0u);
}

TEST_F(Reservations, ListOfOwnersIsSplitAndTrimmed) {
    node->ReserveOne(u"a b", ReserveRead);
    node->ReserveOne(u"c", ReserveWrite);
    const String owners(u" x , A B\t,,c,c");
    EXPECT_EQ(node->GetReservationFlags(&owners, false), 1u);
    EXPECT_EQ(node->GetReservationFlags(&owners, true), 0u);
    const String others(u"a,b");
    EXPECT_EQ(node->GetReservationFlags(&others, false), 0u);
    EXPECT_EQ(node->GetReservationFlags(&others, true), 1u);
    const String nobody(u"");
    EXPECT_EQ(node->GetReservationFlags(&nobody, false), 0u);
    EXPECT_EQ(node->GetReservationFlags(&nobody, true), 1u);
}

TEST_F(Reservations, EmptyPieceOfTheListIsTheEmptyOwner) {
    node->ReserveOne(u"", ReserveRead);
    const String owners(u"x,");
    EXPECT_EQ(node->GetReservationFlags(&owners, false), 1u);
}

}  // namespace
}  // namespace zkhw
