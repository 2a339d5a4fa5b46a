// Elements of type "xml": their content is kept as text, as a flat row of empty tags. What is nested deeper ends the
// value early, and then frames end one level too soon.

#include <string>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"

namespace zkhw {
namespace {

TEST(XmlValue, HoldsTheTagsOfItsChildren) {
    ASSERT_TREE("<R><V type='xml'><a x='1'/><b/></V></R>", R"(
R:R
  V=<a x="1"></a><b></b>
)");
}

TEST(XmlValue, TextInsideIsGone) {
    ASSERT_TREE("<R><V type='xml'>s<a>t</a>u<b>v<![CDATA[w]]></b>x</V></R>", R"(
R:R
  V=<a></a><b></b>
)");
}

TEST(XmlValue, WordIsComparedByTheLanguage) {
    ASSERT_TREE("<R><V TYPE='XML'><a/></V><W type='x&#173;ml'><b/></W></R>", R"(
R:R
  V=<a></a>
  W=<b></b>
)");
}

// Windows has an order of its own outside printable ASCII: docs/platforms.md lists where it differs.
TEST(XmlValue, WidthOfTheWordDoesNotCountAsOnlyLinuxOrdersSo) {
    ASSERT_TREE("<R><W type='\xEF\xBD\x98\xEF\xBD\x8D\xEF\xBD\x8C'><b/></W></R>", R"(
R:R
  W=<b></b>
)");
}

TEST(XmlValue, AttributesComeInTheOrderOfTheirNames) {
    ASSERT_TREE("<R><V type='xml'><a z='1' B='2' y='3' a='4'/></V></R>", R"(
R:R
  V=<a a="4" B="2" y="3" z="1"></a>
)");
}

TEST(XmlValue, OfAttributesThatDifferOnlyInCaseTheFirstStays) {
    ASSERT_TREE("<R><V type='xml'><a B='1' b='2' A='3' a='4'/></V></R>", R"(
R:R
  V=<a A="3" B="1"></a>
)");
}

TEST(XmlValue, NothingIsEscaped) {
    ASSERT_TREE("<R><V type='xml'><a x='&lt;&quot;&amp;&#10;'/></V></R>", R"(
R:R
  V=<a x="<"&{000A}"></a>
)");
}

TEST(XmlValue, KeywordsInsideMeanNothing) {
    ASSERT_TREE(
        "<R><V type='xml'><a name='n' names='p,q' prototype='x'/><:Link "
        "name='l'>..</:Link><:Include>f</:Include></V><W>1</W></R>",
        R"(
R:R
  V=<a name="n" names="p,q" prototype="x"></a><:Link name="l"></:Link><:Include></:Include>
  W=1
)");
}

TEST(XmlValue, ParametersInsideStay) {
    ASSERT_TREE("<R K='k'><V type='xml'><a x='#{K}'/></V></R>", R"(
R:R
  V=<a x="#{K}"></a>
)");
}

// The copies of a prototype are expanded, and there it is text like any other.
TEST(XmlValue, ParametersInsideAreReplacedInACopy) {
    ASSERT_TREE("<R><P><V type='xml'><a x='#{K}'/></V></P><Q prototype='P' K='k'/></R>", R"(
R:R
  P:P
    V=<a x="#{K}"></a>
  Q:Q
    V=<a x="k"></a>
)");
}

TEST(XmlValue, BearsTheNameOfTheNodeThatItWouldBe) {
    ASSERT_TREE("<R><V type='xml' name='n'><a/></V><W type='xml' names='p,q'><b/></W></R>", R"(
R:R
  n=<a></a>
  p=<b></b>
)");
}

TEST(XmlValue, WithNamesIsNotReplicatedAndGoesOnToItsEnd) {
    ASSERT_TREE("<R><W type='xml' names='p,q'><b/><c/><d/></W><X>1</X></R>", R"(
R:R
  p=<b></b><c></c><d></d>
  X=1
)");
    ASSERT_TREE("<RList><p><V>1</V></p><W type='xml' names='p,q'><b/><c/></W><X>1</X></RList>", R"(
RList:RList ordered
  p:p
    V=1
  p=<b></b><c></c>
  X=1
)");
}

TEST(XmlValue, WithNamesThatYieldNothingBearsItsName) {
    ASSERT_TREE("<R><W type='xml' names='P[2..1]' name='n'><b/></W></R>", R"(
R:R
  n=<b></b>
)");
}

TEST(XmlValue, ElementWithoutAnyContentIsAPlainValueUnlessItHasAName) {
    ASSERT_TREE("<R><V type='xml'/><W type='xml'> x </W></R>", R"(
R:R
  V=
  W=x
)");
}

TEST(XmlValue, WithoutContentIsEmptyAndComplete) {
    ASSERT_TREE("<R><V type='xml' name='v'/><W>1</W><V type='xml' name='u'>text</V><C name='c'><X>2</X></C></R>", R"(
R:R
  c:C
    X=2
  u=
  v=
  W=1
)");
}

TEST(XmlValue, WithoutContentInAContainerLeavesTheFramesAlone) {
    ASSERT_TREE("<R><A><V type='xml' name='v'/><W>1</W></A><X>2</X></R>", R"(
R:R
  A:A
    v=
    W=1
  X=2
)");
}

TEST(XmlValue, SecondLevelLosesItsStartTagAndItsEndTagEndsTheValue) {
    // </b> is the end tag that is kept, </a> ends the value, and </V> ends the frame of A.
    ASSERT_TREE("<R><A><V type='xml'><a><b/></a></V><W>1</W></A><X>2</X></R>", R"(
R:R
  A:A
    V=<a></b>
  W=1
  X=2
)");
}

TEST(XmlValue, EarlyEndInTheRootEndsNoFrame) {
    ASSERT_TREE("<R><V type='xml'><a><b/></a></V><W>1</W></R>", R"(
R:R
  V=<a></b>
  W=1
)");
}

TEST(XmlValue, ChildrenBehindTheSecondLevelAreTagsWithoutAnEnd) {
    // <b/> leaves the depth at 1, so <c/> opens depth 2 and its end tag closes it; </a> then ends the value.
    ASSERT_TREE("<R><A><V type='xml'><a><b/><c y='1'/></a></V></A><X>2</X></R>", R"(
R:R
  A:A
    V=<a></b><c y="1"></c>
  X=2
)");
}

TEST(XmlValue, SiblingsBehindAnEarlyEndAreReadAsElements) {
    // </a> ends the value, so <d> and <e> are read as elements of A; </V> ends A's frame.
    ASSERT_TREE("<R><A><V type='xml'><a><b/></a><d>1</d><e name='n'/></V><W>1</W></A><X>2</X></R>", R"(
R:R
  A:A
    d=1
    n:e
    V=<a></b>
  W=1
  X=2
)");
}

TEST(XmlValue, ThirdLevelIsATagAgain) {
    // <b> is lost while <a> is written; then nothing is pending, so <c> is parked and written at its end tag:
    // depth 3, </c>, depth 2; </b>, depth 1; </a> ends the value; </V> ends the frame of A.
    ASSERT_TREE("<R><A><V type='xml'><a><b><c/></b></a></V></A><X>2</X></R>", R"(
R:R
  A:A
    V=<a><c></c></b>
  X=2
)");
}

TEST(XmlValue, FourthLevelLosesItsStartTag) {
    // <a>, lost <b>, <c>, lost <d>: </d> at depth 3, </c> at depth 2, </b> ends the value. </a> ends the frame of A and
    // </V> none, since that of the root stays; W is in the root as well.
    ASSERT_TREE("<R><A><V type='xml'><a><b><c><d/></c></b></a></V><W>1</W></A><X>2</X></R>", R"(
R:R
  A:A
    V=<a><c></d></c>
  W=1
  X=2
)");
}

TEST(XmlValue, TextBehindAnEarlyEndIsDropped) {
    ASSERT_TREE("<R><A><V type='xml'><a><b/></a>text</V>more<W>1</W></A></R>", R"(
R:R
  A:A
    V=<a></b>
  W=1
)");
}

TEST(XmlValue, SecondValueOfTheNameAppendsToTheFirst) {
    ASSERT_TREE("<R><V type='xml'><a/></V><V type='xml'><b/></V></R>", R"(
R:R
  V=<a></a><b></b>
)");
    ASSERT_TREE("<R><V>text</V><V type='xml'><b/></V></R>", R"(
R:R
  V=text<b></b>
)");
}

TEST(XmlValue, ReplaceDoesNotKeepItFromAppending) {
    ASSERT_TREE("<R replace='1'><V>text</V><V type='xml'><b/></V></R>", R"(
R:R
  V=text<b></b>
)");
}

TEST(XmlValue, EmptyOneLeavesTheValueThatIsThere) {
    ASSERT_TREE("<R><V>text</V><X type='xml' name='V'/></R>", R"(
R:R
  V=text
)");
}

TEST(XmlValue, AppendsToALocalizedValueBehindItsList) {
    ASSERT_TREE("<R><V localize='1'>eng=A</V><V type='xml'><b/></V></R>", R"(
R:R
  V~A{0000}eng=A<b></b>
)");
}

TEST(XmlValue, StandsBesideTheFirstInAnOrderedNode) {
    ASSERT_TREE("<RList><V type='xml'><a/></V><V type='xml'><b/></V></RList>", R"(
RList:RList ordered
  V=<a></a>
  V=<b></b>
)");
}

TEST(XmlValue, OnAChildOfThatNameItIsLostAndEndsTooEarly) {
    // The tag of <a> finds no text; its end tag ends the value, so </V> ends the frame of A.
    ASSERT_TREE("<R><A><V><U>1</U></V><V type='xml'><a/></V><W>1</W></A><X>2</X></R>", R"(
R:R
  A:A
    V:V
      U=1
  W=1
  X=2
)");
}

TEST(XmlValue, OnALinkOfThatNameItIsLostAndEndsTooEarly) {
    ASSERT_TREE("<R><A><T name='t'/><:Link name='V'>t</:Link><V type='xml'><a/></V><W>1</W></A></R>", R"(
R:R
  A:A
    t:T
    V->t
  W=1
)");
}

TEST(XmlValue, PrototypeOnItIsNotLookedUp) {
    ASSERT_TREE("<R><V type='xml' prototype='nowhere'><a/></V><W type='xml' prototype='nowhere'/></R>", R"(
R:R
  V=<a></a>
  W=
)");
}

TEST(XmlValue, AsDocumentElementOfAChildLoadLandsInTheNode) {
    ASSERT_CHILD_TREE("<V type='xml'><a x='1'/><b/></V>", R"(
Root:Root
  V=<a x="1"></a><b></b>
)");
}

TEST(XmlValue, EarlyEndAsDocumentElementPopsTheLastFrame) {
    auto root = MakeRoot();
    LoadChild(*root, "<C name='c'><U>1</U></C>");
    ResTreeNode* node = root.get();
    // </a> ends the value, </V> pops the only frame; there is nothing behind it but the end.
    ASSERT_EQ(At(*root, u"c").LoadResourceText(Wide("<V type='xml'><a><b/></a></V>"), true, &node), 0);
    EXPECT_EQ(node, nullptr);
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  c:C
    U=1
    V=<a></b>
)");
}

TEST(XmlValue, EventsBehindTheLastFrameAreIgnored) {
    auto root = MakeRoot();
    LoadChild(*root, "<C name='c'/>");
    // </b> ends the value, </a> pops the only frame, and what follows meets none.
    ResTreeNode* node = root.get();
    ASSERT_EQ(At(*root, u"c")
                  .LoadResourceText(Wide("<V type='xml'><a><b><c><d/></c></b></a>text<W>1</W><:Link>..</:Link></V>"),
                                    true, &node),
              0);
    EXPECT_EQ(node, nullptr);
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  c:C
    V=<a><c></d></c>
)");
}

TEST(XmlValue, ManyTagsAreKept) {
    std::string tags;
    std::string expected;
    for (int i = 0; i < 100000; ++i) {
        tags += "<a/>";
        expected += "<a></a>";
    }
    auto root = MakeUnnamedRoot();
    ASSERT_EQ(root->LoadResourceText(Wide("<R><V type='xml'>" + tags + "</V></R>"), false, nullptr), 0);
    EXPECT_EQ(TextAt(*root, u"V"), expected);
}

}  // namespace
}  // namespace zkhw
