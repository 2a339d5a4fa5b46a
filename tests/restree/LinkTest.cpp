// ":Link" elements.

#include <string>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"

namespace zkhw {
namespace {

TEST(Link, HoldsAPathFromItsNode) {
    ASSERT_TREE("<R><T name='t'><U name='u'/></T><A><:Link name='x'>../t/u</:Link></A></R>", R"(
R:R
  A:A
    x->../t/u
  t:T
    u:U
)");
}

TEST(Link, WithoutANameTakesTheNameOfItsTarget) {
    ASSERT_TREE("<R><T name='t'/><A><:Link>../t</:Link></A></R>", R"(
R:R
  A:A
    t->../t
  t:T
)");
}

TEST(Link, NamedAsItsElementTakesTheNameOfItsTarget) {
    ASSERT_TREE("<R><T name='t'/><A><:Link name=':LINK'>../t</:Link></A></R>", R"(
R:R
  A:A
    t->../t
  t:T
)");
}

TEST(Link, ElementIsBlindToCase) {
    // The last letter of the second is the Kelvin sign, which folds to a K.
    ASSERT_TREE(
        "<R><T name='t'/><A><:LINK name='x'>../t</:LINK><:Lin\xE2\x84\xAA name='y'>../t</:Lin\xE2\x84\xAA></A></R>", R"(
R:R
  A:A
    x->../t
    y->../t
  t:T
)");
}

TEST(Link, TwoLevelsUpBeginsWithDots) {
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(
        Load(*root, "<R><T name='t'/><A><B><:Link name='x'>../../t</:Link><:Link name='y'>/A</:Link></B></A></R>"), R"(
R:R
  A:A
    B:B
      x->../../t
      y->..
  t:T
)");
    ResTreeNode& holder = At(*root, u"A/B");
    EXPECT_EQ(holder.ResolveEntry(holder.FindEntry(u"x")), &At(*root, u"t"));
    EXPECT_EQ(holder.ResolveEntry(holder.FindEntry(u"y")), &At(*root, u"A"));
}

TEST(Link, PathOfTheRootHasAnEmptyComponent) {
    ASSERT_TREE("<R><T name='t'/><:Link name='x'>t</:Link><A><:Link name='y'>/</:Link></A></R>", R"(
R:R
  A:A
    y->../
  t:T
  x->../t
)");
}

TEST(Link, ToItsOwnNodeIsEmpty) {
    ASSERT_TREE("<R><A><:Link name='x'>.</:Link></A></R>", R"(
R:R
  A:A
    x->
)");
}

TEST(Link, SlashesInNamesAreEscapedExceptInTheFirstComponentBelow) {
    ASSERT_TREE(
        "<R><A><T name='a/b'><U name='c/d'/></T><:Link name='x'>a\\/b</:Link><:Link "
        "name='y'>a\\/b/c\\/d</:Link></A><B><:Link name='z'>/A/a\\/b</:Link></B></R>",
        R"(
R:R
  A:A
    a/b:T
      c/d:U
    x->a/b
    y->a/b/c\/d
  B:B
    z->../A/a\/b
)");
}

TEST(Link, FollowsLinksToItsTarget) {
    ASSERT_TREE("<R><T name='t'><U name='u'/></T><A><:Link name='x'>../t</:Link><:Link name='y'>x/u</:Link></A></R>",
                R"(
R:R
  A:A
    x->../t
    y->../t/u
  t:T
    u:U
)");
}

TEST(Link, MayStartFromTheDocumentElement) {
    ASSERT_CHILD_TREE("<D><T name='t'/><A><:Link name='x'>#{document-root}/t</:Link></A></D>", R"(
Root:Root
  D:D
    A:A
      x->../t
    t:T
)");
}

TEST(Link, TextIsNotExpanded) {
    // An anchor of another name with nothing behind it is the node itself.
    ASSERT_TREE("<R K='t'><A><T name='t'/><:Link name='x'>#{K}</:Link><:Link name='y'>../A/#{K}</:Link></A></R>", R"(
R:R
  A:A
    :Link=UNRESOLVED LINK: ../A/#{K}
    t:T
    x->
)");
}

TEST(Link, TextIsTrimmed) {
    ASSERT_TREE(
        "<R><A><T name='t'/><:Link name='x'>\n t \n</:Link><:Link name='y' xml:space='preserve'> t</:Link></A></R>", R"(
R:R
  A:A
    :Link=UNRESOLVED LINK:  t
    t:T
    x->t
)");
}

TEST(Link, OfTypePathLosesItsSlashes) {
    ASSERT_TREE(
        "<R><A><T><U name='u'/></T><:Link name='x' type='path'>T/u</:Link><:Link name='y' "
        "type='ref-list'>T/u</:Link></A></R>",
        R"(
R:R
  A:A
    :Link=UNRESOLVED LINK: T\u
    T:T
      u:U
    y->T/u
)");
}

TEST(Link, LocalizeMeansNothing) {
    ASSERT_TREE("<R><A><T name='t'/><:Link name='x' localize='1'>t</:Link></A></R>", R"(
R:R
  A:A
    t:T
    x->t
)");
}

// --- No target ---

TEST(Link, WithoutATargetIsADeadText) {
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(Load(*root, "<R><:Link name='x'>nowhere</:Link></R>"), R"(
R:R
  :Link=UNRESOLVED LINK: nowhere
)");
    EXPECT_EQ(Errors(*root), "(none)");
}

TEST(Link, DeadTextBearsTheNameOfTheElementAsItStands) {
    ASSERT_TREE("<R><:LINK>nowhere</:LINK></R>", R"(
R:R
  :LINK=UNRESOLVED LINK: nowhere
)");
}

TEST(Link, FirstDeadTextOfAnUnorderedNodeStays) {
    ASSERT_TREE("<R><:Link>a</:Link><:Link>b</:Link><A><:Link>c</:Link></A></R>", R"(
R:R
  :Link=UNRESOLVED LINK: a
  A:A
    :Link=UNRESOLVED LINK: c
)");
}

TEST(Link, EachDeadTextOfAnOrderedNodeStands) {
    ASSERT_TREE("<RList><V>1</V><:Link>a</:Link><:Link next='V'>b</:Link></RList>", R"(
RList:RList ordered
  :Link=UNRESOLVED LINK: b
  V=1
  :Link=UNRESOLVED LINK: a
)");
}

TEST(Link, ToANodeFurtherDownStaysDead) {
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(Load(*root, "<R><:Link name='x'>t</:Link><T name='t'/></R>"), R"(
R:R
  :Link=UNRESOLVED LINK: t
  t:T
)");
    EXPECT_EQ(Load(*root, "<R><:Link name='x'>nowhere</:Link></R>"), R"(
R:R
  :Link=UNRESOLVED LINK: t
  t:T
)");
}

TEST(Link, ToAValueOrAboveTheRootIsDead) {
    ASSERT_TREE("<RList><V>1</V><:Link>V</:Link><:Link>..</:Link><:Link>V/x</:Link></RList>", R"(
RList:RList ordered
  V=1
  :Link=UNRESOLVED LINK: V
  :Link=UNRESOLVED LINK: ..
  :Link=UNRESOLVED LINK: V/x
)");
}

TEST(Link, WithoutTextLeadsToItsOwnNodeAndTakesItsName) {
    ASSERT_TREE("<R><A><:Link/></A></R>", R"(
R:R
  A:A
    A->
)");
}

// --- What is there already ---

TEST(Link, RepeatedInAnUnorderedNodeTheFirstStays) {
    ASSERT_TREE(
        "<R><A><T name='t'/><U name='u'/><:Link>t</:Link><:Link name='x'>t</:Link><:Link name='x'>u</:Link></A></R>",
        R"(
R:R
  A:A
    t:T
    u:U
    x->t
)");
    ASSERT_TREE("<R><T name='t'/><A><:Link>../t</:Link><:Link>../t</:Link></A></R>", R"(
R:R
  A:A
    t->../t
  t:T
)");
}

TEST(Link, RepeatedInAnOrderedNodeEachStands) {
    ASSERT_TREE("<R><AList><T name='t'/><:Link name='x'>t</:Link><:Link name='x'>t</:Link></AList></R>", R"(
R:R
  AList:AList ordered
    t:T
    x->t
    x->t
)");
}

TEST(Link, OnATextOfItsNameAssignsThePath) {
    ASSERT_TREE(
        "<R><A><T name='t'/><x>1</x><y localize='1'>eng=e</y><:Link name='x'>t</:Link><:Link "
        "name='y'>t</:Link></A></R>",
        R"(
R:R
  A:A
    t:T
    x=t
    y~t
)");
}

TEST(Link, OnATextOfItsNameUnderReplaceChangesNothing) {
    ASSERT_TREE("<R replace='1'><A><T name='t'/><x>1</x><:Link name='x'>t</:Link></A></R>", R"(
R:R
  A:A
    t:T
    x=1
)");
}

TEST(Link, OnAChildOfItsNameChangesNothing) {
    ASSERT_TREE("<R><A><T name='t'/><C name='x'/><:Link name='x'>t</:Link></A></R>", R"(
R:R
  A:A
    t:T
    x:C
)");
}

// --- Children inside ---

TEST(Link, WithNameAndChildrenEndsTheFrameOfItsParent) {
    ASSERT_TREE("<R><A><T name='t'/><:Link name='l'>t<B/></:Link><W>1</W></A><X>2</X></R>", R"(
R:R
  A:A
    l->t
    t:T
  W=1
  X=2
)");
}

TEST(Link, WithNameAndTwoChildrenReadsTheSecond) {
    // <B/> is dropped; <C/> is an element of A, and </:Link> ends the frame of A.
    ASSERT_TREE("<R><A><T name='t'/><:Link name='l'>t<B/><C>3</C></:Link><W>1</W></A></R>", R"(
R:R
  A:A
    C=3
    l->t
    t:T
  W=1
)");
}

TEST(Link, WithNameAndNestedChildrenEndsTwoFrames) {
    // Inside <B> the position is the link, which holds no text, so <C/> is lost; its end tag ends that, </B> ends the
    // frame of D and </:Link> the frame of A.
    ASSERT_TREE("<R><A><D><T name='t'/><:Link name='l'>t<B><C/></B></:Link><W>1</W></D><X>2</X></A><Y>3</Y></R>", R"(
R:R
  A:A
    D:D
      l->t
      t:T
  W=1
  X=2
  Y=3
)");
}

TEST(Link, DeadTextTakesTheTagOfANestedChild) {
    ASSERT_TREE("<R><A><:Link name='l'>zz<B><C x='1'/></B></:Link><W>1</W></A><X>2</X></R>", R"(
R:R
  A:A
    :Link=UNRESOLVED LINK: zz<C x="1">
  W=1
  X=2
)");
}

TEST(Link, EarlyEndInADocumentElementBringsItBack) {
    // The name of the document element is still pending in the bottom frame: the next start tag makes it a child.
    auto root = MakeRoot();
    LoadChild(*root, "<C name='c'/>");
    ResTreeNode* node = nullptr;
    ASSERT_EQ(At(*root, u"c").LoadResourceText(u"<D K='k'><:Link name='l'>.<B/></:Link><W>#{K}</W></D>", false, &node),
              0);
    EXPECT_EQ(node, &At(*root, u"c"));
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  c:C
    D:D
      W=k
    l->
)");
}

TEST(Link, EarlyEndInADocumentElementWithoutFurtherTagsMakesItAValue) {
    auto root = MakeRoot();
    LoadChild(*root, "<C name='c'/>");
    ASSERT_EQ(At(*root, u"c").LoadResourceText(u"<D><:Link name='l'>.<B/></:Link> text </D>", false, nullptr), 0);
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  c:C
    D=text
    l->
)");
}

TEST(Link, EarlyEndInADocumentElementWithANameMakesItAChildOfThatName) {
    auto root = MakeRoot();
    LoadChild(*root, "<C name='c'/>");
    ASSERT_EQ(At(*root, u"c")
                  .LoadResourceText(u"<D name='d' ordered='1'><:Link name='l'>.<B/></:Link> text </D>", false, nullptr),
              0);
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  c:C
    d:D ordered
    l->
)");
}

TEST(Link, EarlyEndInAChildDocumentLeavesItsRootKnown) {
    auto root = MakeRoot();
    LoadChild(*root, "<C name='c'/>");
    ResTreeNode* node = nullptr;
    ASSERT_EQ(
        At(*root, u"c")
            .LoadResourceText(u"<D><:Link name='l'>.<B/></:Link><W>1</W><V>#{document-root}</V></D>", true, &node),
        0);
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  c:C
    D:D
      l->
    V=/c/D
    W=1
)");
    EXPECT_EQ(node, &At(*root, u"c/D"));
}

}  // namespace
}  // namespace zkhw
