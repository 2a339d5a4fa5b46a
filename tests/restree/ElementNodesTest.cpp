// Which elements become nodes, under which name, and how they meet what is there already.

#include <string>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"
#include "support/ChangeLog.h"

namespace zkhw {
namespace {

// --- Node or value ---

TEST(ElementNodes, EmptyElementInADocumentElementIsAValue) {
    ASSERT_TREE("<A><B/></A>", R"(
A:A
  B=
)");
}

TEST(ElementNodes, ElementWithTextAloneIsAValue) {
    ASSERT_TREE("<R><Speed>40</Speed></R>", R"(
R:R
  Speed=40
)");
}

TEST(ElementNodes, NameMakesANodeOfTheElementsType) {
    ASSERT_TREE("<R><Clock name='A'/></R>", R"(
R:R
  A:Clock
)");
}

TEST(ElementNodes, ChildElementMakesANodeNamedAsItsElement) {
    ASSERT_TREE("<R><Clock><Speed>40</Speed></Clock></R>", R"(
R:R
  Clock:Clock
    Speed=40
)");
}

TEST(ElementNodes, PrototypeMakesANode) {
    ASSERT_TREE("<R><P><V>1</V></P><Q prototype='P'/></R>", R"(
R:R
  P:P
    V=1
  Q:Q
    V=1
)");
}

TEST(ElementNodes, NamesWinsOverName) {
    ASSERT_TREE("<R><P names='a,b' name='c'/></R>", R"(
R:R
  a:P
  b:P
)");
}

TEST(ElementNodes, NameWinsOverPrototypeAndChildrenAsTheEntrysName) {
    ASSERT_TREE("<R><P><V>1</V></P><Q name='n' prototype='P'><W>2</W></Q></R>", R"(
R:R
  n:Q
    V=1
    W=2
  P:P
    V=1
)");
}

TEST(ElementNodes, EmptyNameIsAName) {
    ASSERT_TREE("<R><P name=''/></R>", R"(
R:R
  :P
)");
}

TEST(ElementNodes, LinkWithoutNameButWithChildrenIsANode) {
    ASSERT_TREE("<R><:Link><V>1</V></:Link></R>", R"(
R:R
  :Link::Link
    V=1
)");
}

TEST(ElementNodes, LinkWithNamesIsANode) {
    ASSERT_TREE("<R><:Link names='a,b'>x</:Link></R>", R"(
R:R
  a::Link
  b::Link
)");
}

TEST(ElementNodes, LinkWithPrototypeIsANode) {
    ASSERT_TREE("<R><P><V>1</V></P><:Link prototype='P'>x</:Link></R>", R"(
R:R
  :Link::Link
    V=1
  P:P
    V=1
)");
}

TEST(ElementNodes, IncludeWithNameIsAnEmptyNodeAndReadsNothing) {
    ASSERT_TREE("<R><:Include name='x'>p</:Include></R>", R"(
R:R
  x::Include
)");
}

TEST(ElementNodes, IncludeWithChildrenIsANode) {
    ASSERT_TREE("<R><:Include>p<V>1</V></:Include></R>", R"(
R:R
  :Include::Include
    V=1
)");
}

TEST(ElementNodes, TypeNeverSetsTheTypeOfANode) {
    ASSERT_TREE("<R><P name='a' type='Q'/><P name='b' type='path'/><P name='c' type='ref-list'/></R>", R"(
R:R
  a:P
  b:P
  c:P
)");
}

TEST(ElementNodes, UnknownAttributesAreNotStored) {
    ASSERT_TREE("<R Kind='k'><P name='a' Speed='40' what='children' localize='true'/></R>", R"(
R:R
  a:P
)");
}

TEST(ElementNodes, TextOfANodeIsDropped) {
    ASSERT_TREE("<R>t<C name='x'>text</C>u<D>v<E/>w</D>y</R>", R"(
R:R
  D:D
    E=
  x:C
)");
}

TEST(ElementNodes, TextBeforeTheFirstChildDoesNotReachThatChild) {
    ASSERT_TREE("<R>abc<E>x</E>def<F/></R>", R"(
R:R
  E=x
  F=
)");
}

TEST(ElementNodes, NamesOfElementsKeepTheirLetters) {
    ASSERT_TREE("<R><\xC3\x84rger name='\xE5\x90\x8D'><V\xC3\xA9>1</V\xC3\xA9></\xC3\x84rger></R>", R"(
R:R
  {540D}:{00C4}rger
    V{00E9}=1
)");
}

TEST(ElementNodes, ColonsInNamesMeanNothing) {
    ASSERT_TREE("<x:R xmlns:x='u'><x:P xmlns='v' name='a'/><a:b:c>1</a:b:c></x:R>", R"(
x:R:x:R
  a:x:P
  a:b:c=1
)");
}

// --- The document element ---

TEST(ElementNodes, DocumentElementGivesAnUnnamedNodeItsNameAndType) {
    ASSERT_TREE("<Board name='B1'><V>1</V></Board>", R"(
B1:Board
  V=1
)");
}

TEST(ElementNodes, DocumentElementGivesAnUntypedNodeItsName) {
    ResTreeNode root(u"old", u"", false);
    EXPECT_EQ(Load(root, "<Board name='B1'><V>1</V></Board>"), R"(
B1:Board
  V=1
)");
}

TEST(ElementNodes, DocumentElementGivesAnUnnamedNodeItsOrder) {
    ASSERT_TREE("<Board ordered='true'><V>2</V><U>1</U></Board>", R"(
Board:Board ordered
  V=2
  U=1
)");
}

TEST(ElementNodes, EmptyDocumentElementWithANameIsTheNode) {
    ASSERT_TREE("<Board name='B1'/>", R"(
B1:Board
)");
}

TEST(ElementNodes, NodeWithATypeKeepsNameTypeAndOrder) {
    auto root = MakeRoot();
    EXPECT_EQ(Load(*root, "<FooList name='x'><V>2</V><U>1</U></FooList>"), R"(
Root:Root
  U=1
  V=2
)");
}

TEST(ElementNodes, DocumentElementThatIsAValueLeavesTheNodeUnnamed) {
    ASSERT_TREE("<A>text</A>", R"(
:
  A=text
)");
}

TEST(ElementNodes, ValuesOfAnUntypedNodeStayWhenItGetsAType) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<B>2</B>");
    Load(*root, "<A>1</A>");
    EXPECT_EQ(Load(*root, "<RList><A>3</A></RList>"), R"(
RList:RList ordered
  A=1
  B=2
  A=3
)");
    auto same = MakeUnnamedRoot();
    Load(*same, "<B>2</B>");
    EXPECT_EQ(Load(*same, "<R><A>1</A></R>"), R"(
R:R
  A=1
  B=2
)");
}

TEST(ElementNodes, OfEqualKeysOfAnUntypedNodeTheFirstStaysWhenItsOrderGoes) {
    ResTreeNode root(u"", u"", true);
    for (int i = 200; i > 0; --i) {
        Load(root, "<V" + std::to_string(i % 100) + ">" + std::to_string(i) + "</V" + std::to_string(i % 100) + ">");
    }
    EXPECT_EQ(root.IsOrdered(), true);
    Load(root, "<R name='r'/>");
    EXPECT_EQ(root.IsOrdered(), false);
    int count = 0;
    for (EntryIterator entry = root.Begin(); !entry.IsEnd(); ++entry) {
        ++count;
    }
    EXPECT_EQ(count, 100);
    EXPECT_EQ(TextAt(root, u"V0"), "200");
    EXPECT_EQ(TextAt(root, u"V1"), "101");
    EXPECT_EQ(TextAt(root, u"V99"), "199");
}

TEST(ElementNodes, DocumentElementThatIsAValueLandsInANamedNode) {
    ASSERT_CHILD_TREE("<A>text</A>", R"(
Root:Root
  A=text
)");
}

TEST(ElementNodes, PrototypeHasNoEffectOnADocumentElement) {
    ASSERT_TREE("<R prototype='nowhere'><B/></R>", R"(
R:R
  B=
)");
    ASSERT_TREE("<R prototype='nowhere'/>", R"(
R:R
)");
}

TEST(ElementNodes, NamesOnADocumentElementGiveTheFirstNameAndNoCopies) {
    ASSERT_TREE("<R names='p,q'><V>#{name}</V></R>", R"(
p:R
  V=#{name}
)");
    ASSERT_TREE("<R names='p,q'/>", R"(
p:R
)");
}

TEST(ElementNodes, DocumentElementBecomesAChild) {
    ASSERT_CHILD_TREE("<A name='x'><V>1</V></A>", R"(
Root:Root
  x:A
    V=1
)");
}

TEST(ElementNodes, DocumentElementMergesIntoTheChildOfItsName) {
    auto root = MakeRoot();
    LoadChild(*root, "<A name='x'><V>1</V><U>1</U></A>");
    EXPECT_EQ(LoadChild(*root, "<A name='X'><V>2</V><W>2</W></A>"), R"(
Root:Root
  x:A
    U=1
    V=2
    W=2
)");
}

TEST(ElementNodes, NamesOnADocumentElementThatIsAChildGiveCopies) {
    ASSERT_CHILD_TREE("<A names='x,y'><V>#{name}</V></A>", R"(
Root:Root
  x:A
    V=x
  y:A
    V=y
)");
}

TEST(ElementNodes, DocumentElementThatIsAnXmlValueIsNoNode) {
    ASSERT_TREE("<V type='xml'><a/></V>", R"(
:
  V=<a></a>
)");
}

// --- Order ---

TEST(ElementNodes, AttributeNamesAreBlindToCase) {
    ASSERT_TREE("<R><A NAME='x' ORDERED='yes'/></R>", R"(
R:R
  x:A ordered
)");
}

TEST(ElementNodes, WordsThatAreTrue) {
    for (const char* word : {"true", "yes", "1", "on", "enable", "TRUE", "Yes", "oN", "ENABLE"}) {
        EXPECT_EQ(TreeOf("<R ordered='" + std::string(word) + "'><A/></R>"), "\nR:R ordered\n  A=\n") << word;
    }
}

TEST(ElementNodes, EverythingElseIsFalse) {
    for (const char* word :
         {"", "false", "no", "0", "off", "disable", "2", "y", "tru", "truee", " true", "true ", "1.0"}) {
        EXPECT_EQ(TreeOf("<RList ordered='" + std::string(word) + "'><A/></RList>"), "\nRList:RList\n  A=\n") << word;
    }
}

TEST(ElementNodes, UnitsThatDoNotCountLeaveAWordTrue) {
    for (const char* word : {"tr&#173;ue", "&#173;1", "enable&#173;"}) {
        EXPECT_EQ(TreeOf("<R ordered='" + std::string(word) + "'><A/></R>"), "\nR:R ordered\n  A=\n") << word;
    }
    for (const char* word : {"tr-ue", "'true", "true-"}) {
        EXPECT_EQ(TreeOf("<R ordered=\"" + std::string(word) + "\"><A/></R>"), "\nR:R\n  A=\n") << word;
    }
}

// Windows has an order of its own outside printable ASCII: docs/platforms.md lists where it differs.
TEST(ElementNodes, DeleteCharactersAndWidthLeaveAWordTrueAsOnlyLinuxOrdersSo) {
    for (const char* word :
         {"tr&#127;ue", "&#127;1", "enable&#127;", "\xEF\xBC\xB4\xEF\xBC\xB2\xEF\xBC\xB5\xEF\xBC\xA5"}) {
        EXPECT_EQ(TreeOf("<R ordered='" + std::string(word) + "'><A/></R>"), "\nR:R ordered\n  A=\n") << word;
    }
}

TEST(ElementNodes, NamesBesideTheKnownOnesMeanNothing) {
    for (const char* name : {"nam", "nami", "namess", "Nexts", "typ", "typo", "nome", "order", "ordering", "na-me",
                             "prototyp", "prototypes", "xml_space", "x"}) {
        EXPECT_EQ(TreeOf("<R><A " + std::string(name) + "='yes'>v</A></R>"), "\nR:R\n  A=v\n") << name;
    }
}

TEST(ElementNodes, NodeOfATypeThatEndsInListIsOrdered) {
    ASSERT_TREE("<FooList><Bar/></FooList>", R"(
FooList:FooList ordered
  Bar=
)");
    ASSERT_TREE("<FooLIST><Bar/></FooLIST>", R"(
FooLIST:FooLIST ordered
  Bar=
)");
    ASSERT_TREE("<R><List name='a'/><Lists name='b'/><Listing name='c'/><aLisT name='d'/></R>", R"(
R:R
  a:List ordered
  b:Lists
  c:Listing
  d:aLisT ordered
)");
    ASSERT_TREE("<R><A\xC3\xA9List name='a'/><\xC3\xA9Li-st name='b'/><ist name='c'/><\xC3\xA9 name='d'/></R>", R"(
R:R
  a:A{00E9}List ordered
  b:{00E9}Li-st
  c:ist
  d:{00E9}
)");
}

TEST(ElementNodes, EntryNameThatEndsInListDoesNotCount) {
    ASSERT_TREE("<R><A name='FooList'/></R>", R"(
R:R
  FooList:A
)");
}

TEST(ElementNodes, KnownListTypesAreOrdered) {
    ASSERT_TREE(
        "<R><Target name='a'/><target name='b'/><Connector name='c'/><Module name='d'/><ResourceList name='e'/></R>",
        R"(
R:R
  a:Target ordered
  b:target ordered
  c:Connector ordered
  d:Module ordered
  e:ResourceList ordered
)");
}

TEST(ElementNodes, OtherKnownTypesAreNotOrdered) {
    ASSERT_TREE("<R><Resource name='a'/><IOResource name='b'/></R>", R"(
R:R
  a:Resource
  b:IOResource
)");
}

TEST(ElementNodes, OrderedFalseWinsOverTheType) {
    ASSERT_TREE("<R><Target name='a' ordered='false'/><FooList name='b' ordered='no'/></R>", R"(
R:R
  a:Target
  b:FooList
)");
}

TEST(ElementNodes, TypeAddedToTheTableCounts) {
    auto root = MakeRoot();
    root->GetTypeTable()->AddTypeRelation(u"Mine", u"Module");
    EXPECT_EQ(LoadChild(*root, "<Mine name='a'/>"), R"(
Root:Root
  a:Mine ordered
)");
}

TEST(ElementNodes, NearestTypeTableCounts) {
    auto root = MakeRoot();
    Load(*root, "<R><M name='m'/></R>");
    ResTreeNode& local = At(*root, u"m");
    local.MakeTypeTableLocal();
    local.GetTypeTable()->AddTypeRelation(u"Foo", u"ResourceList");
    EXPECT_EQ(Load(*root, "<R><Foo name='a'/><M name='m'><Foo name='b'/><C><Foo name='c'/></C></M><Foo name='d'/></R>"),
              R"(
Root:Root
  a:Foo
  d:Foo
  m:M
    b:Foo ordered
    C:C
      c:Foo ordered
)");
    EXPECT_EQ(Load(local, "<R><Foo name='e'/></R>"), R"(
m:M
  b:Foo ordered
  C:C
    c:Foo ordered
  e:Foo ordered
)");
}

TEST(ElementNodes, WithoutATypeTableTheNameAloneCounts) {
    const TypeTable* noTable = nullptr;
    ResTreeNode root(u"Root", u"Root", false, noTable);
    EXPECT_EQ(Load(root, "<R><Target name='a'/><FooList name='b'/></R>"), R"(
Root:Root
  a:Target
  b:FooList ordered
)");
}

// --- What is there already ---

TEST(ElementNodes, ChildOfTheSameTypeAndOrderIsMergedInto) {
    ASSERT_TREE("<R><C name='x'><V>1</V><U>1</U></C><c name='X'><V>2</V><W>2</W></c></R>", R"(
R:R
  x:C
    U=1
    V=2
    W=2
)");
}

TEST(ElementNodes, ChildOfAnotherTypeGivesWay) {
    ASSERT_TREE("<R><C name='x'><V>1</V></C><D name='X'><W>2</W></D></R>", R"(
R:R
  X:D
    W=2
)");
}

TEST(ElementNodes, ChildOfAnotherOrderGivesWay) {
    ASSERT_TREE("<R><C name='x'><V>1</V></C><C name='x' ordered='true'><W>2</W></C></R>", R"(
R:R
  x:C ordered
    W=2
)");
    ASSERT_TREE("<R><C name='x' ordered='true'><V>1</V></C><C name='x'><W>2</W></C></R>", R"(
R:R
  x:C
    W=2
)");
}

TEST(ElementNodes, ValueGivesWayToAChild) {
    ASSERT_TREE("<R><x>1</x><C name='X'/></R>", R"(
R:R
  X:C
)");
}

TEST(ElementNodes, LinkGivesWayToAChild) {
    ASSERT_TREE("<R><T name='t'/><:Link name='x'>t</:Link><C name='x'/></R>", R"(
R:R
  t:T
  x:C
)");
}

TEST(ElementNodes, OrderedNodeTakesChildrenOfOneNameSideBySide) {
    ASSERT_TREE("<RList><C name='x'><V>1</V></C><C name='x'><W>2</W></C></RList>", R"(
RList:RList ordered
  x:C
    V=1
  x:C
    W=2
)");
}

TEST(ElementNodes, OrderedNodeLosesTheFirstEntryOfTheNameIfItIsOfAnotherType) {
    ASSERT_TREE("<RList><C name='x'/><C name='x'/><D name='x'/></RList>", R"(
RList:RList ordered
  x:C
  x:D
)");
    ASSERT_TREE("<RList><x>1</x><x>2</x><D name='x'/></RList>", R"(
RList:RList ordered
  x=2
  x:D
)");
}

TEST(ElementNodes, ReplaceRemovesWhatIsThere) {
    ASSERT_TREE("<R><C name='x'><V>1</V></C><C name='x' replace='true'><W>2</W></C></R>", R"(
R:R
  x:C
    W=2
)");
    ASSERT_TREE("<RList><C name='x'><V>1</V></C><E name='e'/><C name='x' replace='true'><W>2</W></C></RList>", R"(
RList:RList ordered
  e:E
  x:C
    W=2
)");
}

TEST(ElementNodes, ReplaceStaysInForceForLaterSiblings) {
    ASSERT_TREE("<R><B name='y'><V>1</V></B><A name='x' replace='true'/><B name='y'/></R>", R"(
R:R
  x:A
  y:B
)");
}

TEST(ElementNodes, ReplaceFalseEndsIt) {
    ASSERT_TREE("<R><B name='y'><V>1</V></B><A name='x' replace='true'/><A name='z' replace='false'/><B name='y'/></R>",
                R"(
R:R
  x:A
  y:B
    V=1
  z:A
)");
}

TEST(ElementNodes, ReplaceHoldsForFramesPushedFromIt) {
    ASSERT_TREE(
        "<R><A name='x' replace='true'><C name='c'><V>1</V></C><D><C name='c'><V>1</V></C><C name='c'/></D><C "
        "name='c'/></A></R>",
        R"(
R:R
  x:A
    c:C
    D:D
      c:C
)");
}

TEST(ElementNodes, ReplaceDoesNotReachTheFramesBelow) {
    ASSERT_TREE("<R><B name='y'><V>1</V></B><A name='x'><C name='c' replace='1'/></A><B name='y'/></R>", R"(
R:R
  x:A
    c:C
  y:B
    V=1
)");
}

TEST(ElementNodes, ReplaceOnAValueIsNotRead) {
    ASSERT_TREE("<R><B name='y'><V>1</V></B><S replace='true'>5</S><B name='y'/></R>", R"(
R:R
  S=5
  y:B
    V=1
)");
}

TEST(ElementNodes, ReplaceOnALinkIsNotRead) {
    ASSERT_TREE("<R><B name='y'><V>1</V></B><:Link name='l' replace='true'>y</:Link><B name='y'/></R>", R"(
R:R
  l->../y
  y:B
    V=1
)");
}

TEST(ElementNodes, ReplaceOnAnXmlValueIsNotRead) {
    ASSERT_TREE("<R><B name='y'><V>1</V></B><S type='xml' replace='true'><a/></S><B name='y'/></R>", R"(
R:R
  S=<a></a>
  y:B
    V=1
)");
}

TEST(ElementNodes, ReplaceOnTheDocumentElementHoldsForAllOfIt) {
    ASSERT_TREE("<R replace='true'><C name='x'><V>1</V><V>2</V></C><C name='x'><W>1</W></C></R>", R"(
R:R
  x:C
    W=1
)");
}

TEST(ElementNodes, ReplaceWithABadBooleanMerges) {
    ASSERT_TREE("<R replace='true'><C name='x' replace='perhaps'><V>1</V></C><C name='x'><W>1</W></C></R>", R"(
R:R
  x:C
    V=1
    W=1
)");
}

// --- Next ---

TEST(ElementNodes, NextPutsAnEntryBeforeASiblingOfAnOrderedParent) {
    ASSERT_TREE(
        "<RList><A name='a'/><B name='b'/><C name='c' next='b'/><V next='A'>1</V>"
        "<X type='xml' next='b'><i/></X><:Link name='l' next='c'>a</:Link></RList>",
        R"(
RList:RList ordered
  V=1
  a:A
  l->../a
  c:C
  X=<i></i>
  b:B
)");
}

TEST(ElementNodes, NextWithoutSuchASiblingMeansTheEnd) {
    ASSERT_TREE("<RList><A name='a'/><C name='c' next='nowhere'/><V next=''>1</V></RList>", R"(
RList:RList ordered
  a:A
  c:C
  V=1
)");
}

TEST(ElementNodes, NextMeansTheFirstEntryOfThatName) {
    ASSERT_TREE("<RList><V>1</V><V>2</V><W next='v'>3</W></RList>", R"(
RList:RList ordered
  W=3
  V=1
  V=2
)");
}

TEST(ElementNodes, UnorderedParentIgnoresNext) {
    ASSERT_TREE("<R><A name='b'/><C name='c' next='b'/><V name='a' next='c'/></R>", R"(
R:R
  a:V
  b:A
  c:C
)");
}

TEST(ElementNodes, NextThatNamesWhatIsRemovedMeansTheEnd) {
    ASSERT_TREE("<RList><C name='x'/><E name='e'/><D name='x' next='x'/></RList>", R"(
RList:RList ordered
  e:E
  x:D
)");
}

// --- Attributes ---

TEST(ElementNodes, OfAttributesThatDifferOnlyInCaseTheFirstStays) {
    ASSERT_TREE("<R><A name='x' NAME='y' Ordered='true' ordered='false'/></R>", R"(
R:R
  x:A ordered
)");
    ASSERT_TREE("<R><A NAME='y' name='x' ordered='false' Ordered='true'/></R>", R"(
R:R
  y:A
)");
}

TEST(ElementNodes, DefaultAttributesOfTheDocumentTypeCount) {
    ASSERT_TREE("<!DOCTYPE R [<!ATTLIST A name CDATA 'x' ordered CDATA 'yes'>]><R><A/><A name='y'/></R>", R"(
R:R
  x:A ordered
  y:A ordered
)");
}

// The place of a child that is replaced may be taken before the new one comes: what the element holds is read into the
// node that was to have it.
TEST(ElementNodes, ElementWhosePlaceAnObserverTakesIsReadIntoTheNodeAbove) {
    const auto root = MakeUnnamedRoot();
    Load(*root, "<R><M name='m'><Old name='x'/></M></R>");
    ResTreeNode& m = At(*root, u"m");
    ChangeLog log;
    LoggingObserver observer(log, "o");
    observer.reaction = [](ResTreeNode& node, uint32_t) { node.SetProperty(u"x", u"taken"); };
    m.AddObserver(&observer, ChildRemoved, 0);
    EXPECT_EQ(Load(*root, "<R><M name='m' replace='false'><New name='x'><V>1</V></New><W>2</W></M></R>"),
              "\nR:R\n  m:M\n    V=1\n    W=2\n    x=taken\n");
    EXPECT_EQ(log.Take(), "o: m ChildRemoved #0\n");
    m.RemoveObserver(&observer, -1, false);
}

}  // namespace
}  // namespace zkhw
