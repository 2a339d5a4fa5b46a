// Nodes that begin as copies of others.

#include <string>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"

namespace zkhw {
namespace {

TEST(Prototype, IsCopiedDeeply) {
    ASSERT_TREE(
        "<R><P><V>1</V><L localize='1'>eng=a</L><C name='c' ordered='1'><V>2</V><V>3</V></C></P><Q name='q' "
        "prototype='P'/></R>",
        R"(
R:R
  P:P
    c:C ordered
      V=2
      V=3
    L~a{0000}eng=a
    V=1
  q:Q
    c:C ordered
      V=2
      V=3
    L~a{0000}eng=a
    V=1
)");
}

TEST(Prototype, KeepsTheTypeNameAndOrderOfTheElement) {
    ASSERT_TREE("<R><PList name='p'><V>2</V><U>1</U></PList><Q prototype='p'/><QList prototype='p'/></R>", R"(
R:R
  p:PList ordered
    V=2
    U=1
  Q:Q
    U=1
    V=2
  QList:QList ordered
    V=2
    U=1
)");
}

TEST(Prototype, IsOverriddenByTheElementsOwnChildren) {
    ASSERT_TREE("<R><P><V>1</V><U>1</U><C><X>1</X></C></P><Q prototype='P'><V>2</V><W>2</W><C><Y>2</Y></C></Q></R>", R"(
R:R
  P:P
    C:C
      X=1
    U=1
    V=1
  Q:Q
    C:C
      X=1
      Y=2
    U=1
    V=2
    W=2
)");
}

TEST(Prototype, OverwritesTheTextsThatAreThere) {
    ASSERT_TREE("<R><P><V>1</V><U>1</U></P><Q><V>0</V><W>0</W></Q><Q prototype='P'><U>2</U></Q></R>", R"(
R:R
  P:P
    U=1
    V=1
  Q:Q
    U=2
    V=1
    W=0
)");
}

TEST(Prototype, UnderReplaceWinsOverTheElementsOwnTexts) {
    ASSERT_TREE(
        "<R><P><V>1</V><C><X>1</X></C></P><Q><W>0</W></Q><Q prototype='P' replace='1'><V>2</V><C><Y>2</Y></C></Q></R>",
        R"(
R:R
  P:P
    C:C
      X=1
    V=1
  Q:Q
    C:C
      Y=2
    V=1
)");
}

TEST(Prototype, GivesWayByEntryInAnOrderedNode) {
    ASSERT_TREE("<R><P><V>1</V><U>1</U></P><QList prototype='P'><V>2</V></QList></R>", R"(
R:R
  P:P
    U=1
    V=1
  QList:QList ordered
    U=1
    V=1
    V=2
)");
}

TEST(Prototype, ThatIsNotFoundIsReportedAndTheElementReadAsUsual) {
    auto root = MakeUnnamedRoot();
    ASSERT_EQ(root->LoadResourceText(u"<R>\n<Q prototype=\"nope\"/>\n</R>", false, nullptr), 0);
    EXPECT_EQ(Errors(*root),
              "Error on line 2 at column 21\n"
              "   Unable to find prototype node: nope\n"
              "   <R>\n<Q prototype=\"nope\"/>\n</R>\n");
    EXPECT_EQ(DumpTree(At(*root, u"Q")), "Q:Q\n");
}

TEST(Prototype, ReportsStandInTheNodeThatHoldsTheElement) {
    auto root = MakeUnnamedRoot();
    ASSERT_EQ(
        root->LoadResourceText(u"<R><A>\n<Q prototype='x'><V>1</V></Q>\n<Q prototype='y'/></A></R>", false, nullptr),
        0);
    EXPECT_EQ(Errors(*root), "(none)");
    EXPECT_EQ(Errors(At(*root, u"A")),
              // The start tag of V is where the element turns out to have content.
              "Error on line 2 at column 17\n"
              "   Unable to find prototype node: x\n"
              "   <R><A>\n<Q prototype='x'><V>1</V></Q>\n<Q prototype='y'/></A></R>\n"
              "Error on line 3 at column 18\n"
              "   Unable to find prototype node: y\n"
              "   \n<Q prototype='x'><V>1</V></Q>\n<Q prototype='y'/></A></R>\n");
    EXPECT_EQ(DumpTree(At(*root, u"A/Q")), "Q:Q\n  V=1\n");
}

TEST(Prototype, MustHaveBeenReadBefore) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><Q prototype='P'/><P><V>1</V></P></R>");
    EXPECT_EQ(DumpTree(At(*root, u"Q")), "Q:Q\n");
    EXPECT_NE(Errors(*root), "(none)");
}

TEST(Prototype, PathThroughAValueLeadsNowhere) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><P>text</P><Q prototype='P'/></R>");
    EXPECT_EQ(DumpTree(At(*root, u"Q")), "Q:Q\n");
    EXPECT_NE(Errors(*root), "(none)");
}

TEST(Prototype, IsFoundFromTheParentTheRootOrTheDocumentElement) {
    auto root = MakeRoot();
    LoadChild(*root, "<P><V>of the root</V></P>");
    EXPECT_EQ(
        LoadChild(*root,
                  "<D name='d'><P><V>of the document</V></P><A><P><V>beside</V></P>"
                  "<Q1 prototype='P'/><Q2 prototype='/P'/><Q3 prototype='#{document-root}/P'/><Q4 prototype='../P'/>"
                  "<Q5 prototype='../../d/A/P'/></A></D>"),
        R"(
Root:Root
  d:D
    A:A
      P:P
        V=beside
      Q1:Q1
        V=beside
      Q2:Q2
        V=of the root
      Q3:Q3
        V=of the document
      Q4:Q4
        V=of the document
      Q5:Q5
        V=beside
    P:P
      V=of the document
  P:P
    V=of the root
)");
}

TEST(Prototype, IsFoundThroughALink) {
    ASSERT_TREE("<R><A><P><V>1</V></P><:Link name='l'>P</:Link><Q prototype='l'/></A></R>", R"(
R:R
  A:A
    l->P
    P:P
      V=1
    Q:Q
      V=1
)");
}

TEST(Prototype, EscapedSlashBelongsToAName) {
    ASSERT_TREE("<R><P name='a/b'><V>1</V></P><Q prototype='a\\/b'/></R>", R"(
R:R
  a/b:P
    V=1
  Q:Q
    V=1
)");
}

TEST(Prototype, PathIsNotExpanded) {
    // An anchor of another name leaves the node as it is, and the rest is a path from there.
    ASSERT_TREE("<R K='nowhere'><P><V>1</V></P><Q prototype='#{K}/P'/></R>", R"(
R:R
  P:P
    V=1
  Q:Q
    V=1
)");
}

// --- Parameters ---

TEST(Prototype, ParametersOfTheElementAreFilledIn) {
    ASSERT_TREE(
        "<R><P><V>#{K}</V><C><D><V>#{ K }</V></D></C><C localize='1'>eng=#{K}</C></P><Q prototype='P' K='k'/></R>", R"(
R:R
  P:P
    C:C
      D:D
        V=#{K}
    V=#{K}
  Q:Q
    C:C
      D:D
        V=k
    V=k
)");
}

TEST(Prototype, OutermostParameterWins) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><P><V>#{K} #{L}</V></P></R>");
    EXPECT_EQ(Load(*root, "<R K='out'><A><Q prototype='/P' K='in' L='in'/></A></R>"), R"(
R:R
  A:A
    Q:Q
      V=out in
  P:P
    V=#{K} #{L}
)");
}

TEST(Prototype, ParametersReachWhatTheNodeHeldBefore) {
    ASSERT_TREE("<R><P name='p'/><Q name='q'><V>#{K}</V></Q><Q name='q' prototype='p' K='k'/></R>", R"(
R:R
  p:P
  q:Q
    V=k
)");
}

TEST(Prototype, NamesOfTheElementsAreNotFilledIn) {
    ASSERT_TREE("<R><P><V>#{name} #{prototype}</V></P><Q name='q' prototype='P'/></R>", R"(
R:R
  P:P
    V=#{name} #{prototype}
  q:Q
    V=#{name} P
)");
}

TEST(Prototype, DocumentRootIsThePathOfTheDocumentElement) {
    auto root = MakeRoot();
    LoadChild(*root, "<P name='p'/>");
    At(*root, u"p").SetProperty(u"V", u"#{document-root}");
    LoadChild(*root, "<D><Q prototype='/p'/></D>");
    EXPECT_EQ(TextAt(At(*root, u"D/Q"), u"V"), "/D");
}

TEST(Prototype, ThereIsNoDocumentRootYetForTheDocumentElementItself) {
    auto root = MakeRoot();
    LoadChild(*root, "<P name='p'/>");
    At(*root, u"p").SetProperty(u"V", u"#{ document-root } #{K}");
    LoadChild(*root, "<Q prototype='p' K='k'/>");
    EXPECT_EQ(TextAt(At(*root, u"Q"), u"V"), "#{document-root} k");
}

// --- Links ---

TEST(Prototype, LinksAreReexpressedFromTheCopy) {
    ASSERT_TREE(
        "<R><T name='t'/><P name='p'><I name='i'/><:Link name='in'>i</:Link><:Link name='out'>../t</:Link></P><A><Q "
        "name='q' prototype='../p'/></A></R>",
        R"(
R:R
  A:A
    q:Q
      i:I
      in->../../p/i
      out->../../p/..\/t
  p:P
    i:I
    in->i
    out->../t
  t:T
)");
}

// --- Copies of what contains the copy ---

TEST(Prototype, EmptyPathIsTheParentItself) {
    ASSERT_TREE("<R><A><V>1</V><C name='c'><W>2</W></C><Q prototype=''/></A></R>", R"(
R:R
  A:A
    c:C
      W=2
    Q:Q
      c:C
        W=2
      V=1
    V=1
)");
}

TEST(Prototype, NodeAboveIsCopiedWithoutTheCopy) {
    ASSERT_TREE("<R><B><V>1</V><A><U>2</U><Q prototype='..'/></A></B></R>", R"(
R:R
  B:B
    A:A
      Q:Q
        A:A
          U=2
        V=1
      U=2
    V=1
)");
}

TEST(Prototype, NodeItselfChangesNothing) {
    ASSERT_TREE("<R><Q name='q'><V>1</V><C name='c'><W>2</W></C></Q><Q name='q' prototype='q'/></R>", R"(
R:R
  q:Q
    c:C
      W=2
    V=1
)");
}

TEST(Prototype, ThatGivesWayToTheElementIsStillCopied) {
    ASSERT_TREE("<R><P name='q'><V>1</V><C name='c'><W>2</W></C></P><Q name='q' prototype='q'/></R>", R"(
R:R
  q:Q
    c:C
      W=2
    V=1
)");
    ASSERT_TREE("<R><P name='q'><V>1</V><C name='c'><W>2</W></C></P><Q name='q' prototype='q/c'/></R>", R"(
R:R
  q:Q
    W=2
)");
    ASSERT_TREE("<R><Q name='q'><V>1</V></Q><Q name='q' prototype='q' replace='1'><U>2</U></Q></R>", R"(
R:R
  q:Q
    U=2
    V=1
)");
}

TEST(Prototype, CopiesOfCopiesDouble) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<RList><A/><B prototype=''/><C prototype=''/><D prototype=''/></RList>");
    // A; B with A; C with A and B; D with A, B and C.
    EXPECT_EQ("\n" + DumpTree(*root), R"(
RList:RList ordered
  A=
  B:B
    A=
  C:C
    A=
    B:B
      A=
  D:D
    A=
    B:B
      A=
    C:C
      A=
      B:B
        A=
)");
}

// --- Stubs ---

class PrototypeOfAStub : public ResourceFiles {};

TEST_F(PrototypeOfAStub, IsCopiedAsItStandsAndTheCopyLoads) {
    Write("board.xml", "<Board name='other'><V>#{K}</V><C><W>1</W></C></Board>");
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><S name='s'><U>1</U></S></R>");
    At(*root, u"s").SetProperty(u":DeferredLoadPath", u"board.xml");
    EXPECT_EQ(Load(*root, "<R><Q name='q' prototype='s' K='k'/></R>"), R"(
R:R
  q:Q
    C:C
      W=1
    U=1
    V=k
  s:S
    :DeferredLoadPath=board.xml
    U=1
)");
}

TEST_F(PrototypeOfAStub, IsExpandedBesideWhatIsLoaded) {
    // Values that were put in are not expanded again: not in what was copied, nor in what the copy loaded.
    Write("board.xml", "<Board><V>#{K}#{L}</V></Board>");
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><P name='p'><A>#{K}</A><S name='s'><U>#{K}</U></S><Z>#{K}</Z></P></R>");
    At(*root, u"p/s").SetProperty(u":DeferredLoadPath", u"board.xml");
    Load(*root, "<R><Q name='q' prototype='p' K='#{L}' L='l'/></R>");
    EXPECT_EQ("\n" + DumpTree(At(*root, u"q")), R"(
q:Q
  A=#{L}
  s:S
    U=#{L}
    V=#{L}l
  Z=#{L}
)");
}

TEST_F(PrototypeOfAStub, InsideItIsLoadedToBeFound) {
    Write("board.xml", "<Board><P><V>1</V></P></Board>");
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><S name='s'/></R>");
    At(*root, u"s").SetProperty(u":DeferredLoadPath", u"board.xml");
    EXPECT_EQ(Load(*root, "<R><Q name='q' prototype='s/P'/></R>"), R"(
R:R
  q:Q
    V=1
  s:S
    P:P
      V=1
)");
}

}  // namespace
}  // namespace zkhw
