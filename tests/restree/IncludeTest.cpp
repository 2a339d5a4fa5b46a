// ":Include" elements.

#include <cerrno>
#include <string>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::FileCall;

class Include : public ResourceFiles {
  protected:
    // Loads a document into an unnamed root; the dump behind a line feed.
    std::string Read(const std::string& xml) {
        root = MakeUnnamedRoot();
        return Load(*root, xml);
    }

    // How many reports of files that can't be included stand in a node.
    static size_t CountRefusals(ResTreeNode& node) {
        const std::string errors = Errors(node);
        size_t count = 0;
        for (size_t at = errors.find("Unable to find include file node: "); at != std::string::npos;
             at = errors.find("Unable to find include file node: ", at + 1)) {
            ++count;
        }
        return count;
    }

    // Includes a path that names no file, with a value behind it.
    void ExpectRefusal(const std::string& path) {
        Read("<R><:Include>" + path + "</:Include><W>1</W></R>");
        EXPECT_EQ(CountRefusals(*root), 1u) << path;
        EXPECT_EQ(TextAt(*root, u"W"), "1");
        root->RemoveEntryByName(u"XMLParseErrors");
        EXPECT_EQ(DumpTree(*root), "R:R\n  W=1\n") << path;
        EXPECT_EQ(files.OpenFiles(), 0);
    }

    std::unique_ptr<ResTreeNode> root;
};

// --- Child or children ---

TEST_F(Include, MakesTheDocumentElementAChild) {
    Write("inc.xml", "<Inc name='i'><V>1</V></Inc>");
    EXPECT_EQ(Read("<R><:Include>inc.xml</:Include><W>2</W></R>"), R"(
R:R
  i:Inc
    V=1
  W=2
)");
}

TEST_F(Include, WhatChildrenMergesIntoTheNode) {
    Write("inc.xml", "<IncList name='i'><V>1</V><C name='c'/></IncList>");
    EXPECT_EQ(Read("<R><:Include what='children'>inc.xml</:Include><W>2</W></R>"), R"(
R:R
  c:C
  V=1
  W=2
)");
}

TEST_F(Include, KeywordsAreBlindToCase) {
    Write("inc.xml", "<Inc name='i'><V>1</V></Inc>");
    EXPECT_EQ(Read("<R><:INCLUDE WHAT='Children'>inc.xml</:INCLUDE></R>"), R"(
R:R
  V=1
)");
}

TEST_F(Include, AnyOtherWordMakesAChild) {
    Write("inc.xml", "<Inc name='i'><V>1</V></Inc>");
    for (const char* word : {"", "child", "children ", "all", "true"}) {
        EXPECT_EQ(Read("<R><:Include what='" + std::string(word) + "'>inc.xml</:Include></R>"),
                  "\nR:R\n  i:Inc\n    V=1\n")
            << word;
    }
}

TEST_F(Include, MergesIntoTheChildThatIsThere) {
    Write("inc.xml", "<Inc><V>1</V><W>1</W></Inc>");
    EXPECT_EQ(Read("<R><Inc><U>0</U><V>0</V></Inc><:Include>inc.xml</:Include></R>"), R"(
R:R
  Inc:Inc
    U=0
    V=1
    W=1
)");
}

TEST_F(Include, ReplacesAChildOfAnotherType) {
    Write("inc.xml", "<Inc name='i'><V>1</V></Inc>");
    EXPECT_EQ(Read("<R><Other name='i'><U>0</U></Other><:Include>inc.xml</:Include></R>"), R"(
R:R
  i:Inc
    V=1
)");
}

TEST_F(Include, StandsAtItsPlaceInAnOrderedNode) {
    Write("inc.xml", "<Inc name='i'/>");
    Write("next.xml", "<Inc name='n' next='b'/>");
    EXPECT_EQ(Read("<RList><A name='a'/><:Include>inc.xml</:Include><B name='b'/><:Include "
                   "next='a'>next.xml</:Include></RList>"),
              R"(
RList:RList ordered
  a:A
  i:Inc
  n:Inc
  b:B
)");
}

TEST_F(Include, DoesNotInheritReplace) {
    Write("inc.xml", "<Inc><C name='c'><W>2</W></C><V>1</V></Inc>");
    EXPECT_EQ(
        Read("<R replace='1'><V>0</V><C name='c'><V>1</V></C><:Include what='children'>inc.xml</:Include><V>2</V></R>"),
        R"(
R:R
  c:C
    V=1
    W=2
  V=1
)");
}

TEST_F(Include, AsDocumentElementLandsInTheNode) {
    Write("inc.xml", "<Inc name='i'><V>1</V></Inc>");
    EXPECT_EQ(Read("<:Include>inc.xml</:Include>"), R"(
i:Inc
  V=1
)");
    auto named = MakeRoot();
    EXPECT_EQ(LoadChild(*named, "<:Include>inc.xml</:Include>"), R"(
Root:Root
  i:Inc
    V=1
)");
}

TEST_F(Include, SameFileMayBeReadManyTimes) {
    Write("inc.xml", "<Inc name='i'><V>1</V></Inc>");
    EXPECT_EQ(Read("<RList><:Include>inc.xml</:Include><:Include>inc.xml</:Include><A><:Include>inc.xml</:Include></"
                   "A></RList>"),
              R"(
RList:RList ordered
  i:Inc
    V=1
  i:Inc
    V=1
  A:A
    i:Inc
      V=1
)");
}

TEST_F(Include, OfADocumentWithNamesGivesAllOfThem) {
    Write("inc.xml", "<Inc names='a,b'><V>#{name} #{K}</V></Inc>");
    // Only the first is the node of the file, so the parameters of the include reach no other.
    EXPECT_EQ(Read("<R><:Include K='k'>inc.xml</:Include></R>"), R"(
R:R
  a:Inc
    V=a k
  b:Inc
    V=b #{K}
)");
}

// --- The path ---

TEST_F(Include, PathStartsAtTheInstallRootNotAtTheIncludingFile) {
    Write("sub/outer.xml", "<Outer><:Include>inc.xml</:Include><:Include>sub/inc.xml</:Include></Outer>");
    Write("inc.xml", "<Inc name='root'/>");
    Write("sub/inc.xml", "<Inc name='sub'/>");
    EXPECT_EQ(Read("<R><:Include>sub/outer.xml</:Include></R>"), R"(
R:R
  Outer:Outer
    root:Inc
    sub:Inc
)");
}

TEST_F(Include, PathMayHaveEitherSlashAndBeTrimmed) {
    Write("a/b/inc.xml", "<Inc name='i'/>");
    for (const char* path : {"a/b/inc.xml", "a\\b\\inc.xml", "a\\b/inc.xml", "\n\t a/b/inc.xml \n", "/a/b/inc.xml",
                             "a//b/inc.xml", "./a/./b/inc.xml", "a/none/../b/inc.xml", "A/B/INC.XML"}) {
        EXPECT_EQ(Read("<R><:Include>" + std::string(path) + "</:Include></R>"), "\nR:R\n  i:Inc\n") << path;
    }
}

TEST_F(Include, AbsolutePathWins) {
    Write("a/inc.xml", "<Inc name='i'/>");
    std::string path = Shown(u"a\\inc.xml");
    EXPECT_EQ(Read("<R><:Include>" + path + "</:Include></R>"), "\nR:R\n  i:Inc\n");
    for (char& unit : path) {
        unit = unit == '\\' ? '/' : unit;
    }
    EXPECT_EQ(Read("<R><:Include>" + path + "</:Include></R>"), "\nR:R\n  i:Inc\n");
}

TEST_F(Include, TypeDecidesWhetherSlashesAreTaken) {
    Write("a/inc.xml", "<Inc name='i'/>");
    EXPECT_EQ(Read("<R><:Include type='path'>a/inc.xml</:Include><:Include type='string'>none/inc.xml</:Include></R>")
                      .find("i:Inc") != std::string::npos,
              true);
    EXPECT_NE(Errors(*root).find("Unable to find include file node: " + Shown(u"none/inc.xml") + "\n"),
              std::string::npos);
}

TEST_F(Include, TextIsNotExpanded) {
    Write("inc.xml", "<Inc name='i'/>");
    Read("<R K='inc.xml'><:Include>#{K}</:Include></R>");
    EXPECT_EQ(root->FindRaw(u"i"), nullptr);
    EXPECT_NE(Errors(*root).find("Unable to find include file node: " + Shown(u"#{K}") + "\n"), std::string::npos);
}

TEST_F(Include, NameMayBeOfAnyScript) {
    Write("\xE5\x90\x8D.xml", "<Inc name='i'/>");
    EXPECT_EQ(Read("<R><:Include>\xE5\x90\x8D.xml</:Include></R>"), "\nR:R\n  i:Inc\n");
}

// --- Parameters ---

TEST_F(Include, ParametersReachTheIncludedText) {
    Write("inc.xml", "<Inc k='in'><V>#{k} #{q} #{p} #{name} #{document-root} #{ z }</V></Inc>");
    EXPECT_EQ(Read("<R><A q='out' k='late'><:Include q='own' p='own' name2='n'>inc.xml</:Include></A></R>"), R"(
R:R
  A:A
    Inc:Inc
      V=in out own #{name} /A/Inc #{z}
)");
}

TEST_F(Include, ParametersReachTheWholeNodeWithWhatChildren) {
    Write("inc.xml", "<Inc><V>#{p} #{document-root}</V></Inc>");
    EXPECT_EQ(Read("<R><A><U>#{p}</U><C><T>#{p} #{z}</T></C><:Include what='children' "
                   "p='own'>inc.xml</:Include><W>#{p}</W></A></R>"),
              R"(
R:R
  A:A
    C:C
      T=own #{z}
    U=own
    V=own /A
    W=#{p}
)");
}

TEST_F(Include, ParametersDoNotReachWhatWasThereBesideAChild) {
    Write("inc.xml", "<Inc><V>#{p}</V></Inc>");
    EXPECT_EQ(Read("<R><U>#{p}</U><:Include p='own'>inc.xml</:Include></R>"), R"(
R:R
  Inc:Inc
    V=own
  U=#{p}
)");
}

TEST_F(Include, ParsingTheFileKnowsNothingOfThem) {
    // A prototype's copy is expanded inside the file, before the parameters of the include come.
    Write("inc.xml", "<Inc><P><V>#{p} #{q}</V></P><Q prototype='P' q='file'/></Inc>");
    EXPECT_EQ(Read("<R><:Include p='own' q='own'>inc.xml</:Include></R>"), R"(
R:R
  Inc:Inc
    P:P
      V=own own
    Q:Q
      V=own file
)");
}

TEST_F(Include, InsideNamesLeavesTheLoopVariable) {
    Write("inc.xml", "<Inc><V>#{name} #{i} #{p}</V></Inc>");
    EXPECT_EQ(Read("<R><X names='x[i=1..2]' p='p'><:Include>inc.xml</:Include></X></R>"), R"(
R:R
  x1:X
    Inc:Inc
      V=x1 1 p
  x2:X
    Inc:Inc
      V=x2 2 p
)");
}

// --- Nothing to include ---

TEST_F(Include, OfAMissingFileIsReported) {
    Read("<R>\n<:Include>missing.xml</:Include>\n<W>1</W>\n</R>");
    EXPECT_EQ(Errors(*root), "Error on line 2 at column 21\n   Unable to find include file node: " +
                                 Shown(u"missing.xml") + "\n   <R>\n<:Include>missing.xml</:Include>\n<W>1</W>\n\n");
    EXPECT_EQ(TextAt(*root, u"W"), "1");
}

TEST_F(Include, ReportBearsNoFileNameInAFileEither) {
    Write("outer.xml", "<R><:Include>missing.xml</:Include></R>");
    auto outer = MakeUnnamedRoot();
    EXPECT_EQ(outer->LoadResourceFile(PathOf(u"outer.xml"), false, nullptr), 0);
    EXPECT_EQ(Errors(*outer), "Error on line 1 at column 24\n   Unable to find include file node: " +
                                  Shown(u"missing.xml") + "\n   <R><:Include>missing.xml</:Include></R>\n");
}

TEST_F(Include, ReportStandsInTheNodeThatHoldsTheElement) {
    Read("<R><A><:Include>missing.xml</:Include></A></R>");
    EXPECT_EQ(Errors(*root), "(none)");
    EXPECT_EQ(CountRefusals(At(*root, u"A")), 1u);
}

TEST_F(Include, OfWhatIsNoFileIsReported) {
    folder.MakeFolder("sub");
    Write("secret.xml", "<A/>");
    files.FailOnPath(FileCall::OpenText, folder.System(u"secret.xml"), EACCES);
    for (const char* path : {"sub", "sub/", "secret.xml", "secret.xml/", "", "."}) {
        ExpectRefusal(path);
    }
}

// Windows has no pipes in folders, and Wine doesn't show links that lead in a circle.
TEST_F(Include, OfAPipeOrACircleOfLinksIsReportedAsOnlyLinuxHasThem) {
    folder.MakePipe("pipe");
    folder.MakeLink("loop2", "loop1");
    folder.MakeLink("loop1", "loop2");
    ExpectRefusal("pipe");
    ExpectRefusal("loop1");
}

TEST_F(Include, WithoutTextIsThePathOfTheInstallRoot) {
    Read("<R><:Include/></R>");
    EXPECT_NE(Errors(*root).find("Unable to find include file node: " + Shown(u"") + "\n"), std::string::npos)
        << Errors(*root);
}

TEST_F(Include, OfAMalformedFileIsReportedTwice) {
    Write("bad.xml", "<Inc>\n<V>1</V>\n<W></X>\n</Inc>\n");
    for (const char* what : {"children", "child"}) {
        Read("<R>\n<:Include what='" + std::string(what) + "'>bad.xml</:Include>\n</R>");
        const size_t column = 10 + 8 + std::string(what).size() + 7;
        EXPECT_EQ(Errors(*root), "Error on line 3 at column 5 of file" + Shown(u"bad.xml") +
                                     "\n   mismatched tag\n   \n<V>1</V>\n<W></X>\n</Inc>\n\n"
                                     "Error on line 2 at column " +
                                     std::to_string(column) +
                                     "\n   Unable to find include file node: " + Shown(u"bad.xml") +
                                     "\n   <R>\n<:Include what='" + what + "'>bad.xml</:Include>\n</R>\n");
    }
}

TEST_F(Include, OfAMalformedFileLeavesWhatWasRead) {
    Write("bad.xml", "<Inc><V>#{p}</V><W></X></Inc>");
    Read("<R><:Include p='own'>bad.xml</:Include></R>");
    EXPECT_EQ(DumpTree(At(*root, u"Inc")), "Inc:Inc\n  V=#{p}\n");
}

TEST_F(Include, OfAnEmptyFileIsReportedTwice) {
    Write("empty.xml", "");
    Read("<R><:Include>empty.xml</:Include></R>");
    EXPECT_EQ(Errors(*root), "Error on line 1 at column 0 of file" + Shown(u"empty.xml") +
                                 "\n   no element found\n   \n"
                                 "Error on line 1 at column 22\n   Unable to find include file node: " +
                                 Shown(u"empty.xml") + "\n   <R><:Include>empty.xml</:Include></R>\n");
}

TEST_F(Include, OfAFileWithoutANodeIsReportedAndRead) {
    Write("value.xml", "<Inc>text #{p}</Inc>");
    Read("<R><:Include p='own'>value.xml</:Include></R>");
    EXPECT_EQ(TextAt(*root, u"Inc"), "text #{p}");
    EXPECT_EQ(CountRefusals(*root), 1u);
}

TEST_F(Include, OfAFileWithoutANodeAsChildrenIsRead) {
    Write("value.xml", "<Inc>text #{p}</Inc>");
    EXPECT_EQ(Read("<R><:Include what='children' p='own'>value.xml</:Include></R>"), R"(
R:R
  Inc=text own
)");
}

TEST_F(Include, OfALinkIsReadAndReported) {
    Write("link.xml", "<:Link name='x'>t</:Link>");
    Read("<R><A><T name='t'/><:Include>link.xml</:Include></A></R>");
    ResTreeNode& holder = At(*root, u"A");
    EXPECT_EQ(CountRefusals(holder), 1u);
    holder.RemoveEntryByName(u"XMLParseErrors");
    EXPECT_EQ(DumpTree(holder), "A:A\n  t:T\n  x->t\n");
}

TEST_F(Include, FailureOfTheSystemIsReportedAndReadingGoesOn) {
    files.FailFromThenOn(FileCall::ReadExecutablePath, 1, EIO);
    Read("<R>\n<:Include>inc.xml</:Include><W>1</W></R>");
    EXPECT_EQ(Errors(*root),
              "Error on line 2 at column 17\n   Encountered an OS exception.\n"
              "   <R>\n<:Include>inc.xml</:Include><W>1</W></R>\n");
    EXPECT_EQ(TextAt(*root, u"W"), "1");
}

// --- Nesting ---

TEST_F(Include, NestsThroughFiles) {
    Write("a.xml", "<A><:Include>b.xml</:Include></A>");
    Write("b.xml", "<B><:Include what='children' p='b'>c.xml</:Include></B>");
    Write("c.xml", "<C><V>#{p} #{q}</V></C>");
    EXPECT_EQ(Read("<R p='r'><:Include q='q'>a.xml</:Include></R>"), R"(
R:R
  A:A
    B:B
      V=b q
)");
}

TEST_F(Include, OfTheFileItselfIsRefused) {
    Write("self.xml", "<Inc><V>1</V><:Include>self.xml</:Include><W>2</W></Inc>");
    auto loaded = MakeUnnamedRoot();
    EXPECT_EQ(loaded->LoadResourceFile(PathOf(u"self.xml"), false, nullptr), 0);
    EXPECT_EQ(Errors(*loaded),
              "Error on line 1 at column 31\n   Unable to find include file node: " + Shown(u"self.xml") +
                  "\n   <Inc><V>1</V><:Include>self.xml</:Include><W>2</W></Inc>\n");
    loaded->RemoveEntryByName(u"XMLParseErrors");
    EXPECT_EQ(DumpTree(*loaded), "Inc:Inc\n  V=1\n  W=2\n");
}

TEST_F(Include, OfTheFileItselfIsRefusedOnceItIsIncluded) {
    Write("self.xml", "<Inc><V>1</V><:Include what='children'>self.xml</:Include><W>2</W></Inc>");
    Read("<R><:Include>self.xml</:Include></R>");
    EXPECT_EQ(Errors(*root), "(none)");
    ResTreeNode& included = At(*root, u"Inc");
    EXPECT_EQ(CountRefusals(included), 1u);
    included.RemoveEntryByName(u"XMLParseErrors");
    EXPECT_EQ(DumpTree(*root), "R:R\n  Inc:Inc\n    V=1\n    W=2\n");
}

TEST_F(Include, OfAFileFurtherUpIsRefused) {
    Write("ping.xml", "<Ping><:Include>pong.xml</:Include><V>1</V></Ping>");
    Write("pong.xml", "<Pong><:Include what='children'>ping.xml</:Include><V>2</V></Pong>");
    auto loaded = MakeRoot();
    EXPECT_EQ(loaded->LoadResourceFile(PathOf(u"ping.xml"), true, nullptr), 0);
    ResTreeNode& pong = At(*loaded, u"Ping/Pong");
    EXPECT_EQ(CountRefusals(pong), 1u);
    pong.RemoveEntryByName(u"XMLParseErrors");
    EXPECT_EQ(DumpTree(*loaded), "Root:Root\n  Ping:Ping\n    Pong:Pong\n      V=2\n    V=1\n");
}

TEST_F(Include, OtherSpellingsOfAFileAreThatFile) {
    folder.MakeFolder("sub");
    for (const char* path : {"SELF.xml", "./self.xml", "sub/../self.xml", "sub\\..\\self.xml", "none/../self.xml",
                             "alias.xml", "sub/alias.xml", "sub//..//self.xml"}) {
        Write("self.xml", "<Inc><:Include>" + std::string(path) + "</:Include></Inc>");
        if (!folder.Exists("alias.xml")) {
            folder.MakeLink("self.xml", "alias.xml");
            folder.MakeLink("../self.xml", "sub/alias.xml");
        }
        auto loaded = MakeUnnamedRoot();
        EXPECT_EQ(loaded->LoadResourceFile(PathOf(u"self.xml"), false, nullptr), 0);
        EXPECT_EQ(CountRefusals(*loaded), 1u) << path;
        EXPECT_EQ(loaded->FindRaw(u"Inc"), nullptr) << path;
    }
}

TEST_F(Include, CopyOfAFileIsAnother) {
    Write("one.xml", "<One><:Include>two.xml</:Include></One>");
    Write("two.xml", "<One><V>1</V></One>");
    auto loaded = MakeUnnamedRoot();
    EXPECT_EQ(LoadFile(*loaded, u"one.xml"), "\nOne:One\n  One:One\n    V=1\n");
}

TEST_F(Include, AsksForTheIdentityOfEachFileTwiceHoweverDeep) {
    constexpr int levels = 10;
    for (int i = 0; i < levels; ++i) {
        Write("f" + std::to_string(i) + ".xml", "<F><:Include>f" + std::to_string(i + 1) + ".xml</:Include></F>");
    }
    Write("f10.xml", "<F><V>reached</V></F>");
    auto loaded = MakeUnnamedRoot();
    EXPECT_EQ(loaded->LoadResourceFile(PathOf(u"f0.xml"), false, nullptr), 0);
    // Once for each of the ten as what is to be included, once for each that includes.
    EXPECT_EQ(files.Count(FileCall::ReadIdentity), 20u);
}

// File n includes file n + 1; the last one holds a value.
TEST_F(Include, NestsTwoHundredAndFiftySixLevelsDeep) {
    for (const int levels : {255, 256, 257, 300}) {
        for (int i = 0; i < levels; ++i) {
            Write("f" + std::to_string(i) + ".xml", "<F" + std::to_string(i) + "><:Include>f" + std::to_string(i + 1) +
                                                        ".xml</:Include></F" + std::to_string(i) + ">");
        }
        const std::string last = std::to_string(levels);
        Write("f" + last + ".xml", "<F" + last + "><V>reached</V></F" + last + ">");
        auto loaded = MakeUnnamedRoot();
        EXPECT_EQ(loaded->LoadResourceFile(PathOf(u"f0.xml"), false, nullptr), 0);
        ResTreeNode* node = loaded.get();
        int depth = 0;
        while (const NodeEntry* entry = node->FindRaw(Wide("F" + std::to_string(depth + 1)).View())) {
            node = entry->Child();
            ++depth;
        }
        EXPECT_EQ(depth, levels <= 256 ? levels : 256);
        EXPECT_EQ(node->FindRaw(u"V") != nullptr, levels <= 256);
        EXPECT_EQ(CountRefusals(*node), levels <= 256 ? 0u : 1u);
        EXPECT_EQ(files.OpenFiles(), 0);
    }
}

TEST_F(Include, GrowingCyclesEnd) {
    // Each level includes two files of the cycle; only those that are not open are read.
    Write("a.xml", "<A><:Include>b.xml</:Include><:Include>c.xml</:Include></A>");
    Write("b.xml", "<B><:Include>a.xml</:Include><:Include>c.xml</:Include></B>");
    Write("c.xml", "<C><:Include>a.xml</:Include><:Include>b.xml</:Include></C>");
    auto loaded = MakeUnnamedRoot();
    EXPECT_EQ(loaded->LoadResourceFile(PathOf(u"a.xml"), false, nullptr), 0);
    EXPECT_EQ(CountRefusals(At(*loaded, u"B")), 1u);
    EXPECT_EQ(CountRefusals(At(*loaded, u"B/C")), 2u);
    EXPECT_EQ(CountRefusals(At(*loaded, u"C")), 1u);
    EXPECT_EQ(CountRefusals(At(*loaded, u"C/B")), 2u);
}

TEST_F(Include, WorksBehindAnElementOfAnyKind) {
    Write("inc.xml", "<Inc name='i'><V type='xml'><a/></V></Inc>");
    EXPECT_EQ(Read("<R><S type='xml'><b/></S><:Include>inc.xml</:Include><T>1</T><:Link name='l'>i</:Link><X "
                   "names='p,q'/><:Include what='children'>inc.xml</:Include></R>"),
              R"(
R:R
  i:Inc
    V=<a></a>
  l->../i
  p:X
  q:X
  S=<b></b>
  T=1
  V=<a></a>
)");
}

}  // namespace
}  // namespace zkhw
