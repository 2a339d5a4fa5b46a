#include <functional>
#include <memory>
#include <string>
#include <tuple>
#include <utility>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "support/ChangeLog.h"
#include "support/ExactText.h"
#include "support/TreeDump.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

std::string TextOf(ResTreeNode& node, const char16_t* key) {
    const NodeEntry* entry = node.FindRaw(key);
    if (entry == nullptr) {
        return "(none)";
    }
    if (const auto path = entry->LinkPath()) {
        return ExactText(*path);
    }
    return entry->Text() ? ExactText(*entry->Text()) : "(child)";
}

// Two children of a root, both ordered if `ordered`.
class Merge : public ::testing::TestWithParam<bool> {
  protected:
    Merge() {
        source = AddChild(*root, u"Source", u"T", GetParam());
        target = AddChild(*root, u"Target", u"T", GetParam());
    }

    std::string Dump() const {
        std::string dump = DumpTree(*target);
        return dump.substr(dump.find('\n') + 1);
    }

    std::unique_ptr<ResTreeNode> root = MakeRootNode();
    ResTreeNode* source;
    ResTreeNode* target;
};

INSTANTIATE_TEST_SUITE_P(BothForms, Merge, ::testing::Bool(),
                         [](const auto& form) { return form.param ? "Ordered" : "Unordered"; });

TEST_P(Merge, CopiesEntriesOfAllKindsAndDepths) {
    AddText(*source, u"a", u"1");
    AddText(*source, u"b", u"2", LocalizedTextEntry);
    ResTreeNode* child = AddChild(*source, u"c", u"Type", true);
    AddText(*child, u"z", u"3");
    AddText(*child, u"z", u"4");
    AddText(*AddChild(*child, u"d", u"Other"), u"e", u"5");
    target->MergeFrom(*source, false);
    EXPECT_EQ(Dump(),
              "  a=1\n"
              "  b~2\n"
              "  c:Type ordered\n"
              "    z=3\n"
              "    z=4\n"
              "    d:Other\n"
              "      e=5\n");
}

TEST_P(Merge, SourceStaysAsItWas) {
    AddText(*source, u"a", u"1");
    AddText(*AddChild(*source, u"c"), u"d", u"2");
    const std::string before = DumpTree(*source);
    target->MergeFrom(*source, true);
    EXPECT_EQ(DumpTree(*source), before);
}

TEST_P(Merge, EmptySourceChangesNothing) {
    AddText(*target, u"a", u"1");
    target->MergeFrom(*source, true);
    EXPECT_EQ(Dump(), "  a=1\n");
}

TEST_P(Merge, ChildIsTheTargetsOwn) {
    AddChild(*source, u"c");
    target->MergeFrom(*source, false);
    ResTreeNode* copy = target->Lookup(u"c", nullptr);
    ASSERT_NE(copy, nullptr);
    EXPECT_NE(copy, source->Lookup(u"c", nullptr));
    EXPECT_EQ(copy->GetParent(), target);
}

TEST_P(Merge, NulInATextIsKept) {
    source->SetProperty(u"a", std::u16string_view(u"x\0eng=x", 7));
    target->MergeFrom(*source, false);
    EXPECT_EQ(Dump(), "  a=x{0000}eng=x\n");
}

TEST_P(Merge, ChildThatIsThereGoesWithoutOverwrite) {
    AddText(*AddChild(*target, u"c", u"Type"), u"old", u"1");
    AddText(*AddChild(*source, u"c", u"Type"), u"new", u"2");
    target->MergeFrom(*source, false);
    EXPECT_EQ(Dump(), "  c:Type\n    new=2\n");
}

TEST_P(Merge, ChildOfAnotherTypeOrOrderGoesEvenWithOverwrite) {
    AddText(*AddChild(*target, u"c", u"Type"), u"old", u"1");
    AddText(*AddChild(*target, u"d", u"Type", true), u"old", u"1");
    AddText(*target, u"e", u"old");
    AddLink(*target, u"f", u"old");
    AddChild(*source, u"c", u"Other");
    AddChild(*source, u"d", u"Type", false);
    AddChild(*source, u"e", u"Type");
    AddChild(*source, u"f", u"Type");
    target->MergeFrom(*source, true);
    EXPECT_EQ(Dump(), "  c:Other\n  d:Type\n  e:Type\n  f:Type\n");
}

TEST_P(Merge, DeferredContentsAreNotLoaded) {
    AddText(*source, u":DeferredLoadPath", u"C:\\no\\such\\file.xml");
    AddText(*target, u"a", u"1");
    target->MergeFrom(*source, false);
    EXPECT_EQ(TextOf(*source, u":DeferredLoadPath"), "C:\\no\\such\\file.xml");
    EXPECT_EQ(TextOf(*target, u":DeferredLoadPath"), "C:\\no\\such\\file.xml");
}

using MergeUnordered = Merge;
INSTANTIATE_TEST_SUITE_P(UnorderedOnly, MergeUnordered, ::testing::Values(false));

TEST_P(MergeUnordered, TextThatIsThereStaysWithoutOverwrite) {
    AddText(*target, u"A", u"old");
    AddText(*source, u"a", u"new");
    target->MergeFrom(*source, false);
    EXPECT_EQ(Dump(), "  A=old\n");
}

TEST_P(MergeUnordered, TextThatIsThereIsOverwrittenAndKeepsItsKeyAndKind) {
    AddText(*target, u"A", u"old");
    AddText(*target, u"B", u"old", LocalizedTextEntry);
    AddText(*source, u"a", u"new", LocalizedTextEntry);
    AddText(*source, u"b", u"new");
    target->MergeFrom(*source, true);
    EXPECT_EQ(Dump(), "  A=new\n  B~new\n");
}

TEST_P(MergeUnordered, TextDoesNotOverwriteALinkOrAChild) {
    AddLink(*target, u"a", u"old");
    AddChild(*target, u"b");
    AddText(*source, u"a", u"new");
    AddText(*source, u"b", u"new");
    target->MergeFrom(*source, true);
    EXPECT_EQ(Dump(), "  a->old\n  b:T\n");
}

TEST_P(MergeUnordered, LinkOverwritesATextAndNothingElse) {
    AddText(*target, u"a", u"old");
    AddLink(*target, u"b", u"old");
    AddChild(*target, u"c");
    for (const char16_t* key : {u"a", u"b", u"c"}) {
        AddLink(*source, key, u"x");
    }
    target->MergeFrom(*source, false);
    EXPECT_EQ(Dump(), "  a=old\n  b->old\n  c:T\n");
    target->MergeFrom(*source, true);
    EXPECT_EQ(Dump(), "  a=../Source/x\n  b->old\n  c:T\n");
}

TEST_P(MergeUnordered, MatchingChildReceivesTheMergeWithOverwrite) {
    ResTreeNode* kept = AddChild(*target, u"C", u"Type");
    AddText(*kept, u"both", u"old");
    AddText(*kept, u"old", u"1");
    ResTreeNode* child = AddChild(*source, u"c", u"TYPE");
    AddText(*child, u"both", u"new");
    AddText(*child, u"new", u"2");
    target->MergeFrom(*source, true);
    EXPECT_EQ(target->Lookup(u"c", nullptr), kept);
    EXPECT_EQ(Dump(), "  C:Type\n    both=new\n    new=2\n    old=1\n");
}

using MergeOrdered = Merge;
INSTANTIATE_TEST_SUITE_P(OrderedOnly, MergeOrdered, ::testing::Values(true));

TEST_P(MergeOrdered, EqualTextsStandSideBySide) {
    AddText(*target, u"a", u"old");
    AddText(*source, u"a", u"new");
    target->MergeFrom(*source, true);
    EXPECT_EQ(Dump(), "  a=old\n  a=new\n");
}

TEST_P(MergeOrdered, ReplacedChildGoesToTheEnd) {
    AddText(*AddChild(*target, u"c", u"Type"), u"old", u"1");
    AddText(*target, u"t", u"2");
    AddChild(*source, u"c", u"Type");
    target->MergeFrom(*source, false);
    EXPECT_EQ(Dump(), "  t=2\n  c:Type\n");
}

TEST_P(MergeOrdered, OnlyTheFirstOfEqualChildrenIsReplaced) {
    AddText(*AddChild(*target, u"c"), u"n", u"1");
    AddText(*AddChild(*target, u"c"), u"n", u"2");
    AddText(*AddChild(*source, u"c"), u"n", u"3");
    target->MergeFrom(*source, false);
    EXPECT_EQ(Dump(),
              "  c:T\n"
              "    n=2\n"
              "  c:T\n"
              "    n=3\n");
}

TEST_P(MergeOrdered, EntryOfAnotherKindBehindTheReplacedOneStays) {
    AddText(*AddChild(*target, u"c"), u"n", u"1");
    AddChild(*target, u"c", u"Other");
    AddText(*target, u"c", u"2");
    AddText(*AddChild(*source, u"c"), u"n", u"3");
    target->MergeFrom(*source, false);
    EXPECT_EQ(Dump(),
              "  c:Other\n"
              "  c=2\n"
              "  c:T\n"
              "    n=3\n");
}

TEST_P(MergeOrdered, MatchingChildStaysAndANewOneStandsInFrontOfTheLastEntry) {
    // The end less one for the entry found, and nothing is removed: the copy ends up in front of the last entry.
    AddText(*AddChild(*target, u"c"), u"n", u"1");
    AddText(*target, u"t", u"2");
    AddText(*target, u"u", u"3");
    AddText(*AddChild(*source, u"c"), u"n", u"4");
    target->MergeFrom(*source, true);
    EXPECT_EQ(Dump(),
              "  c:T\n"
              "    n=1\n"
              "  t=2\n"
              "  c:T\n"
              "    n=4\n"
              "  u=3\n");
}

// --- Links ---

TEST_P(Merge, LinkIsReExpressedAsOneComponent) {
    AddLink(*source, u"a", u"M");
    AddLink(*source, u"b", u"../M");
    AddLink(*source, u"c", u"/M");
    AddLink(*source, u"d", u"x\\y");
    target->MergeFrom(*source, false);
    EXPECT_EQ(Dump(),
              "  a->../Source/M\n"
              "  b->../Source/..\\/M\n"
              "  c->../Source/\\/M\n"
              "  d->../Source/x\\\\y\n");
}

TEST_P(Merge, LinkToASiblingEntryStillLeadsThere) {
    ResTreeNode* m = AddChild(*source, u"M");
    AddLink(*source, u"a", u"M");
    target->MergeFrom(*source, false);
    EXPECT_EQ(target->Lookup(u"a", nullptr), m);
}

TEST_P(Merge, LinksOfChildNodesStartFromTheirOwnPlaces) {
    AddLink(*AddChild(*source, u"c"), u"a", u"M");
    target->MergeFrom(*source, false);
    // From "/Target/c" to "/Source/c/M".
    EXPECT_EQ(TextOf(*target->Lookup(u"c", nullptr), u"a"), "../../Source/c/M");
}

TEST_P(Merge, LinkFromAnAncestorHasNoClimb) {
    // From "/Target" to "/Target/M": the root merges into nothing but its own child.
    ResTreeNode* inner = AddChild(*target, u"Inner", u"T", GetParam());
    AddLink(*inner, u"a", u"M/x");
    target->MergeFrom(*inner, false);
    // "Inner" is taken as it stands, the link's own text with its slash escaped.
    EXPECT_EQ(TextOf(*target, u"a"), "Inner/M\\/x");
}

TEST_P(Merge, LinkOfTheRootClimbsOverTheEmptyComponent) {
    // "/" has two empty components, of which "//M" shares but the first with "/Target".
    AddLink(*root, u"a", u"M");
    target->MergeFrom(*root, false);
    EXPECT_EQ(TextOf(*target, u"a"), "..//M");
}

// --- CloneSubtreeInto ---

TEST(CloneSubtreeInto, MakesACopyAtThePosition) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"a", u"1");
    AddText(*root, u"b", u"2");
    ResTreeNode source(u"S", u"Type", true, noTable);
    AddText(source, u"x", u"3");
    ResTreeNode* child = nullptr;
    const EntryIterator placed = root->CloneSubtreeInto(root->FindEntry(u"b"), u"key", source, false, child);
    EXPECT_EQ(root->ResolveEntry(placed), child);
    EXPECT_EQ(DumpTree(*root),
              "Root:Root ordered\n"
              "  a=1\n"
              "  key:Type ordered\n"
              "    x=3\n"
              "  b=2\n");
}

// An ordered root with the children "0" to "4", of which "2" is a match for the source.
class CloneInOrder : public ::testing::Test {
  protected:
    CloneInOrder() {
        for (const char16_t* name : {u"0", u"1", u"2", u"3", u"4"}) {
            AddText(*AddChild(*root, name), u"old", u"");
        }
        AddText(source, u"new", u"");
    }

    // The keys in order; the copy is marked.
    std::string Clone(uint32_t index, bool overwrite) {
        EntryIterator position = root->Begin();
        for (uint32_t i = 0; i < index; ++i) {
            ++position;
        }
        ResTreeNode* child = nullptr;
        const EntryIterator placed = root->CloneSubtreeInto(position, u"2", source, overwrite, child);
        EXPECT_EQ(root->ResolveEntry(placed), child);
        std::string keys;
        for (EntryIterator entry = root->Begin(); !entry.IsEnd(); ++entry) {
            keys += ExactText(entry.Key()) + (entry->Child() == child ? "*" : "");
        }
        return keys;
    }

    std::unique_ptr<ResTreeNode> root = MakeRootNode(true);
    ResTreeNode source{u"S", u"T", false, noTable};
};

TEST_F(CloneInOrder, ReplacesAnEntryBehindThePosition) {
    EXPECT_EQ(Clone(1, false), "02*134");
}

TEST_F(CloneInOrder, ReplacesAnEntryInFrontOfThePosition) {
    EXPECT_EQ(Clone(4, false), "0132*4");
}

TEST_F(CloneInOrder, ReplacesAnEntryDirectlyInFrontOfThePosition) {
    EXPECT_EQ(Clone(3, false), "012*34");
}

TEST_F(CloneInOrder, ReplacesTheEntryAtThePositionAndGoesToTheEnd) {
    EXPECT_EQ(Clone(2, false), "01342*");
}

TEST_F(CloneInOrder, ReplacesAnEntryWithThePositionAtTheEnd) {
    EXPECT_EQ(Clone(5, false), "01342*");
}

TEST_F(CloneInOrder, MatchBehindThePositionStaysAndTheCopyGoesToThePosition) {
    EXPECT_EQ(Clone(1, true), "02*1234");
}

TEST_F(CloneInOrder, MatchInFrontOfThePositionStaysAndTheCopyGoesOneFurtherUp) {
    EXPECT_EQ(Clone(4, true), "0122*34");
}

TEST_F(CloneInOrder, MatchAtThePositionStaysAndTheCopyGoesToTheEnd) {
    EXPECT_EQ(Clone(2, true), "012342*");
}

TEST_F(CloneInOrder, MatchStaysAndTheCopyGoesInFrontOfTheLastForThePositionAtTheEnd) {
    EXPECT_EQ(Clone(5, true), "01232*4");
}

TEST(CloneSubtreeInto, UnorderedNodeGivesTheMatchingChild) {
    const auto root = MakeRootNode();
    ResTreeNode* kept = AddChild(*root, u"key", u"T");
    AddText(*kept, u"x", u"old");
    ResTreeNode source(u"S", u"T", false, noTable);
    AddText(source, u"x", u"new");
    ResTreeNode* child = nullptr;
    root->CloneSubtreeInto(root->End(), u"KEY", source, true, child);
    EXPECT_EQ(child, kept);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  key:T\n    x=new\n");
}

TEST(CloneSubtreeInto, ManyEntriesAroundThePosition) {
    const auto root = MakeRootNode(true);
    for (int i = 0; i < 1000; ++i) {
        AddChild(*root, i == 300 ? u"key" : u"other");
    }
    ResTreeNode source(u"S", u"U", false, noTable);
    EntryIterator position = root->Begin();
    for (int i = 0; i < 700; ++i) {
        ++position;
    }
    ResTreeNode* child = nullptr;
    const EntryIterator placed = root->CloneSubtreeInto(position, u"key", source, false, child);
    int index = 0;
    for (EntryIterator entry = root->Begin(); entry != placed; ++entry) {
        ++index;
    }
    EXPECT_EQ(index, 699);
    EXPECT_EQ(root->FindEntry(u"key")->Child(), child);
}

// --- Clone ---

TEST(Clone, IsADetachedNodeOfTheSameNameTypeAndOrder) {
    const auto root = MakeRootNode();
    ResTreeNode* node = AddChild(*root, u"A", u"Type", true);
    AddText(*node, u"z", u"1");
    AddText(*node, u"z", u"2", LocalizedTextEntry);
    AddText(*AddChild(*node, u"c"), u"x", u"3");
    const std::unique_ptr<ResTreeNode> clone = node->Clone();
    EXPECT_EQ(DumpTree(*clone), DumpTree(*node));
    EXPECT_EQ(clone->GetParent(), nullptr);
    EXPECT_EQ(clone->GetTypeTable(), nullptr);
}

TEST(Clone, HasItsOwnCopyOfTheTypeTable) {
    const auto root = MakeRootNode();
    const std::unique_ptr<ResTreeNode> clone = root->Clone();
    ASSERT_NE(clone->GetTypeTable(), nullptr);
    clone->GetTypeTable()->AddTypeRelation(u"New", u"");
    EXPECT_EQ(root->GetTypeTable()->Find(u"New"), nullptr);
}

TEST(Clone, LinksAreExpressedFromTheRootThatTheCloneIs) {
    const auto root = MakeRootNode();
    ResTreeNode* node = AddChild(*root, u"A");
    AddLink(*node, u"a", u"../M");
    const std::unique_ptr<ResTreeNode> clone = node->Clone();
    // From "/", whose second component is empty, to "/A/..\/M".
    EXPECT_EQ(TextOf(*clone, u"a"), "../A/..\\/M");
}

TEST(Clone, ObserversAndPendingChangesStayBehind) {
    ChangeLog log;
    LoggingObserver observer(log, "o");
    const auto root = MakeRootNode();
    AddText(*root, u"a", u"1");
    root->AddObserver(&observer, allChanges, 5);
    root->BeginChanges();
    const std::unique_ptr<ResTreeNode> clone = root->Clone();
    clone->SetProperty(u"a", u"2");
    EXPECT_TRUE(clone->HasNoPendingChanges());
    root->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "");
    root->RemoveObserver(&observer, -1, false);
}

// --- Nodes that are merged with their own kin ---

class KinMerge : public ::testing::TestWithParam<bool> {
  protected:
    KinMerge() {
        if (GetParam()) {
            // While anybody observes anything, removed nodes are taken apart at once.
            bystander->AddObserver(&observer, allChanges, 0);
        }
    }

    ChangeLog log;
    LoggingObserver observer{log, "o"};
    std::unique_ptr<ResTreeNode> bystander = MakeRootNode();
    std::unique_ptr<ResTreeNode> root = MakeRootNode();
};

INSTANTIATE_TEST_SUITE_P(WithAndWithoutObservers, KinMerge, ::testing::Bool(),
                         [](const auto& form) { return form.param ? "Observed" : "Unobserved"; });

TEST_P(KinMerge, NodeMergedWithItselfStaysAsItIs) {
    for (const bool ordered : {false, true}) {
        for (const bool overwrite : {false, true}) {
            ResTreeNode* node = AddChild(*root, ordered ? u"o" : u"u", u"T", ordered);
            AddText(*node, u"a", u"1");
            AddLink(*node, u"b", u"c");
            AddText(*AddChild(*node, u"c"), u"d", u"2");
            const std::string before = DumpTree(*node);
            node->MergeFrom(*node, overwrite);
            EXPECT_EQ(DumpTree(*node), before);
            root->RemoveEntryByName(node->GetName());
        }
    }
}

TEST_P(KinMerge, NodeMergedWithItsParentGetsAllButItself) {
    AddText(*root, u"a", u"1");
    ResTreeNode* node = AddChild(*root, u"B");
    AddText(*node, u"b", u"2");
    AddText(*AddChild(*root, u"C"), u"c", u"3");
    node->MergeFrom(*root, false);
    EXPECT_EQ(DumpTree(*root),
              "Root:Root\n"
              "  a=1\n"
              "  B:T\n"
              "    a=1\n"
              "    b=2\n"
              "    C:T\n"
              "      c=3\n"
              "  C:T\n"
              "    c=3\n");
}

TEST_P(KinMerge, NodeMergedWithANodeFarAboveEnds) {
    ResTreeNode* a = AddChild(*root, u"A");
    ResTreeNode* b = AddChild(*a, u"B");
    ResTreeNode* c = AddChild(*b, u"C");
    AddText(*a, u"x", u"1");
    c->MergeFrom(*root, true);
    EXPECT_EQ(DumpTree(*root),
              "Root:Root\n"
              "  A:T\n"
              "    B:T\n"
              "      C:T\n"
              "        A:T\n"
              "          B:T\n"
              "          x=1\n"
              "    x=1\n");
}

TEST_P(KinMerge, OrderedNodeMergedWithItsParentEnds) {
    auto ordered = MakeRootNode(true);
    AddText(*ordered, u"a", u"1");
    ResTreeNode* node = AddChild(*ordered, u"B", u"T", true);
    AddText(*ordered, u"c", u"2");
    node->MergeFrom(*ordered, false);
    EXPECT_EQ(DumpTree(*ordered),
              "Root:Root ordered\n"
              "  a=1\n"
              "  B:T ordered\n"
              "    a=1\n"
              "    c=2\n"
              "  c=2\n");
}

TEST_P(KinMerge, ChildIsClonedIntoItself) {
    ResTreeNode* node = AddChild(*root, u"B");
    AddText(*node, u"b", u"1");
    AddText(*AddChild(*node, u"C"), u"c", u"2");
    ResTreeNode* child = nullptr;
    node->CloneSubtreeInto(node->End(), u"D", *node, false, child);
    EXPECT_EQ(DumpTree(*node),
              "B:T\n"
              "  b=1\n"
              "  C:T\n"
              "    c=2\n"
              "  D:T\n"
              "    b=1\n"
              "    C:T\n"
              "      c=2\n");
}

TEST_P(KinMerge, ParentMergedWithItsChildGetsTheChildsEntries) {
    ResTreeNode* node = AddChild(*root, u"B");
    AddText(*node, u"t", u"1");
    AddText(*AddChild(*node, u"C"), u"c", u"2");
    root->MergeFrom(*node, false);
    EXPECT_EQ(DumpTree(*root),
              "Root:Root\n"
              "  B:T\n"
              "    C:T\n"
              "      c=2\n"
              "    t=1\n"
              "  C:T\n"
              "    c=2\n"
              "  t=1\n");
}

TEST_P(KinMerge, SourceThatIsReplacedByItsOwnChildDoesNotEndInDeadMemory) {
    // "B/B" takes the place of "B", from which the merge still reads.
    for (const bool ordered : {false, true}) {
        auto top = MakeRootNode(ordered);
        ResTreeNode* node = AddChild(*top, u"B", u"T", true);
        AddText(*node, u"a", u"1");
        AddText(*AddChild(*node, u"B"), u"c", u"2");
        for (int i = 0; i < 200; ++i) {
            AddText(*node, u"z", u"3");
        }
        top->MergeFrom(*node, false);
        ResTreeNode* left = top->Lookup(u"B", nullptr);
        ASSERT_NE(left, nullptr);
        EXPECT_FALSE(left->IsOrdered());
        EXPECT_EQ(TextOf(*top, u"a"), "1");
    }
}

TEST_P(KinMerge, ChildThatIsItsOwnSourceIsReplacedByItsCopy) {
    ResTreeNode* node = AddChild(*root, u"B");
    AddText(*node, u"b", u"1");
    ResTreeNode* child = nullptr;
    root->CloneSubtreeInto(root->End(), u"B", *node, false, child);
    ASSERT_NE(child, nullptr);
    EXPECT_EQ(root->Lookup(u"B", nullptr), child);
    EXPECT_EQ(child->GetParent(), root.get());
}

TEST_P(KinMerge, ChildThatIsItsOwnSourceStaysWithOverwrite) {
    ResTreeNode* node = AddChild(*root, u"B");
    AddText(*node, u"b", u"1");
    ResTreeNode* child = nullptr;
    root->CloneSubtreeInto(root->End(), u"B", *node, true, child);
    EXPECT_EQ(child, node);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  B:T\n    b=1\n");
}

TEST_P(KinMerge, NodeMayBeCloneOfOneOfItsOwnDescendants) {
    ResTreeNode* c = AddChild(*AddChild(*root, u"B"), u"C");
    AddText(*c, u"c", u"1");
    ResTreeNode* child = nullptr;
    root->CloneSubtreeInto(root->End(), u"B", *c, false, child);
    ASSERT_NE(child, nullptr);
    EXPECT_EQ(root->Lookup(u"B", nullptr), child);
    EXPECT_EQ(root->Lookup(u"B/C", nullptr), nullptr);
}

// --- Notices of a merge ---

TEST(MergeNotices, EachEntryIsToldOfUnlessTheTargetIsHeldBack) {
    ChangeLog log;
    LoggingObserver observer(log, "o");
    const auto root = MakeRootNode();
    AddText(*root, u"a", u"old");
    ResTreeNode source(u"S", u"T", false, noTable);
    AddText(source, u"a", u"new");
    AddText(source, u"b", u"1");
    AddChild(source, u"c");
    AddLink(source, u"d", u"c");
    root->AddObserver(&observer, allChanges & ~static_cast<uint32_t>(AncestorChanged), 5);
    root->MergeFrom(source, true);
    EXPECT_EQ(log.Take(),
              "o: Root PropertyChanged #5\n"
              "o: Root PropertyAdded #5\n"
              "o: Root ChildAdded #5\n"
              "o: Root ChildAdded #5\n");
    root->BeginChanges();
    root->MergeFrom(source, true);
    root->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "o: Root PropertyChanged #5\n");
    root->RemoveObserver(&observer, -1, false);
}

TEST(MergeNotices, ObserverMayEmptyTheSourceMeanwhile) {
    for (const bool ordered : {false, true}) {
        for (const int count : {3, 500}) {
            ChangeLog log;
            LoggingObserver observer(log, "o");
            const auto root = MakeRootNode(ordered);
            ResTreeNode source(u"S", u"T", ordered, noTable);
            for (int i = 0; i < count; ++i) {
                const std::string number = std::to_string(i);
                AddChild(source, std::u16string(number.begin(), number.end()).c_str());
            }
            observer.reaction = [&](ResTreeNode&, uint32_t) { source.RemoveChildNodes(); };
            root->AddObserver(&observer, ChildAdded, 5);
            root->MergeFrom(source, false);
            EXPECT_TRUE(source.Begin().IsEnd());
            EXPECT_FALSE(root->Begin().IsEnd());
            root->RemoveObserver(&observer, -1, false);
        }
    }
}

TEST(MergeNotices, ObserverMayRemoveTheTargetMeanwhile) {
    ChangeLog log;
    LoggingObserver observer(log, "o");
    const auto root = MakeRootNode();
    ResTreeNode* target = AddChild(*root, u"A");
    ResTreeNode source(u"S", u"T", false, noTable);
    AddText(*AddChild(source, u"c"), u"d", u"1");
    AddText(source, u"e", u"2");
    observer.reaction = [&](ResTreeNode&, uint32_t) { root->RemoveEntryByName(u"A"); };
    target->AddObserver(&observer, ChildAdded, 5);
    target->MergeFrom(source, false);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

// --- Observers that change the target of a clone ---

// A root with texts a000, a001, ... and an observer of it; a source with a child and a text.
class CloneUnderObservers : public ::testing::TestWithParam<std::tuple<bool, int>> {
  protected:
    CloneUnderObservers() {
        for (int i = 0; i < std::get<1>(GetParam()); ++i) {
            std::string key = std::to_string(1000 + i);
            key.front() = 'a';
            root->AddTextEntry(std::u16string(key.begin(), key.end()), u"", TextEntry);
        }
        AddText(*AddChild(source, u"c"), u"d", u"1");
        AddText(source, u"e", u"2");
    }
    ~CloneUnderObservers() override { root->RemoveObserver(&observer, -1, true); }

    void At(uint32_t changes, std::function<void()> action) {
        root->AddObserver(&observer, changes, 5);
        observer.reaction = [action = std::move(action), done = false](ResTreeNode&, uint32_t) mutable {
            if (!std::exchange(done, true)) {
                action();
            }
        };
    }
    // Clones `source` as "copy" to the place of `before`, or to the end.
    EntryIterator Clone(const char16_t* before, bool overwrite = false) {
        child = &source;
        return root->CloneSubtreeInto(before == nullptr ? root->End() : root->FindEntryRaw(before), u"copy", source,
                                      overwrite, child);
    }
    void RemoveAll() {
        while (!root->Begin().IsEnd()) {
            root->RemoveEntry(root->Begin());
        }
    }

    ChangeLog log;
    LoggingObserver observer{log, "o"};
    std::unique_ptr<ResTreeNode> root = MakeRootNode(std::get<0>(GetParam()));
    ResTreeNode source{u"S", u"T", false, noTable};
    ResTreeNode* child = nullptr;
};

INSTANTIATE_TEST_SUITE_P(BothForms, CloneUnderObservers,
                         ::testing::Combine(::testing::Bool(), ::testing::Values(1, 31, 32, 500)),
                         [](const auto& form) {
                             return std::string(std::get<0>(form.param) ? "Ordered" : "Unordered") +
                                    std::to_string(std::get<1>(form.param));
                         });

TEST_P(CloneUnderObservers, NewChildMayGoAtOnce) {
    At(ChildAdded, [this] { root->RemoveEntryByName(u"copy"); });
    EXPECT_TRUE(Clone(u"a000").IsEnd());
    EXPECT_EQ(child, nullptr);
    EXPECT_TRUE(root->FindEntryRaw(u"copy").IsEnd());
}

TEST_P(CloneUnderObservers, NewChildMayBeReplacedAtOnce) {
    At(ChildAdded, [this] {
        root->RemoveEntryByName(u"copy");
        AddText(*root, u"copy", u"x");
    });
    EXPECT_TRUE(Clone(u"a000").IsEnd());
    EXPECT_EQ(child, nullptr);
    EXPECT_EQ(TextOf(*root, u"copy"), "x");
}

TEST_P(CloneUnderObservers, AllEntriesMayGoWhenTheChildIsAdded) {
    At(ChildAdded, [this] { RemoveAll(); });
    EXPECT_TRUE(Clone(u"a000").IsEnd());
    EXPECT_EQ(child, nullptr);
    EXPECT_TRUE(root->Begin().IsEnd());
}

TEST_P(CloneUnderObservers, AllOtherEntriesMayGoWhenTheChildIsAdded) {
    At(ChildAdded, [this] {
        for (int i = 0; i < std::get<1>(GetParam()); ++i) {
            std::string key = std::to_string(1000 + i);
            key.front() = 'a';
            root->RemoveEntryByName(String(key.c_str()).View());
        }
    });
    const EntryIterator placed = Clone(nullptr);
    ASSERT_FALSE(placed.IsEnd());
    EXPECT_EQ(placed->Child(), child);
    EXPECT_EQ(DumpTree(*root).substr(DumpTree(*root).find('\n') + 1), "  copy:T\n    c:T\n      d=1\n    e=2\n");
}

TEST_P(CloneUnderObservers, NewChildMayGoWhileItIsFilled) {
    LoggingObserver inner(log, "i");
    At(ChildAdded, [&] { root->Lookup(u"copy", nullptr)->AddObserver(&inner, ChildAdded, 5); });
    inner.reaction = [this](ResTreeNode&, uint32_t) { root->RemoveEntryByName(u"copy"); };
    EXPECT_TRUE(Clone(u"a000").IsEnd());
    EXPECT_EQ(child, nullptr);
}

TEST_P(CloneUnderObservers, AllEntriesMayGoWithTheOldChild) {
    AddChild(*root, u"copy", u"Other");
    At(ChildRemoved, [this] { RemoveAll(); });
    const EntryIterator placed = Clone(u"a000", true);
    ASSERT_FALSE(placed.IsEnd());
    EXPECT_EQ(placed->Child(), child);
    EXPECT_EQ(DumpTree(*root).substr(DumpTree(*root).find('\n') + 1), "  copy:T\n    c:T\n      d=1\n    e=2\n");
}

TEST_P(CloneUnderObservers, ChildOfAMergeMayGoAtOnce) {
    At(ChildAdded, [this] { root->RemoveEntryByName(u"c"); });
    root->MergeFrom(source, false);
    EXPECT_EQ(root->FindRaw(u"c"), nullptr);
    EXPECT_EQ(TextOf(*root, u"e"), "2");
}

}  // namespace
}  // namespace zkhw
