// Nodes whose contents are read on the first lookup that misses.

#include <cerrno>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"
#include "restree/ReleaseScope.h"
#include "support/ChangeLog.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::FileCall;

class DeferredLoad : public ResourceFiles {
  protected:
    DeferredLoad() : root(MakeUnnamedRoot()) { Load(*root, "<R><A name='a'><S name='s'><U>0</U></S></A></R>"); }

    ResTreeNode& Stub() { return At(*root, u"a/s"); }
    ResTreeNode& Above() { return At(*root, u"a"); }
    uint64_t OpenedFiles() { return files.Count(FileCall::OpenText); }
    static void Defer(ResTreeNode& node, const char16_t* paths) { node.SetProperty(u":DeferredLoadPath", paths); }

    std::unique_ptr<ResTreeNode> root;
};

TEST_F(DeferredLoad, MergesTheFileIntoTheStub) {
    Write("board.xml", "<Other name='other' ordered='true'><V>1</V><U>1</U><C name='c'/></Other>");
    ResTreeNode& stub = Stub();
    Defer(stub, u"board.xml");
    EXPECT_FALSE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(DumpTree(stub), "s:S\n  c:C\n  U=1\n  V=1\n");
}

TEST_F(DeferredLoad, FiresOnALookupThatMissesAlone) {
    Write("board.xml", "<B><V>1</V></B>");
    ResTreeNode& stub = Stub();
    Defer(stub, u"board.xml");
    EXPECT_EQ(TextAt(stub, u"U"), "0");
    EXPECT_EQ(OpenedFiles(), 0u);
    EXPECT_EQ(TextAt(stub, u"V"), "1");
    EXPECT_EQ(OpenedFiles(), 1u);
}

TEST_F(DeferredLoad, CopyThatMayMergeIntoWhatStandsDoesNotAskForIt) {
    Write("board.xml", "<B><N name='n'><V>1</V></N></B>");
    for (const bool overwrite : {true, false}) {
        ResTreeNode* ordered = nullptr;
        root->AddChildEntry(overwrite ? u"merged" : u"replaced", u"T", true, ordered);
        Defer(*ordered, u"board.xml");
        ResTreeNode source(u"S", u"N", false);
        ResTreeNode* child = nullptr;
        ordered->CloneSubtreeInto(ordered->End(), u"n", source, overwrite, child);
        EXPECT_EQ(ordered->FindRaw(u":DeferredLoadPath") != nullptr, overwrite);
    }
}

TEST_F(DeferredLoad, ReadsTheFilesOnce) {
    Write("board.xml", "<B><V>1</V></B>");
    ResTreeNode& stub = Stub();
    Defer(stub, u"board.xml");
    EXPECT_FALSE(stub.GetProperty(u"missing"));
    EXPECT_FALSE(stub.GetProperty(u"missing"));
    EXPECT_TRUE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(OpenedFiles(), 1u);
    EXPECT_EQ(stub.FindRaw(u":DeferredLoadPath"), nullptr);
}

TEST_F(DeferredLoad, StartsAtTheFolderOfTheExecutable) {
    Write("x/y/board.xml", "<B><V>1</V></B>");
    ResTreeNode& stub = Stub();
    Defer(stub, u"x\\y\\board.xml");
    EXPECT_FALSE(stub.EnsureDeferredLoaded());
    Defer(stub, folder.System(u"x\\y\\board.xml").CStr());
    EXPECT_FALSE(stub.EnsureDeferredLoaded());
}

TEST_F(DeferredLoad, ReadsItsFilesInOrder) {
    Write("one.xml", "<B><V>1</V><W>1</W></B>");
    Write("two.xml", "<B><V>2</V></B>");
    ResTreeNode& stub = Stub();
    Defer(stub, u" one.xml , two.xml ");
    EXPECT_FALSE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(DumpTree(stub), "s:S\n  U=0\n  V=2\n  W=1\n");
}

TEST_F(DeferredLoad, FailureEndsTheWalk) {
    Write("one.xml", "<B><V>1</V></B>");
    Write("two.xml", "<B><V>2</V></B>");
    ResTreeNode& stub = Stub();
    Defer(stub, u"one.xml,missing.xml,two.xml");
    EXPECT_FALSE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(DumpTree(stub), "s:S\n  U=0\n  V=1\n");
    Defer(stub, u"missing.xml,two.xml");
    EXPECT_TRUE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(DumpTree(stub), "s:S\n  U=0\n  V=1\n");
}

TEST_F(DeferredLoad, MissingFileLeavesTheStubWithoutAReport) {
    ResTreeNode& stub = Stub();
    Defer(stub, u"missing.xml");
    EXPECT_FALSE(stub.GetProperty(u"V"));
    EXPECT_EQ(DumpTree(stub), "s:S\n  U=0\n");
}

TEST_F(DeferredLoad, MalformedFileIsReportedOnTheStub) {
    Write("board.xml", "<B><V>1</V><W></B>");
    ResTreeNode& stub = Stub();
    Defer(stub, u"board.xml");
    EXPECT_TRUE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(Errors(stub), "Error on line 1 at column 16 of file" + Shown(u"board.xml") +
                                "\n   mismatched tag\n   <B><V>1</V><W></B>\n");
    EXPECT_EQ(TextAt(stub, u"V"), "1");
}

TEST_F(DeferredLoad, DotsPassTheRequestToTheParent) {
    Write("above.xml", "<B><X><V>1</V></X><S name='s'><V>2</V></S></B>");
    Write("own.xml", "<B><V>3</V></B>");
    Defer(Above(), u"above.xml");
    ResTreeNode& stub = Stub();
    Defer(stub, u"..,own.xml");
    EXPECT_EQ(TextAt(stub, u"V"), "3");
    EXPECT_EQ(DumpTree(Above()), "a:A\n  s:S\n    U=0\n    V=3\n  X:X\n    V=1\n");
}

TEST_F(DeferredLoad, DotsAloneAreNoSuccessOfTheStub) {
    Write("above.xml", "<B><S name='s'><V>2</V></S></B>");
    Defer(Above(), u"above.xml");
    ResTreeNode& stub = Stub();
    Defer(stub, u"..");
    EXPECT_TRUE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(TextAt(stub, u"V"), "2");
}

TEST_F(DeferredLoad, DotsOfTheRootAreSkipped) {
    Write("own.xml", "<B><V>3</V></B>");
    Defer(*root, u"..,own.xml");
    EXPECT_FALSE(root->EnsureDeferredLoaded());
    EXPECT_EQ(TextAt(*root, u"V"), "3");
}

TEST_F(DeferredLoad, FailureOfTheParentDoesNotEndTheWalkOfTheStub) {
    Write("own.xml", "<B><V>3</V></B>");
    Defer(Above(), u"missing.xml,own.xml");
    ResTreeNode& stub = Stub();
    Defer(stub, u"..,own.xml");
    EXPECT_FALSE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(TextAt(stub, u"V"), "3");
    EXPECT_EQ(Above().FindRaw(u"V"), nullptr);
}

TEST_F(DeferredLoad, FailureOfTheSystemEndsTheWalkSilently) {
    Write("own.xml", "<B><V>3</V></B>");
    ResTreeNode& stub = Stub();
    Defer(stub, u"own.xml,own.xml");
    files.Fail(FileCall::ReadExecutablePath, 1, EIO);
    EXPECT_TRUE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(DumpTree(stub), "s:S\n  U=0\n");
}

TEST_F(DeferredLoad, EntryThatIsNoTextIsLeftAlone) {
    ResTreeNode& stub = Stub();
    ResTreeNode* child = nullptr;
    stub.AddChildEntry(u":DeferredLoadPath", u"X", false, child);
    EXPECT_TRUE(stub.EnsureDeferredLoaded());
    EXPECT_NE(stub.FindRaw(u":DeferredLoadPath"), nullptr);
}

TEST_F(DeferredLoad, EmptyEntryIsRemoved) {
    ResTreeNode& stub = Stub();
    Defer(stub, u"");
    EXPECT_TRUE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(stub.FindRaw(u":DeferredLoadPath"), nullptr);
}

TEST_F(DeferredLoad, EntryIsKnownInAnyLetterCase) {
    Write("board.xml", "<B><V>1</V></B>");
    ResTreeNode& stub = Stub();
    stub.SetProperty(u":DEFERREDloadpath", u"board.xml");
    EXPECT_EQ(TextAt(stub, u"V"), "1");
}

TEST_F(DeferredLoad, EntryIsKnownWithASignThatCountsForNothing) {
    Write("board.xml", "<B><V>1</V></B>");
    ResTreeNode& stub = Stub();
    stub.SetProperty(u":Deferred\u00ADLoadPath", u"board.xml");
    EXPECT_FALSE(stub.EnsureDeferredLoaded());
    EXPECT_EQ(TextAt(stub, u"V"), "1");
}

TEST_F(DeferredLoad, EntryMayGetItsKeyByARename) {
    Write("board.xml", "<B><V>1</V></B>");
    ResTreeNode& stub = Stub();
    stub.SetProperty(u"later", u"board.xml");
    EXPECT_FALSE(stub.GetProperty(u"V"));
    EXPECT_TRUE(stub.RenameEntry(u"later", u":DeferredLoadPath"));
    EXPECT_EQ(TextAt(stub, u"V"), "1");
}

TEST_F(DeferredLoad, EntryOfAnOrderedNodeMayGetItsKeyByARename) {
    Write("board.xml", "<B><V>1</V></B>");
    Load(*root, "<R><L name='l' ordered='true'><later>board.xml</later></L></R>");
    ResTreeNode& list = At(*root, u"l");
    EXPECT_FALSE(list.GetProperty(u"V"));
    EXPECT_TRUE(list.RenameEntry(u"later", u":DeferredLoadPath"));
    EXPECT_EQ(TextAt(list, u"V"), "1");
}

TEST_F(DeferredLoad, EntryMayBeInserted) {
    Write("board.xml", "<B><V>1</V></B>");
    ResTreeNode& stub = Stub();
    stub.InsertEntry(stub.End(), u":DeferredLoadPath", TextEntry, u"board.xml");
    EXPECT_EQ(TextAt(stub, u"V"), "1");
}

TEST_F(DeferredLoad, EntryMayComeInBelowAnInsertedNode) {
    Write("board.xml", "<B><V>#{K}</V></B>");
    auto made = std::make_unique<ResTreeNode>(u"made", u"M", false, static_cast<const TypeTable*>(nullptr));
    ResTreeNode* inner = nullptr;
    made->AddChildEntry(u"inner", u"I", false, inner);
    Defer(*inner, u"board.xml");
    Above().InsertEntry(Above().End(), u"made", std::move(made));
    // The copy loads by itself, and what it loads is expanded.
    Load(*root, "<R><Q name='q' prototype='a/made' K='k'/></R>");
    EXPECT_EQ(DumpTree(At(*root, u"q")), "q:Q\n  inner:I\n    V=k\n");
}

TEST_F(DeferredLoad, FileThatDefersToItselfEnds) {
    // The lookup of the prototype misses while the file is being read, and asks for it once more.
    Write("self.xml",
          "<B><:DeferredLoadPath type='text'>self.xml</:DeferredLoadPath><Q prototype='nowhere'/><V>1</V></B>");
    ResTreeNode& stub = Stub();
    Defer(stub, u"self.xml");
    EXPECT_EQ(TextAt(stub, u"V"), "1");
    EXPECT_NE(stub.FindRaw(u"Q"), nullptr);
}

TEST_F(DeferredLoad, CanRemoveTheVeryStub) {
    // What is read into the parent replaces the stub that asked for it.
    Write("above.xml", "<B><S name='s' replace='true'><V>new</V></S></B>");
    Defer(Above(), u"above.xml");
    ResTreeNode& stub = Stub();
    Defer(stub, u"..");
    EXPECT_EQ(At(*root, u"a").Lookup(u"s/x", nullptr), nullptr);
    EXPECT_EQ(DumpTree(Above()), "a:A\n  s:S\n    V=new\n");
}

// A copy over which nothing is kept removes what has its name, also what the deferred file brings.
TEST_F(DeferredLoad, CopyIntoAnOrderedStubTakesThePlaceOfWhatTheFileBrings) {
    Write("board.xml", "<B><Old name='copy'><V>1</V></Old><Z>z</Z></B>");
    ResTreeNode* stub = nullptr;
    Above().AddChildEntry(u"o", u"S", true, stub);
    stub->SetProperty(u"X", u"x");
    Defer(*stub, u"board.xml");
    ResTreeNode* child = nullptr;
    stub->CloneSubtreeInto(stub->End(), u"copy", Stub(), false, child);
    EXPECT_EQ(DumpTree(*stub), "o:S ordered\n  X=x\n  Z=z\n  copy:S\n    U=0\n");
}

TEST_F(DeferredLoad, PlaceOfACopyInAnOrderedStubIsCountedFromTheFront) {
    Write("board.xml", "<B><Z>z</Z></B>");
    ResTreeNode* stub = nullptr;
    Above().AddChildEntry(u"o", u"S", true, stub);
    stub->SetProperty(u"X", u"x");
    stub->SetProperty(u"Y", u"y");
    Defer(*stub, u"board.xml");
    ResTreeNode* child = nullptr;
    stub->CloneSubtreeInto(stub->FindEntryRaw(u"Y"), u"copy", Stub(), false, child);
    EXPECT_EQ(DumpTree(*stub), "o:S ordered\n  X=x\n  copy:S\n    U=0\n  Y=y\n  Z=z\n");
}

TEST_F(DeferredLoad, ThousandsOfParentsInARowAreAskedWithoutTheStack) {
    std::string document;
    for (int i = 0; i < 2000; ++i) {
        document += "<N><:DeferredLoadPath type='text'>..</:DeferredLoadPath>";
    }
    for (int i = 0; i < 2000; ++i) {
        document += "</N>";
    }
    Write("top.xml", "<T><V>top</V></T>");
    auto deep = MakeRoot();
    LoadChild(*deep, document);
    Defer(*deep, u"top.xml");
    ResTreeNode* innermost = deep.get();
    while (const NodeEntry* entry = innermost->FindRaw(u"N")) {
        innermost = entry->Child();
    }
    EXPECT_TRUE(innermost->EnsureDeferredLoaded());
    EXPECT_EQ(TextAt(*deep, u"V"), "top");
}

// --- Loads that remove nodes which "Reserves" has led to ---

// The stub "s" holds X, which its file replaces; "w" reserves X and then something that only the file has.
class DependantsOfALoad : public DeferredLoad {
  protected:
    DependantsOfALoad() {
        Load(*root, "<R><A name='a'><S name='s'><X name='X'><Y name='Y'/></X></S></A><W name='w'/></R>");
        Write("board.xml", "<S><X name='X' replace='true'><New>1</New></X><Z name='Z'/></S>");
        Defer(Stub(), u"board.xml");
        w = &At(*root, u"w");
        old = &At(*root, u"a/s/X");
    }
    ~DependantsOfALoad() override { root->RemoveObserver(&observer, -1, true); }

    ChangeLog log;
    LoggingObserver observer{log, "o"};
    ResTreeNode* w = nullptr;
    ResTreeNode* old = nullptr;
};

TEST_F(DependantsOfALoad, AreThoseThatStandAfterIt) {
    w->SetProperty(u"Reserves", u"../a/s/X,../a/s/X/Y,../a/s/Z");
    const ReleaseScope scope;
    std::vector<ResTreeNode*> dependants;
    w->GetDependants(dependants, false);
    EXPECT_EQ(dependants, (std::vector<ResTreeNode*>{&At(*root, u"a/s/X"), &At(*root, u"a/s/Z")}));
    EXPECT_NE(dependants.front(), old);
}

TEST_F(DependantsOfALoad, StandAfterItUnderObserversToo) {
    root->AddObserver(&observer, ChildNameChanged, 0);
    w->SetProperty(u"Reserves", u"../a/s/X,../a/s/X/Y,../a/s/Z");
    const ReleaseScope scope;
    std::vector<ResTreeNode*> dependants;
    w->GetDependants(dependants, true);
    EXPECT_EQ(dependants, (std::vector<ResTreeNode*>{&At(*root, u"a/s/X"), &At(*root, u"a/s/Z")}));
    EXPECT_NE(dependants.front(), old);
}

TEST_F(DependantsOfALoad, AreAppendedToWhatIsThere) {
    w->SetProperty(u"Reserves", u"../a/s/X,../a/s/Z");
    std::vector<ResTreeNode*> dependants{w};
    w->GetDependants(dependants, false);
    EXPECT_EQ(dependants, (std::vector<ResTreeNode*>{w, &At(*root, u"a/s/X"), &At(*root, u"a/s/Z")}));
}

TEST_F(DependantsOfALoad, ThoseThatALoadBringsAreReservedWithoutTheNode) {
    w->SetProperty(u"Reserves", u"../a/s/Z");
    EXPECT_TRUE(w->ReserveDependants(u"owner", ReserveWrite));
    EXPECT_EQ(At(*root, u"a/s/Z").GetReservations().size(), 1U);
    EXPECT_TRUE(w->GetReservations().empty());
}

TEST_F(DependantsOfALoad, NodeMayHaveToBeLoadedForItsDependants) {
    Write("reserving.xml", "<W><Reserves>../a</Reserves></W>");
    Defer(*w, u"reserving.xml");
    EXPECT_TRUE(w->ReserveDependants(u"owner", ReserveWrite));
    EXPECT_EQ(At(*root, u"a").GetReservations().size(), 1U);
    EXPECT_TRUE(w->GetReservations().empty());
}

TEST_F(DependantsOfALoad, ANewDependantAloneIsSomethingNew) {
    w->SetProperty(u"Reserves", u"../a/s/X");
    EXPECT_TRUE(w->AddObserver(&observer, ReservationChanged, 7));
    EXPECT_FALSE(w->AddObserver(&observer, ReservationChanged, 7));
    w->SetProperty(u"Reserves", u"../a/s/X,../a/s/Z");
    EXPECT_TRUE(w->AddObserver(&observer, ReservationChanged, 7));
    w->SetProperty(u"Reserves", u"../a/s/X,../a/s/Z");
    EXPECT_FALSE(w->AddObserver(&observer, ReservationChanged, 7));
}

TEST_F(DependantsOfALoad, OnlyThoseThatStandAreWatched) {
    w->SetProperty(u"Reserves", u"../a/s/X,../a/s/Z");
    EXPECT_TRUE(w->AddObserver(&observer, ReservationChanged, 7));
    log.Take();
    At(*root, u"a/s/X").Raise(ReservationChanged);
    EXPECT_EQ(log.Take(), "o: w ReservationChanged #7\n");
    At(*root, u"a/s/Z").Raise(ReservationChanged);
    EXPECT_EQ(log.Take(), "o: w ReservationChanged #7\n");
}

TEST_F(DependantsOfALoad, OfADependantThatGoesAreNotWatched) {
    // X leads on to the stub and is replaced when its own dependants are looked up.
    w->SetProperty(u"Reserves", u"../a/s/X");
    old->SetProperty(u"Reserves", u"../../../w,../Z");
    EXPECT_TRUE(w->AddObserver(&observer, ReservationChanged, 7));
    log.Take();
    At(*root, u"a/s/X").Raise(ReservationChanged);
    At(*root, u"a/s/Z").Raise(ReservationChanged);
    EXPECT_EQ(log.Take(), "");
    w->Raise(ReservationChanged);
    EXPECT_EQ(log.Take(), "o: w ReservationChanged #7\n");
}

TEST_F(DependantsOfALoad, OfTheNodeItselfThatGoesAreNotWatched) {
    old->SetProperty(u"Reserves", u"../../../w,../Z");
    EXPECT_TRUE(old->AddObserver(&observer, ReservationChanged, 7));
    log.Take();
    w->Raise(ReservationChanged);
    EXPECT_EQ(log.Take(), "");
}

}  // namespace
}  // namespace zkhw
