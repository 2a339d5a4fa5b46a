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

// Logs all that is raised on `node` and on every node below it.
void WatchAll(ResTreeNode& node, ResTreeNodeChangeObserver& observer) {
    node.AddObserver(&observer, allChanges & ~static_cast<uint32_t>(AncestorChanged | ReservationChanged), 0);
    for (EntryIterator entry = node.Begin(); !entry.IsEnd(); ++entry) {
        if (entry->Child() != nullptr) {
            WatchAll(*entry->Child(), observer);
        }
    }
}

TEST(RemoveEntry, TakesEntriesOfEveryKind) {
    for (const bool ordered : {false, true}) {
        const auto root = MakeRootNode(ordered);
        AddText(*root, u"a", u"1");
        AddText(*root, u"b", u"2", LocalizedTextEntry);
        AddLink(*root, u"c", u"/");
        AddText(*AddChild(*root, u"d"), u"x", u"1");
        AddText(*root, u"e", u"3");
        root->RemoveEntry(root->FindEntry(u"a"));
        root->RemoveEntry(root->FindEntry(u"b"));
        root->RemoveEntry(root->FindEntry(u"c"));
        root->RemoveEntry(root->FindEntry(u"d"));
        EXPECT_EQ(DumpTree(*root), ordered ? "Root:Root ordered\n  e=3\n" : "Root:Root\n  e=3\n");
    }
}

TEST(RemoveEntry, AtTheEndDoesNothing) {
    const auto root = MakeRootNode();
    AddText(*root, u"a", u"1");
    root->RemoveEntry(root->End());
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  a=1\n");
}

TEST(RemoveEntryByName, TakesTheFirstOfEqualKeys) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"a", u"1");
    AddText(*root, u"A", u"2");
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  A=2\n");
}

TEST(RemoveEntryByName, MissingEntryDoesNothing) {
    const auto root = MakeRootNode();
    AddText(*root, u"a", u"1");
    root->RemoveEntryByName(u"b");
    root->RemoveEntryByName(u"");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  a=1\n");
}

TEST(RemoveEntry, LinkToARemovedNodeLeadsNowhere) {
    const auto root = MakeRootNode();
    ResTreeNode* target = AddChild(*AddChild(*root, u"A"), u"B");
    AddLink(*root, u"link", u"A/B");
    ASSERT_EQ(root->ResolveEntry(root->FindEntry(u"link")), target);
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(root->ResolveEntry(root->FindEntry(u"link")), nullptr);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  link->A/B\n");
}

TEST(RemoveChildNodes, LeavesTextsAndLinks) {
    for (const bool ordered : {false, true}) {
        const auto root = MakeRootNode(ordered);
        AddChild(*root, u"a");
        AddText(*root, u"b", u"1");
        AddChild(*root, u"c");
        AddLink(*root, u"d", u"a");
        AddChild(*AddChild(*root, u"e"), u"f");
        root->RemoveChildNodes();
        EXPECT_EQ(DumpTree(*root), ordered ? "Root:Root ordered\n  b=1\n  d->a\n" : "Root:Root\n  b=1\n  d->a\n");
    }
}

TEST(RemoveChildNodes, OfAnEmptyNodeDoesNothing) {
    const auto root = MakeRootNode();
    root->RemoveChildNodes();
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST(RemoveChildNodes, TakesAllOfManyChildren) {
    for (const bool ordered : {false, true}) {
        for (const bool watched : {false, true}) {
            ChangeLog log;
            LoggingObserver observer(log, "o");
            const auto root = MakeRootNode(ordered);
            for (int i = 0; i < 20'000; ++i) {
                const std::string number = std::to_string(i);
                const std::u16string key(number.begin(), number.end());
                if (i % 4 == 0) {
                    AddText(*root, key.c_str(), u"");
                } else {
                    AddChild(*root, key.c_str());
                }
            }
            if (watched) {
                root->AddObserver(&observer, NodeDeleting, 0);
            }
            root->FindEntry(u"17");
            root->RemoveChildNodes();
            int texts = 0;
            for (EntryIterator entry = root->Begin(); !entry.IsEnd(); ++entry) {
                EXPECT_TRUE(entry->IsText());
                ++texts;
            }
            EXPECT_EQ(texts, 5000);
        }
    }
}

// --- Notices ---

class RemovalNotices : public ::testing::Test {
  protected:
    ChangeLog log;
    LoggingObserver observer{log, "o"};
};

TEST_F(RemovalNotices, DeletingGoesTopDownAndDeletedBottomUp) {
    const auto root = MakeRootNode();
    ResTreeNode* a = AddChild(*root, u"A");
    ResTreeNode* b = AddChild(*a, u"B");
    AddChild(*b, u"C");
    WatchAll(*root, observer);
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(log.Take(),
              "o: A NodeDeleting #0\n"
              "o: B NodeDeleting #0\n"
              "o: C NodeDeleting #0\n"
              "o: C NodeDeleted #0\n"
              "o: B ChildRemoved #0\n"
              "o: B NodeDeleted #0\n"
              "o: A ChildRemoved #0\n"
              "o: A NodeDeleted #0\n"
              "o: Root ChildRemoved #0\n");
}

TEST_F(RemovalNotices, ChildrenOfAnUnorderedNodeGoInTheOrderOfTheirKeys) {
    const auto root = MakeRootNode();
    ResTreeNode* a = AddChild(*root, u"A");
    AddChild(*a, u"z");
    AddChild(*a, u"M");
    AddChild(*a, u"b");
    WatchAll(*root, observer);
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(log.Take(),
              "o: A NodeDeleting #0\n"
              "o: b NodeDeleting #0\n"
              "o: b NodeDeleted #0\n"
              "o: A ChildRemoved #0\n"
              "o: M NodeDeleting #0\n"
              "o: M NodeDeleted #0\n"
              "o: A ChildRemoved #0\n"
              "o: z NodeDeleting #0\n"
              "o: z NodeDeleted #0\n"
              "o: A ChildRemoved #0\n"
              "o: A NodeDeleted #0\n"
              "o: Root ChildRemoved #0\n");
}

TEST_F(RemovalNotices, ChildrenOfAnOrderedNodeGoFromTheLastToTheFirst) {
    const auto root = MakeRootNode();
    ResTreeNode* a = AddChild(*root, u"A", u"T", true);
    AddChild(*a, u"1");
    AddText(*a, u"text", u"");
    AddChild(*a, u"2");
    WatchAll(*root, observer);
    a->RemoveChildNodes();
    EXPECT_EQ(log.Take(),
              "o: 2 NodeDeleting #0\n"
              "o: 2 NodeDeleted #0\n"
              "o: A ChildRemoved #0\n"
              "o: 1 NodeDeleting #0\n"
              "o: 1 NodeDeleted #0\n"
              "o: A ChildRemoved #0\n");
}

TEST_F(RemovalNotices, TextsAndLinksOfARemovedNodeGoLastAndFromTheFirst) {
    // They are still there when the node's own deletion is told, and go with its destruction.
    const auto root = MakeRootNode();
    ResTreeNode* a = AddChild(*root, u"A", u"T", true);
    AddLink(*a, u"link", u"/");
    AddChild(*a, u"B");
    AddText(*a, u"text", u"1");
    WatchAll(*root, observer);
    observer.reaction = [this](ResTreeNode& node, uint32_t changes) {
        if ((changes & (NodeDeleting | NodeDeleted)) != 0) {
            log.Add("  " + std::string(node.GetProperty(u"text") ? "with" : "without") + " text");
        }
    };
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(log.Take(),
              "o: A NodeDeleting #0\n"
              "  with text\n"
              "o: B NodeDeleting #0\n"
              "  without text\n"
              "o: B NodeDeleted #0\n"
              "  without text\n"
              "o: A ChildRemoved #0\n"
              "o: A NodeDeleted #0\n"
              "  with text\n"
              "o: A ChildRemoved #0\n"
              "o: A PropertyRemoved #0\n"
              "o: Root ChildRemoved #0\n");
}

TEST_F(RemovalNotices, RootThatIsDeletedTellsOfItsEntriesFromTheFirst) {
    auto root = MakeRootNode(true);
    AddText(*root, u"z", u"1");
    AddChild(*root, u"y");
    AddLink(*root, u"x", u"/");
    AddChild(*root, u"w");
    WatchAll(*root, observer);
    root.reset();
    EXPECT_EQ(log.Take(),
              "o: Root PropertyRemoved #0\n"
              "o: y NodeDeleting #0\n"
              "o: y NodeDeleted #0\n"
              "o: Root ChildRemoved #0\n"
              "o: Root ChildRemoved #0\n"
              "o: w NodeDeleting #0\n"
              "o: w NodeDeleted #0\n"
              "o: Root ChildRemoved #0\n");
}

TEST_F(RemovalNotices, EntryIsStillThereWhileItsNodeTellsOfItsDeletion) {
    const auto root = MakeRootNode();
    ResTreeNode* a = AddChild(*root, u"A");
    a->AddObserver(&observer, NodeDeleting | NodeDeleted, 0);
    observer.reaction = [&](ResTreeNode& node, uint32_t) {
        EXPECT_EQ(root->Lookup(u"A", nullptr), &node);
        EXPECT_EQ(node.GetParent(), root.get());
        EXPECT_EQ(qn::dsc::ExactText(node.GetPath()), "/A");
    };
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(log.Take(), "o: A NodeDeleting #0\no: A NodeDeleted #0\n");
}

TEST_F(RemovalNotices, EntryIsGoneWhenItsOwnerTellsOfTheRemoval) {
    const auto root = MakeRootNode();
    AddText(*root, u"x", u"1");
    AddChild(*root, u"A");
    root->AddObserver(&observer, ChildRemoved | PropertyRemoved, 0);
    observer.reaction = [&](ResTreeNode& node, uint32_t changes) {
        EXPECT_TRUE(node.FindEntry(changes == ChildRemoved ? u"A" : u"x").IsEnd());
    };
    root->RemoveEntryByName(u"A");
    root->RemoveEntryByName(u"x");
    EXPECT_EQ(log.Take(), "o: Root ChildRemoved #0\no: Root PropertyRemoved #0\n");
}

TEST_F(RemovalNotices, NodesThatNobodyWatchesGoSilently) {
    const auto root = MakeRootNode();
    AddChild(*AddChild(*root, u"A"), u"B");
    root->AddObserver(&observer, NodeDeleting | NodeDeleted, 0);
    root->RemoveEntryByName(u"A");
    EXPECT_EQ(log.Take(), "");
}

TEST_F(RemovalNotices, HeldBackOwnerNotesTheRemovalWithoutAnyObserver) {
    const auto root = MakeRootNode();
    AddChild(*root, u"A");
    AddText(*root, u"x", u"1");
    root->BeginChanges();
    root->RemoveEntryByName(u"A");
    root->RemoveEntryByName(u"x");
    EXPECT_EQ(FlagNames(root->BeginChanges()), "PropertyRemoved|ChildRemoved");
    root->EndChanges(0, true);
    root->EndChanges(0, true);
}

// --- Removal of mismatched entries ---

TEST(RemoveIfMismatched, UnconditionalRemovalTakesWhateverIsThere) {
    const auto root = MakeRootNode();
    AddChild(*root, u"A", u"T");
    AddText(*root, u"B", u"1");
    root->RemoveIfMismatched(true, u"a", u"T", false);
    root->RemoveIfMismatched(true, u"b", u"T", false);
    root->RemoveIfMismatched(true, u"c", u"T", false);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST(RemoveIfMismatched, ChildOfTheSameTypeAndOrderStays) {
    const auto root = MakeRootNode();
    AddChild(*root, u"A", u"Type", true);
    root->RemoveIfMismatched(false, u"a", u"TYPE", true);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  A:Type ordered\n");
}

TEST(RemoveIfMismatched, EverythingElseGoes) {
    const auto root = MakeRootNode();
    AddChild(*root, u"A", u"Type", true);
    AddChild(*root, u"B", u"Type", false);
    AddText(*root, u"C", u"Type");
    AddLink(*root, u"D", u"B");
    AddText(*root, u"E", u"stays");
    root->RemoveIfMismatched(false, u"A", u"Type", false);
    root->RemoveIfMismatched(false, u"B", u"Other", false);
    root->RemoveIfMismatched(false, u"C", u"Type", false);
    root->RemoveIfMismatched(false, u"D", u"Type", false);
    root->RemoveIfMismatched(false, u"F", u"Type", false);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  E=stays\n");
}

TEST(RemoveIfMismatched, FirstOfEqualKeysIsMeant) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"A", u"1");
    AddChild(*root, u"A", u"T", false);
    root->RemoveIfMismatched(false, u"A", u"T", false);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  A:T\n");
}

// --- Nodes lost by a renaming ---

TEST(LostEntry, NodeLivesUntilItsParentDies) {
    ChangeLog log;
    auto root = MakeRootNode();
    ResTreeNode* parent = AddChild(*root, u"P");
    ResTreeNode* lost = AddChild(*parent, u"a");
    AddChild(*parent, u"b");
    AddText(*lost, u"x", u"1");
    lost->AddObserver(new LoggingObserver(log, "o", true), 0, 5);
    EXPECT_FALSE(lost->Rename(u"b"));
    parent->RemoveChildNodes();
    EXPECT_EQ(log.Take(), "");
    EXPECT_EQ(qn::dsc::ExactText(*lost->GetProperty(u"x")), "1");
    root->RemoveEntryByName(u"P");
    EXPECT_EQ(log.Take(), "o: gone\n");
}

TEST(LostEntry, TextsAndLinksAreReleasedWithTheNode) {
    auto root = MakeRootNode();
    AddText(*root, u"a", u"1");
    AddLink(*root, u"b", u"2");
    AddText(*root, u"c", u"3");
    EXPECT_FALSE(root->RenameEntry(u"a", u"c"));
    EXPECT_FALSE(root->RenameEntry(u"b", u"C"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  c=3\n");
    // Nothing may be leaked here.
    root.reset();
}

TEST(LostEntry, LostNodeStillWatchesItsParent) {
    ChangeLog log;
    LoggingObserver observer(log, "o");
    auto root = MakeRootNode();
    ResTreeNode* lost = AddChild(*root, u"a");
    AddChild(*root, u"b");
    lost->AddObserver(&observer, NodeNameChanged | AncestorChanged, 5);
    EXPECT_FALSE(lost->Rename(u"b"));
    root->Rename(u"Root2");
    EXPECT_EQ(log.Take(), "o: a NodeNameChanged #5\n");
}

}  // namespace
}  // namespace zkhw
