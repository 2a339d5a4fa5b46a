// Elements with "names": read once, and copied when they are complete.

#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"
#include "support/ChangeLog.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

TEST(Names, EachNameGivesANodeWithItsOwnNameFilledIn) {
    ASSERT_TREE("<R><Pin names='A,B' Kind='x'><Label>#{name}</Label><Mode>#{Kind}</Mode></Pin></R>", R"(
R:R
  A:Pin
    Label=A
    Mode=x
  B:Pin
    Label=B
    Mode=x
)");
}

// What a node that holds its notices back has gathered when a document has been read into it.
uint32_t ChangesOfReading(const char* document) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><A name='a'/></R>");
    ResTreeNode& node = At(*root, u"a");
    node.BeginChanges();
    EXPECT_EQ(node.LoadResourceText(String(document), false, nullptr), 0);
    const uint32_t changes = node.BeginChanges();
    node.EndChanges(0, true);
    node.EndChanges(0, true);
    return changes;
}

TEST(Names, ExpandedDisplayNameCountsAsAChangeOfTheChildsName) {
    EXPECT_EQ(ChangesOfReading("<A><X names='P,Q'><DisplayName>#{name}</DisplayName></X></A>"),
              ChildAdded | ChildNameChanged);
}

TEST(Names, ExpandedDisplayNameOfACopyOfAPrototypeCountsAsAChangeOfTheChildsName) {
    EXPECT_EQ(
        ChangesOfReading("<A><X name='p'><DISPLAYNAME>#{i}</DISPLAYNAME></X><Y name='q' prototype='p' i='1'/></A>"),
        ChildAdded | ChildNameChanged);
}

TEST(Names, OtherExpandedTextsAreNoChangeOfTheNodeAbove) {
    EXPECT_EQ(ChangesOfReading("<A><X names='P,Q'><Label>#{name}</Label>"
                               "<Y><DisplayName>#{name}</DisplayName></Y></X></A>"),
              uint32_t{ChildAdded});
}

TEST(Names, OtherParametersAreFilledInWhileTheElementIsRead) {
    ASSERT_TREE("<R><Pin names='A' Kind='x'><Label>#{name}</Label><Mode>#{Kind}</Mode></Pin></R>", R"(
R:R
  A:Pin
    Label=#{name}
    Mode=x
)");
}

TEST(Names, LoopVariableIsFilledIn) {
    ASSERT_TREE("<R><X names='P[i=1..3]'><V>#{i}</V></X></R>", R"(
R:R
  P1:X
    V=1
  P2:X
    V=2
  P3:X
    V=3
)");
}

TEST(Names, LeadingZerosOfTheBoundsAreNotKept) {
    ASSERT_TREE("<R><X names='P[i=03..04]'><V>#{i}</V></X></R>", R"(
R:R
  P3:X
    V=3
  P4:X
    V=4
)");
}

TEST(Names, RangeWithoutAVariableFillsInTheNameAlone) {
    ASSERT_TREE("<R><X names='Port[1..2]A'><V>#{name} #{i}</V></X></R>", R"(
R:R
  Port1A:X
    V=Port1A #{i}
  Port2A:X
    V=Port2A #{i}
)");
}

TEST(Names, NamesAndRangesMix) {
    ASSERT_TREE("<R><X names='a, P[i=1..1] ,Q[j=2..2]'><V>#{name} #{i} #{j}</V></X></R>", R"(
R:R
  a:X
    V=a #{i} #{j}
  P1:X
    V=P1 1 #{j}
  Q2:X
    V=Q2 #{i} 2
)");
}

TEST(Names, SingleRecordIsNotExpanded) {
    ASSERT_TREE("<R><X names='Bank[i=0..0]'><V>#{name} #{i}</V></X></R>", R"(
R:R
  Bank0:X
    V=#{name} #{i}
)");
    ASSERT_TREE("<R><X names='x,P[i=2..1]'><V>#{name} #{i}</V></X></R>", R"(
R:R
  x:X
    V=#{name} #{i}
)");
}

TEST(Names, FormThatIsNoRangeIsAName) {
    ASSERT_TREE("<R><X names='P[a..b]'><V>1</V></X></R>", R"(
R:R
  P[a..b]:X
    V=1
)");
    ASSERT_TREE("<R><X names='P[99999999999..1]'/></R>", R"(
R:R
  P[99999999999..1]:X
)");
}

TEST(Names, ListWithoutAnyRecordCountsAsAbsent) {
    for (const char* names : {"", "P[i=2..1]", "P[2..1],Q[1..0]"}) {
        const std::string attribute = " names='" + std::string(names) + "'";
        EXPECT_EQ(TreeOf("<R><X" + attribute + "><V>#{i}</V></X></R>"), "\nR:R\n  X:X\n    V=#{i}\n") << names;
        EXPECT_EQ(TreeOf("<R><X" + attribute + " name='n'/></R>"), "\nR:R\n  n:X\n") << names;
        EXPECT_EQ(TreeOf("<R><X" + attribute + ">text</X></R>"), "\nR:R\n  X=text\n") << names;
    }
}

TEST(Names, EmptyPieceIsAnEmptyName) {
    ASSERT_TREE("<R><X names=' '><V>1</V></X></R>", R"(
R:R
  :X
    V=1
)");
    ASSERT_TREE("<RList><X names=',a'><V>[#{name}]</V></X></RList>", R"(
RList:RList ordered
  :X
    V=[]
  a:X
    V=[a]
)");
}

TEST(Names, EscapedCommaBelongsToAName) {
    ASSERT_TREE("<R><X names='a\\,b,c'/></R>", R"(
R:R
  a,b:X
  c:X
)");
}

TEST(Names, ElementsWithoutContentAreCopied) {
    ASSERT_TREE("<R><X names='a,b,c' ordered='1'/></R>", R"(
R:R
  a:X ordered
  b:X ordered
  c:X ordered
)");
}

TEST(Names, WholeSubtreeIsCopiedAndExpanded) {
    ASSERT_TREE(
        "<R><X names='a,b'><C name='c' ordered='1'><V>#{name}</V><V>2</V></C><D><E><V>#{name}</V></E></D></X></R>", R"(
R:R
  a:X
    c:C ordered
      V=a
      V=2
    D:D
      E:E
        V=a
  b:X
    c:C ordered
      V=b
      V=2
    D:D
      E:E
        V=b
)");
}

TEST(Names, NamesOfNodesAndEntriesAreNotExpanded) {
    ASSERT_TREE("<R><X names='a,b'><C name='#{name}'><V>#{name}</V></C></X></R>", R"(
R:R
  a:X
    #{name}:C
      V=a
  b:X
    #{name}:C
      V=b
)");
}

TEST(Names, LocalizedTextsAreExpandedToTheirLists) {
    ASSERT_TREE("<R><X names='a,b'><T localize='1'>eng=#{name}</T></X></R>", R"(
R:R
  a:X
    T~a{0000}eng=a
  b:X
    T~b{0000}eng=b
)");
}

TEST(Names, LinksAreReexpressedInTheCopiesAndNotExpanded) {
    // The link's text counts as one component of a path.
    ASSERT_TREE(
        "<R><T name='t'/><X names='a,b'><U name='u'/><:Link name='l'>u</:Link><:Link name='m'>../t</:Link></X></R>", R"(
R:R
  a:X
    l->u
    m->../t
    u:U
  b:X
    l->../a/u
    m->../a/..\/t
    u:U
  t:T
)");
}

TEST(Names, NestedNamesFillInOneAfterTheOther) {
    ASSERT_TREE("<R><A names='a[i=1..2]'><B names='b[j=1..2]'><V>#{i}#{j}#{name}</V></B></A></R>", R"(
R:R
  a1:A
    b1:B
      V=11b1
    b2:B
      V=12b2
  a2:A
    b1:B
      V=21b1
    b2:B
      V=22b2
)");
}

TEST(Names, LoopVariableOfAnOpenElementHidesAnAttributeOfThatName) {
    ASSERT_TREE("<R i='out'><X names='P[i=1..2]'><V>#{i}</V></X><V>#{i}</V></R>", R"(
R:R
  P1:X
    V=1
  P2:X
    V=2
  V=out
)");
}

TEST(Names, VariablesAreBlindToCase) {
    ASSERT_TREE("<R I='out'><X names='P[i=1..2]'><V>#{I}#{NAME}</V></X></R>", R"(
R:R
  P1:X
    V=1P1
  P2:X
    V=2P2
)");
}

TEST(Names, CopiesOfAPrototypeAreExpandedPerName) {
    ASSERT_TREE("<R><P><V>#{name} #{K} #{i}</V></P><X names='a[i=1..2]' prototype='P' K='k'/></R>", R"(
R:R
  a1:X
    V=a1 k 1
  a2:X
    V=a2 k 2
  P:P
    V=#{name} #{K} #{i}
)");
}

// --- Where the copies stand ---

TEST(Names, CopiesStandStraightBehindTheFirstInAnOrderedNode) {
    ASSERT_TREE("<RList><X names='a,b,c'><V>#{name}</V></X><Z name='z'/></RList>", R"(
RList:RList ordered
  a:X
    V=a
  b:X
    V=b
  c:X
    V=c
  z:Z
)");
    ASSERT_TREE("<RList><Z name='z'/><X names='c,b,a' next='z'/></RList>", R"(
RList:RList ordered
  c:X
  b:X
  a:X
  z:Z
)");
}

TEST(Names, OlderChildOfTheFirstNameIsThePatternInAnOrderedNode) {
    ASSERT_TREE("<RList><X name='A'><V>old #{name}</V></X><Z name='z'/><X names='A,B'><V>#{name}</V></X></RList>", R"(
RList:RList ordered
  A:X
    V=old A
  B:X
    V=old B
  z:Z
  A:X
    V=#{name}
)");
}

TEST(Names, TextOfTheFirstNameMeansNoCopiesInAnOrderedNode) {
    ASSERT_TREE("<RList><A>1</A><A>2</A><X names='A,B'><V>#{name}</V></X><W>3</W></RList>", R"(
RList:RList ordered
  A=2
  A:X
    V=#{name}
  W=3
)");
}

TEST(Names, RepeatedNameInAnUnorderedNodeIsOneNode) {
    // The repetition is filled into the pattern itself, and what is copied from there on has it.
    ASSERT_TREE("<R><X names='A,B,a,C'><V>#{name}</V></X></R>", R"(
R:R
  A:X
    V=a
  B:X
    V=B
  C:X
    V=a
)");
}

TEST(Names, CopyOfAnEarlierNameStandsOnePlaceFurtherUpInAnOrderedNode) {
    // The entry that is found stands before the place of the copy, which moves up by one although nothing goes.
    ASSERT_TREE("<RList><X names='A1,A[i=1..2]'><V>#{name}#{i}</V></X></RList>", R"(
RList:RList ordered
  A1:X
    V=A11
  A2:X
    V=A22
  A1:X
    V=A1#{i}
)");
}

TEST(Names, CopyMergesIntoAChildOfItsName) {
    ASSERT_TREE("<R><X name='B'><V>old</V><W>1</W></X><X names='A,B'><V>#{name}</V></X></R>", R"(
R:R
  A:X
    V=A
  B:X
    V=B
    W=1
)");
}

TEST(Names, CopyReplacesAChildOfAnotherTypeOrOrder) {
    ASSERT_TREE(
        "<R><Y name='B'><W>1</W></Y><X name='C' ordered='1'><W>1</W></X><D>1</D><X "
        "names='A,B,C,D'><V>#{name}</V></X></R>",
        R"(
R:R
  A:X
    V=A
  B:X
    V=B
  C:X
    V=C
  D:X
    V=D
)");
}

TEST(Names, CopyUnderReplaceReplacesAnyChildOfItsName) {
    ASSERT_TREE("<R><X name='B'><W>1</W></X><X names='A,B' replace='1'><V>#{name}</V></X></R>", R"(
R:R
  A:X
    V=A
  B:X
    V=B
)");
}

TEST(Names, CopyThatReplacesItsOwnPatternIsMadeFromIt) {
    ASSERT_TREE("<R><X names='A,A' replace='1'><V>#{name}</V></X></R>", R"(
R:R
  A:X
    V=A
)");
    ASSERT_TREE("<RList><X names='A,A,B' replace='1'><V>#{name}</V></X><Z/></RList>", R"(
RList:RList ordered
  A:X
    V=A
  B:X
    V=B
  Z=
)");
}

TEST(Names, NamesOnAValueTypeMakeNodesAllTheSame) {
    ASSERT_TREE("<R><X names='a,b' type='path'>p/q</X></R>", R"(
R:R
  a:X
  b:X
)");
}

TEST(Names, InstancesOfAnElementInsideDoNotTouchItsSiblings) {
    ASSERT_TREE("<R><A names='a,b'><B names='c,d'/><V>#{name}</V></A><V>#{name}</V></R>", R"(
R:R
  a:A
    c:B
    d:B
    V=a
  b:A
    c:B
    d:B
    V=b
  V=#{name}
)");
}

TEST(Names, ManyCopiesAreMadeInOrder) {
    for (const char* element : {"R", "RList"}) {
        const std::string name = element;
        auto root = MakeUnnamedRoot();
        Load(*root, "<" + name + "><X names='P[i=1..20000]'><V>#{i}</V></X><Z name='z'/></" + name + ">");
        int count = 0;
        for (EntryIterator entry = root->Begin(); !entry.IsEnd(); ++entry) {
            ++count;
            if (root->IsOrdered() && count <= 20000) {
                ASSERT_EQ(TextAt(*entry->Child(), u"V"), std::to_string(count));
            }
        }
        EXPECT_EQ(count, 20001);
        EXPECT_EQ(TextAt(At(*root, u"P20000"), u"V"), "20000");
    }
}

// --- Observers that change the node in which copies are made ---

// A root with the child A, and an observer of A.
class NamesUnderObservers : public ::testing::TestWithParam<bool> {
  protected:
    NamesUnderObservers() {
        a = AddChild(*root, u"A", u"A", GetParam());
        a->AddObserver(&observer, ChildAdded, 5);
    }
    ~NamesUnderObservers() override { root->RemoveObserver(&observer, -1, true); }

    // Reads copies P1 to P9 into A; `removed` goes as soon as child number `at` has come. What stands then, with the
    // value of each, or "-".
    std::string Read(int at, const std::string& removed) {
        observer.reaction = [this, at, removed](ResTreeNode&, uint32_t) {
            if (++heard == at) {
                a->RemoveEntryByName(Wide(removed).View());
            }
        };
        const std::string ordered = GetParam() ? " ordered='true'" : "";
        EXPECT_EQ(root->LoadResourceText(
                      Wide("<Root><A" + ordered + "><P names='P[i=1..9]'><V>#{i}</V></P></A></Root>"), false, nullptr),
                  0);
        std::string names;
        for (EntryIterator entry = a->Begin(); !entry.IsEnd(); ++entry) {
            const NodeEntry* value = entry->Child()->FindRaw(u"V");
            names += qn::dsc::ExactText(entry->Key()) + "=" +
                     (value == nullptr ? "-" : qn::dsc::ExactText(*value->Text())) + " ";
        }
        return names;
    }

    ChangeLog log;
    LoggingObserver observer{log, "o"};
    int heard = 0;
    std::unique_ptr<ResTreeNode> root = MakeRootNode();
    ResTreeNode* a = nullptr;
};

INSTANTIATE_TEST_SUITE_P(BothForms, NamesUnderObservers, ::testing::Bool(),
                         [](const auto& form) { return form.param ? "Ordered" : "Unordered"; });

TEST_P(NamesUnderObservers, CopyMayGoAtOnce) {
    EXPECT_EQ(Read(4, "P4"), "P1=1 P2=2 P3=3 P5=5 P6=6 P7=7 P8=8 P9=9 ");
}

TEST_P(NamesUnderObservers, LastCopyMayGoAtOnce) {
    EXPECT_EQ(Read(9, "P9"), "P1=1 P2=2 P3=3 P4=4 P5=5 P6=6 P7=7 P8=8 ");
}

TEST_P(NamesUnderObservers, EarlierCopyMayGo) {
    EXPECT_EQ(Read(5, "P3"), "P1=1 P2=2 P4=4 P5=5 P6=6 P7=7 P8=8 P9=9 ");
}

TEST_P(NamesUnderObservers, PatternMayGo) {
    // It is torn down with its notices, so the copies of it that are still to come are empty.
    EXPECT_EQ(Read(2, "P1"), "P2=- P3=- P4=- P5=- P6=- P7=- P8=- P9=- ");
}

}  // namespace
}  // namespace zkhw
