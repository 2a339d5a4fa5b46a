// Fragments read into a node, entries removed, and notices held back.

#include <vector>

#include <gtest/gtest.h>

#include "interfaces/support/NodeViewTest.h"
#include "support/ChangeLog.h"
#include "support/TreeDump.h"

namespace zkhw {
namespace {

class NodeEditing : public NodeViewTest {
  protected:
    ResTreeNode* AddNode(const char16_t* name, bool ordered = false) {
        ResTreeNode* const node = AddChild(*root, name, u"T", ordered);
        view = View(*node);
        return node;
    }
    HRESULT Load(const char16_t* fragment) { return view->LoadContent(In(fragment)); }

    NodeView view;
};

TEST_F(NodeEditing, LoadContentReadsTheFragmentIntoTheNode) {
    ResTreeNode* const node = AddNode(u"N");
    AddText(*node, u"Old", u"0");
    EXPECT_EQ(Load(u"<Speed>40</Speed><Clock name=\"C\"><Rate>1</Rate></Clock>"), S_OK);
    EXPECT_EQ(DumpTree(*root),
              "Root:Root ordered\n"
              "  N:T\n"
              "    C:Clock\n"
              "      Rate=1\n"
              "    Old=0\n"
              "    Speed=40\n");
}

TEST_F(NodeEditing, LoadContentKeepsTheOrderOfAnOrderedNode) {
    AddNode(u"N", true);
    EXPECT_EQ(Load(u"<b>1</b><a>2</a>"), S_OK);
    EXPECT_EQ(DumpTree(*root),
              "Root:Root ordered\n"
              "  N:T ordered\n"
              "    b=1\n"
              "    a=2\n");
}

TEST_F(NodeEditing, LoadContentOfNothingChangesNothing) {
    AddNode(u"N");
    EXPECT_EQ(Load(u""), S_OK);
    EXPECT_EQ(view->LoadContent(nullptr), S_OK);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  N:T\n");
}

TEST_F(NodeEditing, LoadContentEscapesMarkupInTheNameOfTheNode) {
    AddNode(u"a&b<c>d");
    EXPECT_EQ(Load(u"<Speed>40</Speed>"), S_OK);
    EXPECT_EQ(DumpTree(*root),
              "Root:Root ordered\n"
              "  a&b<c>d:T\n"
              "    Speed=40\n");
}

// Only markup is escaped, so a double quote ends the attribute and what follows it is no XML any more.
TEST_F(NodeEditing, LoadContentFailsInANodeWhoseNameHoldsADoubleQuote) {
    ResTreeNode* const node = AddNode(u"a\"b");
    EXPECT_EQ(Load(u"<Speed>40</Speed>"), E_FAIL);
    EXPECT_EQ(node->FindRaw(u"Speed"), nullptr);
    EXPECT_NE(node->FindRaw(u"XMLParseErrors"), nullptr);
}

TEST_F(NodeEditing, LoadContentTakesAnApostropheInTheName) {
    AddNode(u"it's");
    EXPECT_EQ(Load(u"<Speed>40</Speed>"), S_OK);
}

TEST_F(NodeEditing, LoadContentReadsWhatIsNotAscii) {
    ResTreeNode* const node = AddNode(u"\u00DC");
    EXPECT_EQ(Load(u"<K>\u00E4\u20AC</K>"), S_OK);
    EXPECT_EQ(*node->GetProperty(u"K"), u"\u00E4\u20AC");
}

TEST_F(NodeEditing, LoadContentThatIsNotWellFormedKeepsWhatStoodInFront) {
    ResTreeNode* const node = AddNode(u"N");
    EXPECT_EQ(Load(u"<Speed>40</Speed><Broken></Other>"), E_FAIL);
    EXPECT_EQ(*node->GetProperty(u"Speed"), u"40");
    EXPECT_TRUE(node->GetProperty(u"XMLParseErrors"));
}

TEST_F(NodeEditing, LoadContentTellsObserversOnceOfEverything) {
    ResTreeNode* const node = AddNode(u"N");
    ChangeLog log;
    LoggingObserver observer(log, "host");
    node->AddObserver(&observer, 0xFFFFFFFF, 7);
    EXPECT_EQ(Load(u"<Speed>40</Speed><Speed2>41</Speed2><C name=\"C\"><D>1</D></C>"), S_OK);
    EXPECT_EQ(log.Take(), "host: N PropertyAdded|ChildAdded #7\n");
    node->RemoveObserver(&observer, 7, false);
}

TEST_F(NodeEditing, AFailedLoadContentStillTellsOfWhatItRead) {
    ResTreeNode* const node = AddNode(u"N");
    ChangeLog log;
    LoggingObserver observer(log, "host");
    node->AddObserver(&observer, 0xFFFFFFFF, 7);
    EXPECT_EQ(Load(u"<Speed>40</Speed><"), E_FAIL);
    EXPECT_EQ(log.Take(), "host: N PropertyAdded #7\n");
    node->RemoveObserver(&observer, 7, false);
}

TEST_F(NodeEditing, FlagsThatWaitedBeforeLoadContentAreDeliveredWithItsOwn) {
    ResTreeNode* const node = AddNode(u"N");
    ChangeLog log;
    LoggingObserver observer(log, "host");
    node->AddObserver(&observer, 0xFFFFFFFF, 7);
    node->BeginChanges();
    AddLink(*node, u"L", u"..");
    EXPECT_EQ(Load(u"<Speed>40</Speed>"), S_OK);
    EXPECT_EQ(Load(u"<"), E_FAIL);
    EXPECT_EQ(log.Take(), "");
    EXPECT_EQ(view->HasPendingChanges(), S_OK);
    node->EndChanges(0, false);
    EXPECT_EQ(log.Take(), "host: N PropertyAdded|ChildAdded #7\n");
    node->RemoveObserver(&observer, 7, false);
}

TEST_F(NodeEditing, RemoveEntryRemovesAnyKindOfEntryByName) {
    ResTreeNode* const node = AddNode(u"N");
    AddText(*node, u"Text", u"");
    AddLink(*node, u"Link", u"..");
    AddChild(*AddChild(*node, u"Child"), u"Below");
    AddText(*node, u"Stays", u"");
    EXPECT_EQ(view->RemoveEntry(In(u"TEXT")), S_OK);
    EXPECT_EQ(view->RemoveEntry(In(u"Link")), S_OK);
    EXPECT_EQ(view->RemoveEntry(In(u"Child")), S_OK);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  N:T\n    Stays=\n");
}

TEST_F(NodeEditing, RemoveEntryTakesTheFirstOfEqualKeys) {
    ResTreeNode* const node = AddNode(u"N", true);
    AddText(*node, u"k", u"1");
    AddText(*node, u"K", u"2");
    EXPECT_EQ(view->RemoveEntry(In(u"K")), S_OK);
    EXPECT_EQ(DumpTree(*root), "Root:Root ordered\n  N:T ordered\n    K=2\n");
}

TEST_F(NodeEditing, RemoveEntryOfNothingIsOk) {
    AddNode(u"N");
    EXPECT_EQ(view->RemoveEntry(In(u"Missing")), S_OK);
    EXPECT_EQ(view->RemoveEntry(nullptr), S_OK);
}

// --- Notices held back ---

class NodeNotices : public NodeEditing {
  protected:
    NodeNotices() : node(AddNode(u"N")) {
        AddText(*node, u"k", u"");
        node->AddObserver(&observer, 0xFFFFFFFF, 7);
    }
    ~NodeNotices() override { node->RemoveObserver(&observer, 7, false); }

    std::string Begin() {
        return GivenNumber([&](ULONG* pending) { return view->BeginChange(pending); });
    }

    ResTreeNode* node;
    ChangeLog log;
    LoggingObserver observer{log, "host"};
};

TEST_F(NodeNotices, AreDeliveredAtOnceWithoutABracket) {
    EXPECT_EQ(view->SetProperty(In(u"k"), In(u"1")), S_OK);
    EXPECT_EQ(log.Take(), "host: N PropertyChanged #7\n");
    EXPECT_EQ(view->HasPendingChanges(), S_FALSE);
}

TEST_F(NodeNotices, WaitForTheEndOfTheBracket) {
    EXPECT_EQ(Begin(), "S_OK 0");
    view->SetProperty(In(u"k"), In(u"1"));
    view->SetProperty(In(u"k"), In(u"2"));
    EXPECT_EQ(log.Take(), "");
    EXPECT_EQ(view->HasPendingChanges(), S_OK);
    EXPECT_EQ(view->EndChange(0, 0), S_OK);
    EXPECT_EQ(log.Take(), "host: N PropertyChanged #7\n");
    EXPECT_EQ(view->HasPendingChanges(), S_FALSE);
}

TEST_F(NodeNotices, BeginChangeHandsOutWhatWaits) {
    Begin();
    view->SetProperty(In(u"k"), In(u"1"));
    EXPECT_EQ(Begin(), "S_OK 4");
    EXPECT_EQ(view->HasPendingChanges(), S_FALSE);
    EXPECT_EQ(view->EndChange(PropertyChanged, 0), S_OK);
    EXPECT_EQ(log.Take(), "");
    view->EndChange(0, 0);
    EXPECT_EQ(log.Take(), "host: N PropertyChanged #7\n");
}

TEST_F(NodeNotices, EndChangeAddsItsFlags) {
    Begin();
    view->SetProperty(In(u"k"), In(u"1"));
    view->EndChange(ChildAdded, 0);
    EXPECT_EQ(log.Take(), "host: N PropertyChanged|ChildAdded #7\n");
}

// All 32 bits travel, also those that say nothing yet.
TEST_F(NodeNotices, FlagsWithoutANameWaitAndAreHandedOut) {
    Begin();
    Begin();
    view->EndChange(0x80010000, 1);
    EXPECT_EQ(view->HasPendingChanges(), S_OK);
    EXPECT_EQ(Begin(), "S_OK 2147549184");
    EXPECT_EQ(view->HasPendingChanges(), S_FALSE);
    view->EndChange(0, 0);
    view->EndChange(0, 0);
    EXPECT_EQ(log.Take(), "");
}

TEST_F(NodeNotices, FlagsWithoutANameReachThoseWhoAskForThem) {
    struct Listener : ResTreeNodeChangeObserver {
        void OnNodeChanged(ResTreeNode*, uint32_t changes, int32_t) override { heard.push_back(changes); }
        std::vector<uint32_t> heard;
    };
    Listener high;
    Listener other;
    node->AddObserver(&high, 0x80000000, 8);
    node->AddObserver(&other, 0x10000, 9);
    Begin();
    view->EndChange(0x80000000, 0);
    EXPECT_EQ(high.heard, std::vector<uint32_t>{0x80000000});
    EXPECT_EQ(other.heard, std::vector<uint32_t>{});
    node->RemoveObserver(&high, 8, false);
    Begin();
    view->EndChange(0x80000000, 0);
    EXPECT_EQ(high.heard, std::vector<uint32_t>{0x80000000});
    node->RemoveObserver(&other, 9, false);
}

TEST_F(NodeNotices, EndChangeWithReplaceForgetsWhatWasRaised) {
    Begin();
    view->SetProperty(In(u"k"), In(u"1"));
    view->EndChange(ChildAdded, 1);
    EXPECT_EQ(log.Take(), "host: N ChildAdded #7\n");
    Begin();
    view->SetProperty(In(u"k"), In(u"2"));
    view->EndChange(0, 1);
    EXPECT_EQ(log.Take(), "");
}

}  // namespace
}  // namespace zkhw
