#include "restree/ResTreeNode.h"

#include <memory>
#include <new>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "support/AllocationFaultScope.h"
#include "support/ExactText.h"
#include "support/TreeDump.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

// --- Construction ---

TEST(ResTreeNode, RootHasItsNameTypeAndOrderAndNothingElse) {
    ResTreeNode root(u"Name", u"Type", true);
    EXPECT_EQ(DumpTree(root), "Name:Type ordered\n");
    EXPECT_EQ(root.GetParent(), nullptr);
    EXPECT_TRUE(root.HasNoPendingChanges());
    EXPECT_TRUE(root.Begin().IsEnd());
    EXPECT_EQ(root.Begin(), root.End());
}

TEST(ResTreeNode, RootHasATypeTable) {
    const ResTreeNode root(u"", u"", false);
    EXPECT_NE(root.GetTypeTable(), nullptr);
}

TEST(ResTreeNode, ChildKnowsItsParentAndHasNoTypeTable) {
    const auto root = MakeRootNode();
    const ResTreeNode* child = AddChild(*root, u"A", u"Type", true);
    EXPECT_EQ(child->GetParent(), root.get());
    EXPECT_EQ(child->GetTypeTable(), nullptr);
    EXPECT_EQ(ExactText(child->GetName()), "A");
    EXPECT_EQ(ExactText(child->GetType()), "Type");
    EXPECT_TRUE(child->IsOrdered());
}

TEST(ResTreeNode, DetachedNodeHasACopyOfTheGivenTypeTable) {
    const ResTreeNode root(u"", u"", false);
    const ResTreeNode node(u"N", u"Module", false, root.GetTypeTable());
    EXPECT_EQ(node.GetParent(), nullptr);
    ASSERT_NE(node.GetTypeTable(), nullptr);
    EXPECT_NE(node.GetTypeTable(), root.GetTypeTable());
    EXPECT_TRUE(node.IsA(u"ResourceList"));
}

TEST(ResTreeNode, DetachedNodeWithoutASourceTableHasNone) {
    const ResTreeNode node(u"N", u"Module", false, noTable);
    EXPECT_EQ(node.GetTypeTable(), nullptr);
}

// --- Adding ---

TEST(ResTreeNode, UnorderedNodeTakesAKeyOnceInWhateverCase) {
    const auto root = MakeRootNode();
    const ResTreeNode::Added first = AddText(*root, u"Foo", u"1");
    const ResTreeNode::Added second = AddText(*root, u"FOO", u"2");
    EXPECT_TRUE(first.isNew);
    EXPECT_FALSE(second.isNew);
    EXPECT_EQ(second.entry, first.entry);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  Foo=1\n");
}

TEST(ResTreeNode, OrderedNodeTakesEqualKeysSideBySide) {
    const auto root = MakeRootNode(true);
    EXPECT_TRUE(AddText(*root, u"Foo", u"1").isNew);
    EXPECT_TRUE(AddText(*root, u"FOO", u"2").isNew);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  Foo=1\n  FOO=2\n");
}

TEST(ResTreeNode, KeyOutsideAsciiIsTakenByItsPlainSpelling) {
    const auto root = MakeRootNode();
    AddText(*root, u"AB", u"1");
    EXPECT_FALSE(AddText(*root, u"A\u00ADB", u"2").isNew);
    EXPECT_EQ(ExactText(*root->GetProperty(u"ab\u00AD")), "1");
}

// Windows has an order of its own outside printable ASCII: docs/platforms.md lists where it differs.
TEST(ResTreeNode, FullWidthKeyIsTakenByItsPlainSpellingAsOnlyLinuxOrdersSo) {
    const auto root = MakeRootNode();
    AddText(*root, u"AB", u"1");
    EXPECT_FALSE(AddText(*root, u"\uFF21\uFF22", u"2").isNew);
    EXPECT_EQ(ExactText(*root->GetProperty(u"\uFF41\uFF42")), "1");
}

TEST(ResTreeNode, UnorderedNodeSortsItsEntriesOfAllKinds) {
    const auto root = MakeRootNode();
    AddChild(*root, u"c");
    AddText(*root, u"B", u"text", LocalizedTextEntry);
    AddLink(*root, u"a", u"../x");
    AddText(*root, u"", u"empty name");
    EXPECT_EQ(DumpTree(*root),
              "Root:Root\n"
              "  =empty name\n"
              "  a->../x\n"
              "  B~text\n"
              "  c:T\n");
}

TEST(ResTreeNode, OrderedNodeMixesTheKindsAsTheyCame) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"z", u"1");
    AddChild(*root, u"m");
    AddLink(*root, u"k", u"m");
    AddText(*root, u"a", u"2");
    EXPECT_EQ(DumpTree(*root),
              "Root:Root ordered\n"
              "  z=1\n"
              "  m:T\n"
              "  k->m\n"
              "  a=2\n");
}

TEST(ResTreeNode, EntryGoesInFrontOfTheNamedOne) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"a", u"1");
    AddText(*root, u"b", u"2");
    AddText(*root, u"b", u"3");
    AddTextBefore(*root, u"new", u"4", u"B");
    const String before(u"a");
    root->AddLinkEntry(u"link", u"path", &before);
    ResTreeNode* child = nullptr;
    root->AddChildEntry(u"child", u"T", false, child, &before);
    EXPECT_EQ(DumpTree(*root),
              "Root:Root ordered\n"
              "  link->path\n"
              "  child:T\n"
              "  a=1\n"
              "  new=4\n"
              "  b=2\n"
              "  b=3\n");
}

TEST(ResTreeNode, EntryGoesToTheEndIfTheNamedOneIsMissing) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"a", u"1");
    AddTextBefore(*root, u"new", u"2", u"missing");
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  a=1\n  new=2\n");
}

TEST(ResTreeNode, PlaceDoesNotMatterInAnUnorderedNode) {
    const auto root = MakeRootNode();
    AddText(*root, u"a", u"1");
    AddTextBefore(*root, u"b", u"2", u"a");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  a=1\n  b=2\n");
}

TEST(ResTreeNode, AddChildEntryGivesTheChildThatIsThere) {
    const auto root = MakeRootNode();
    ResTreeNode* first = AddChild(*root, u"A", u"First", true);
    ResTreeNode* second = nullptr;
    const ResTreeNode::Added added = root->AddChildEntry(u"a", u"Second", false, second);
    EXPECT_FALSE(added.isNew);
    EXPECT_EQ(second, first);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  A:First ordered\n");
}

TEST(ResTreeNode, AddChildEntryGivesNoChildWhereAnotherKindStands) {
    const auto root = MakeRootNode();
    AddText(*root, u"Text", u"1");
    AddLink(*root, u"Link", u"/");
    ResTreeNode* child = root.get();
    EXPECT_FALSE(root->AddChildEntry(u"text", u"T", false, child).isNew);
    EXPECT_EQ(child, nullptr);
    child = root.get();
    EXPECT_FALSE(root->AddChildEntry(u"link", u"T", false, child).isNew);
    EXPECT_EQ(child, nullptr);
}

TEST(ResTreeNode, AddLinkEntryLeavesWhatIsThere) {
    const auto root = MakeRootNode();
    AddText(*root, u"A", u"1");
    const ResTreeNode::Added added = AddLink(*root, u"a", u"/");
    EXPECT_FALSE(added.isNew);
    EXPECT_EQ(added.entry->Kind(), TextEntry);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  A=1\n");
}

TEST(ResTreeNode, InsertEntryPutsAnEntryInFrontOfAPosition) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"a", u"1");
    AddText(*root, u"b", u"2");
    const EntryIterator stored = root->InsertEntry(root->FindEntryRaw(u"b"), u"c", LinkEntry, u"path");
    EXPECT_EQ(ExactText(stored.Key()), "c");
    root->InsertEntry(root->Begin(), u"d", LocalizedTextEntry, u"3");
    root->InsertEntry(root->End(), u"e", TextEntry, u"4");
    EXPECT_EQ(DumpTree(*root),
              "Root:Root ordered\n"
              "  d~3\n"
              "  a=1\n"
              "  c->path\n"
              "  b=2\n"
              "  e=4\n");
}

TEST(ResTreeNode, InsertEntryTakesANode) {
    const auto root = MakeRootNode(true);
    auto clone = std::make_unique<ResTreeNode>(u"Own", u"T", false, noTable);
    ResTreeNode* child = clone.get();
    const EntryIterator stored = root->InsertEntry(root->End(), u"Key", std::move(clone));
    EXPECT_EQ(root->ResolveEntry(stored), child);
    EXPECT_EQ(child->GetParent(), root.get());
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  Key=>Own:T\n");
}

TEST(ResTreeNode, InsertEntryWithoutMemoryChangesNothing) {
    const auto root = MakeRootNode(true);
    for (const bool isChild : {false, true}) {
        for (int i = 0; i < 100; ++i) {
            const std::string before = DumpTree(*root);
            uint64_t failures = 0;
            for (bool failed = true; failed;) {
                failed = false;
                auto child = std::make_unique<ResTreeNode>(u"N", u"T", false, noTable);
                try {
                    const support::AllocationFaultScope fault(failures + 1);
                    if (isChild) {
                        root->InsertEntry(root->End(), u"N", std::move(child));
                    } else {
                        root->InsertEntry(root->End(), u"K", TextEntry, u"text");
                    }
                } catch (const std::bad_alloc&) {
                    failed = true;
                    ++failures;
                    ASSERT_EQ(DumpTree(*root), before);
                }
            }
            EXPECT_GE(failures, 1u);
            EXPECT_EQ(DumpTree(*root), before + (isChild ? "  N:T\n" : "  K=text\n"));
        }
    }
}

TEST(ResTreeNode, InsertEntrySortsInAnUnorderedNodeWhateverThePosition) {
    const auto root = MakeRootNode();
    AddText(*root, u"b", u"1");
    root->InsertEntry(root->End(), u"a", TextEntry, u"2");
    root->InsertEntry(root->Begin(), u"c", TextEntry, u"3");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  a=2\n  b=1\n  c=3\n");
}

// --- Reading ---

TEST(ResTreeNode, FindEntryIsBlindToCase) {
    for (const bool ordered : {false, true}) {
        const auto root = MakeRootNode(ordered);
        AddText(*root, u"Foo", u"1");
        EXPECT_EQ(ExactText(root->FindEntry(u"fOO").Key()), "Foo");
        EXPECT_EQ(root->FindEntryRaw(u"FOO"), root->Begin());
        EXPECT_TRUE(root->FindEntry(u"Fo").IsEnd());
        EXPECT_TRUE(root->FindEntryRaw(u"").IsEnd());
    }
}

TEST(ResTreeNode, OrderedNodeFindsTheFirstOfEqualKeys) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"x", u"0");
    AddText(*root, u"A", u"1");
    AddText(*root, u"a", u"2");
    EXPECT_EQ(ExactText(*root->GetProperty(u"a")), "1");
}

TEST(ResTreeNode, EntryWithAnEmptyKeyIsFound) {
    const auto root = MakeRootNode();
    AddText(*root, u"", u"1");
    EXPECT_EQ(ExactText(*root->GetProperty(u"")), "1");
}

TEST(ResTreeNode, GetPropertyGivesTextsOfBothKinds) {
    const auto root = MakeRootNode();
    AddText(*root, u"A", u"1");
    AddText(*root, u"B", u"2", LocalizedTextEntry);
    EXPECT_EQ(ExactText(*root->GetProperty(u"a")), "1");
    EXPECT_EQ(ExactText(*root->GetProperty(u"b")), "2");
}

TEST(ResTreeNode, GetPropertyOfAChildIsNothingThoughTheEntryIsFound) {
    const auto root = MakeRootNode();
    AddChild(*root, u"A");
    EXPECT_FALSE(root->GetProperty(u"A"));
    EXPECT_FALSE(root->FindEntry(u"A").IsEnd());
}

TEST(ResTreeNode, GetPropertyOfALinkOrAMissingKeyIsNothing) {
    const auto root = MakeRootNode();
    AddLink(*root, u"A", u"/");
    EXPECT_FALSE(root->GetProperty(u"A"));
    EXPECT_FALSE(root->GetProperty(u"B"));
}

TEST(ResTreeNode, FirstEntryOfAKeyHidesATextBehindIt) {
    const auto root = MakeRootNode(true);
    AddChild(*root, u"A");
    AddText(*root, u"A", u"1");
    EXPECT_FALSE(root->GetProperty(u"A"));
}

TEST(ResTreeNode, GetPropertyPointsIntoTheNodeWhileOthersCome) {
    const auto root = MakeRootNode();
    AddText(*root, u"A", u"1");
    const auto value = root->GetProperty(u"A");
    ASSERT_TRUE(value);
    for (int i = 0; i < 200; ++i) {
        const std::u16string key(static_cast<size_t>(i) + 1, u'b');
        AddText(*root, key.c_str(), u"x");
    }
    EXPECT_EQ(ExactText(*value), "1");
    EXPECT_EQ(root->GetProperty(u"A")->data(), value->data());
}

TEST(ResTreeNode, GetPropertyOrEmptyGivesTheEmptyTextForAllThatIsMissing) {
    const auto root = MakeRootNode();
    AddChild(*root, u"A");
    AddText(*root, u"B", u"1");
    EXPECT_EQ(ExactText(root->GetPropertyOrEmpty(u"b")), "1");
    EXPECT_TRUE(root->GetPropertyOrEmpty(u"A").empty());
    EXPECT_TRUE(root->GetPropertyOrEmpty(u"C").empty());
}

TEST(ResTreeNode, ResolveEntryGivesTheNodeThatAnEntryStandsFor) {
    const auto root = MakeRootNode(true);
    ResTreeNode* child = AddChild(*root, u"child");
    AddText(*root, u"text", u"child");
    AddLink(*root, u"link", u"child");
    AddLink(*root, u"dangling", u"nobody");
    AddLink(*root, u"toText", u"text");
    EXPECT_EQ(root->ResolveEntry(root->FindEntry(u"child")), child);
    EXPECT_EQ(root->ResolveEntry(root->FindEntry(u"text")), nullptr);
    EXPECT_EQ(root->ResolveEntry(root->FindEntry(u"link")), child);
    EXPECT_EQ(root->ResolveEntry(root->FindEntry(u"dangling")), nullptr);
    EXPECT_EQ(root->ResolveEntry(root->FindEntry(u"toText")), nullptr);
    EXPECT_EQ(root->ResolveEntry(root->End()), nullptr);
}

TEST(ResTreeNode, WalkGoesFromBeginToEnd) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"a", u"1");
    AddChild(*root, u"b");
    AddText(*root, u"c", u"3", LocalizedTextEntry);
    std::string keys;
    for (EntryIterator entry = root->Begin(); entry != root->End(); ++entry) {
        keys += ExactText(entry.Key()) + std::to_string(entry->Kind());
    }
    EXPECT_EQ(keys, "a1b2c4");
    const ResTreeNode& readOnly = *root;
    keys.clear();
    for (ConstEntryIterator entry = readOnly.Begin(); entry != readOnly.End(); ++entry) {
        keys += ExactText(entry.Key()) + std::to_string((*entry).Kind());
    }
    EXPECT_EQ(keys, "a1b2c4");
}

TEST(ResTreeNode, WalkThatLoadsSeesAllEntriesWhereNothingIsDeferred) {
    const auto root = MakeRootNode();
    AddText(*root, u"a", u"1");
    EXPECT_EQ(root->BeginLoaded(), root->Begin());
    EXPECT_EQ(ExactText(root->BeginLoaded().Key()), "a");
}

// --- Setting ---

TEST(ResTreeNode, SetPropertyMakesAPlainTextAtTheEnd) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"z", u"1");
    EXPECT_TRUE(root->SetProperty(u"a", u"2"));
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  z=1\n  a=2\n");
}

TEST(ResTreeNode, SetPropertyAssignsATextAndKeepsItsKeyAndKind) {
    const auto root = MakeRootNode();
    AddText(*root, u"A", u"1");
    AddText(*root, u"B", u"2", LocalizedTextEntry);
    EXPECT_TRUE(root->SetProperty(u"a", u"3"));
    EXPECT_TRUE(root->SetProperty(u"b", u"4"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  A=3\n  B~4\n");
}

TEST(ResTreeNode, SetPropertyOnALinkChangesNothing) {
    const auto root = MakeRootNode();
    AddLink(*root, u"Name", u"/path");
    EXPECT_FALSE(root->SetProperty(u"Name", u"x"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  Name->/path\n");
}

TEST(ResTreeNode, SetPropertyOnAChildChangesNothing) {
    const auto root = MakeRootNode();
    AddChild(*root, u"Name");
    EXPECT_FALSE(root->SetProperty(u"Name", u"x"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  Name:T\n");
}

TEST(ResTreeNode, SetEntryTextNeedsAText) {
    const auto root = MakeRootNode();
    AddText(*root, u"A", u"1", LocalizedTextEntry);
    AddLink(*root, u"B", u"2");
    AddChild(*root, u"C");
    EXPECT_TRUE(root->SetEntryText(root->FindEntry(u"A"), u"new"));
    EXPECT_FALSE(root->SetEntryText(root->FindEntry(u"B"), u"new"));
    EXPECT_FALSE(root->SetEntryText(root->FindEntry(u"C"), u"new"));
    EXPECT_FALSE(root->SetEntryText(root->End(), u"new"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  A~new\n  B->2\n  C:T\n");
}

TEST(ResTreeNode, TextKeepsNulUnits) {
    const auto root = MakeRootNode();
    root->SetProperty(u"A", std::u16string_view(u"a\0b", 3));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  A=a{0000}b\n");
}

TEST(ResTreeNode, ValueMayComeFromTheNodeItself) {
    const auto root = MakeRootNode();
    AddText(*root, u"A", u"some text of some length");
    root->SetProperty(u"A", root->GetProperty(u"A")->substr(5, 4));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  A=text\n");
}

// --- Order ---

TEST(ResTreeNode, SetOrderedChangesTheFormOfAnEmptyNode) {
    const auto root = MakeRootNode();
    root->SetOrdered(true);
    EXPECT_TRUE(root->IsOrdered());
    AddText(*root, u"b", u"1");
    AddText(*root, u"a", u"2");
    AddText(*root, u"a", u"3");
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  b=1\n  a=2\n  a=3\n");
}

TEST(ResTreeNode, SetOrderedMakesAnEmptyNodeUnorderedAgain) {
    const auto root = MakeRootNode(true);
    root->SetOrdered(false);
    EXPECT_FALSE(root->IsOrdered());
    AddText(*root, u"b", u"1");
    AddText(*root, u"a", u"2");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  a=2\n  b=1\n");
}

// --- Renaming ---

TEST(ResTreeNode, RenameEntryNeedsAnEntry) {
    for (const bool ordered : {false, true}) {
        const auto root = MakeRootNode(ordered);
        AddText(*root, u"a", u"1");
        EXPECT_FALSE(root->RenameEntry(u"b", u"c"));
        EXPECT_EQ(ExactText(root->Begin().Key()), "a");
    }
}

TEST(ResTreeNode, RenameEntryKeepsThePlaceInAnOrderedNode) {
    const auto root = MakeRootNode(true);
    AddText(*root, u"a", u"1");
    AddText(*root, u"b", u"2");
    AddText(*root, u"B", u"3");
    EXPECT_TRUE(root->RenameEntry(u"B", u"a"));
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  a=1\n  a=2\n  B=3\n");
}

TEST(ResTreeNode, RenameEntryMovesTheEntryInAnUnorderedNode) {
    const auto root = MakeRootNode();
    AddText(*root, u"a", u"1");
    AddText(*root, u"b", u"2");
    EXPECT_TRUE(root->RenameEntry(u"A", u"c"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  b=2\n  c=1\n");
}

TEST(ResTreeNode, RenameEntryCanChangeTheCaseAlone) {
    const auto root = MakeRootNode();
    AddText(*root, u"abc", u"1");
    EXPECT_TRUE(root->RenameEntry(u"abc", u"ABC"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  ABC=1\n");
}

TEST(ResTreeNode, RenameEntryOverASiblingLosesTheEntry) {
    const auto root = MakeRootNode();
    AddText(*root, u"a", u"1");
    AddText(*root, u"b", u"2");
    EXPECT_FALSE(root->RenameEntry(u"a", u"B"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  b=2\n");
}

TEST(ResTreeNode, RenameEntryLeavesTheNameOfTheChild) {
    const auto root = MakeRootNode();
    AddChild(*root, u"a");
    EXPECT_TRUE(root->RenameEntry(u"a", u"b"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  b=>a:T\n");
}

TEST(ResTreeNode, RenameChangesTheNameAndTheKey) {
    for (const bool ordered : {false, true}) {
        const auto root = MakeRootNode(ordered);
        ResTreeNode* child = AddChild(*root, u"a");
        EXPECT_TRUE(child->Rename(u"b"));
        EXPECT_EQ(DumpTree(*root), ordered ? "Root:Root ordered\n  b:T\n" : "Root:Root\n  b:T\n");
    }
}

TEST(ResTreeNode, RenameOfARootChangesItsName) {
    const auto root = MakeRootNode();
    EXPECT_TRUE(root->Rename(u"Other"));
    EXPECT_EQ(DumpTree(*root), "Other:Root\n");
}

TEST(ResTreeNode, RenameOverASiblingLosesTheNodeAndKeepsItsName) {
    const auto root = MakeRootNode();
    ResTreeNode* child = AddChild(*root, u"a");
    AddText(*child, u"text", u"1");
    ResTreeNode* sibling = AddChild(*root, u"b");
    EXPECT_FALSE(child->Rename(u"B"));
    EXPECT_EQ(ExactText(child->GetName()), "a");
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  b:T\n");
    EXPECT_EQ(root->Lookup(u"b", nullptr), sibling);
    // The lost node is out of reach but still whole.
    EXPECT_EQ(ExactText(*child->GetProperty(u"text")), "1");
    EXPECT_EQ(child->GetParent(), root.get());
}

TEST(ResTreeNode, RenameOfALostNodeFails) {
    const auto root = MakeRootNode();
    ResTreeNode* child = AddChild(*root, u"a");
    AddChild(*root, u"b");
    EXPECT_FALSE(child->Rename(u"b"));
    EXPECT_FALSE(child->Rename(u"c"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  b:T\n");
}

TEST(ResTreeNode, RenameInAnOrderedParentMayDoubleAName) {
    const auto root = MakeRootNode(true);
    ResTreeNode* child = AddChild(*root, u"a");
    AddChild(*root, u"b");
    EXPECT_TRUE(child->Rename(u"b"));
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  b:T\n  b:T\n");
}

TEST(ResTreeNode, RenameInAnOrderedParentTakesTheFirstEntryOfTheName) {
    // The parent is asked for the name, and a text in front bears it as well.
    const auto root = MakeRootNode(true);
    AddText(*root, u"a", u"1");
    ResTreeNode* child = AddChild(*root, u"a");
    EXPECT_TRUE(child->Rename(u"b"));
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  b=1\n  a=>b:T\n");
}

TEST(ResTreeNode, RenameOfTheSecondOfEqualNamesChangesTheKeyOfTheFirst) {
    const auto root = MakeRootNode(true);
    AddChild(*root, u"a");
    ResTreeNode* second = AddChild(*root, u"a");
    EXPECT_TRUE(second->Rename(u"b"));
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  b=>a:T\n  a=>b:T\n");
}

TEST(ResTreeNode, RenameOfARenamedEntryGoesByItsKey) {
    for (const bool ordered : {false, true}) {
        const auto root = MakeRootNode(ordered);
        AddChild(*root, u"a");
        EXPECT_TRUE(root->RenameEntry(u"a", u"b"));
        EXPECT_TRUE(root->RenameEntry(u"b", u"c"));
        EXPECT_EQ(root->FindRaw(u"b"), nullptr);
        EXPECT_EQ(DumpTree(*root), std::string(ordered ? "Root:Root ordered\n" : "Root:Root\n") + "  c=>a:T\n");
    }
}

TEST(ResTreeNode, ANameFromADocumentLeavesTheKey) {
    const auto root = MakeRootNode();
    ResTreeNode* child = nullptr;
    root->AddChildEntry(u"key", u"", false, child);
    EXPECT_EQ(child->LoadResourceText(u"<Element name=\"name\"><a>1</a></Element>", false, nullptr), 0);
    EXPECT_EQ(ExactText(child->GetName()), "name");
    EXPECT_EQ(root->FindRaw(u"name"), nullptr);
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  key=>name:Element\n    a=1\n");
}

TEST(ResTreeNode, RenameFailsWhereTheParentHasNoSuchEntry) {
    const auto root = MakeRootNode();
    ResTreeNode* child = AddChild(*root, u"a");
    root->RenameEntry(u"a", u"other");
    EXPECT_FALSE(child->Rename(u"b"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  other=>a:T\n");
}

TEST(ResTreeNode, RenameToTheSameNameSucceeds) {
    const auto root = MakeRootNode();
    ResTreeNode* child = AddChild(*root, u"a");
    EXPECT_TRUE(child->Rename(u"a"));
    EXPECT_TRUE(child->Rename(u"A"));
    EXPECT_EQ(DumpTree(*root), "Root:Root\n  A:T\n");
}

// --- Many ---

TEST(ResTreeNode, ManyChildrenAreRenamedOneByOne) {
    for (const bool ordered : {false, true}) {
        const auto root = MakeRootNode(ordered);
        std::vector<ResTreeNode*> children;
        for (int i = 0; i < 20'000; ++i) {
            const std::string number = std::to_string(i);
            children.push_back(AddChild(*root, (u"k" + std::u16string(number.begin(), number.end())).c_str()));
        }
        for (ResTreeNode* child : children) {
            ASSERT_TRUE(child->Rename(u"n" + std::u16string(child->GetName().substr(1))));
        }
        for (ResTreeNode* child : children) {
            ASSERT_EQ(root->Lookup(child->GetName(), nullptr), child);
        }
        EXPECT_TRUE(root->FindEntry(u"k7").IsEnd());
    }
}

TEST(ResTreeNode, ManyEqualKeysStandSideBySide) {
    const auto root = MakeRootNode(true);
    for (int i = 0; i < 100'000; ++i) {
        AddText(*root, i % 2 == 0 ? u"key" : u"KEY", u"");
    }
    root->SetProperty(u"Key", u"first");
    EXPECT_EQ(ExactText(*root->Begin()->Text()), "first");
    root->RemoveEntryByName(u"key");
    EXPECT_EQ(root->GetPropertyOrEmpty(u"key").size(), 0u);
    AddTextBefore(*root, u"front", u"x", u"kEy");
    EXPECT_EQ(ExactText(root->Begin().Key()), "front");
}

}  // namespace
}  // namespace zkhw
