#include "restree/Parameters.h"

#include <functional>
#include <memory>
#include <string>
#include <tuple>
#include <utility>

#include <gtest/gtest.h>

#include "restree/ReadTree.h"
#include "support/ChangeLog.h"
#include "support/TreeMaking.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;

std::string Expanded(const char16_t* text, const Parameters& parameters) {
    TextBuilder result;
    ExpandVariables(text, parameters, result);
    return ExactText(result.View());
}

std::string Expanded(const char16_t* text) {
    ParameterMap values;
    values.emplace(u"A", u"1");
    values.emplace(u"B C", u"2");
    values.emplace(u"Empty", u"");
    values.emplace(u"Again", u"#{A}");
    return Expanded(text, MapParameters(std::move(values)));
}

// --- One text ---

TEST(ExpandVariables, ReplacesWhatItKnows) {
    EXPECT_EQ(Expanded(u"#{A}"), "1");
    EXPECT_EQ(Expanded(u"x#{A}y#{A}z"), "x1y1z");
    EXPECT_EQ(Expanded(u"#{A}#{B C}"), "12");
    EXPECT_EQ(Expanded(u"[#{Empty}]"), "[]");
}

TEST(ExpandVariables, IsBlindToCase) {
    EXPECT_EQ(Expanded(u"#{a}#{b c}#{EMPTY}"), "12");
}

TEST(ExpandVariables, IgnoresWhiteSpaceInsideTheBraces) {
    EXPECT_EQ(Expanded(u"#{ A }#{\t\r\nA\n}#{ B C }"), "112");
    EXPECT_EQ(Expanded(u"#{B  C}"), "#{B  C}");
}

TEST(ExpandVariables, LeavesTheUnknownWithoutItsWhiteSpace) {
    EXPECT_EQ(Expanded(u"a#{ x }b"), "a#{x}b");
    EXPECT_EQ(Expanded(u"#{}#{ }"), "#{}#{}");
}

TEST(ExpandVariables, LeavesTheRestFromAMarkThatIsNotClosed) {
    EXPECT_EQ(Expanded(u"#{A} #{ A"), "1 #{ A");
    EXPECT_EQ(Expanded(u"#{"), "#{");
    EXPECT_EQ(Expanded(u"#{ x } #{ y"), "#{x} #{ y");
}

TEST(ExpandVariables, DoesNotScanWhatItPutIn) {
    EXPECT_EQ(Expanded(u"#{Again}"), "#{A}");
    EXPECT_EQ(Expanded(u"#{Again}#{A}"), "#{A}1");
}

TEST(ExpandVariables, TakesTheFirstClosingBrace) {
    EXPECT_EQ(Expanded(u"#{#{A}}"), "#{#{A}}");
    EXPECT_EQ(Expanded(u"#{A}}"), "1}");
    EXPECT_EQ(Expanded(u"}#{A}"), "}1");
}

TEST(ExpandVariables, LeavesWhatIsNoMark) {
    EXPECT_EQ(Expanded(u"# {A} #A {A} # #"), "# {A} #A {A} # #");
    EXPECT_EQ(Expanded(u"##{A}"), "#1");
    EXPECT_EQ(Expanded(u"\\#{A}"), "\\1");
    EXPECT_EQ(Expanded(u""), "");
}

TEST(ExpandVariables, FindsAMarkAtAnyPlace) {
    for (size_t length = 0; length <= 40; ++length) {
        const std::u16string part(length, u'x');
        const std::string shown(length, 'x');
        EXPECT_EQ(Expanded((part + u"#{A}").c_str()), shown + "1");
        EXPECT_EQ(Expanded((part + u"#{A}" + part + u"#{B C}" + part).c_str()), shown + "1" + shown + "2" + shown);
        EXPECT_EQ(Expanded((part + u"#" + part + u"#{A").c_str()), shown + "#" + shown + "#{A");
        EXPECT_EQ(Expanded((part + u"#").c_str()), shown + "#");
    }
}

TEST(ExpandVariables, ResultMayHaveAnyLength) {
    for (size_t length = 250; length <= 260; ++length) {
        const std::u16string part(length, u'x');
        const std::string shown(length, 'x');
        EXPECT_EQ(Expanded((part + u"#{A}" + part).c_str()), shown + "1" + shown);
        EXPECT_EQ(Expanded((u"#{" + part + u"}").c_str()), "#{" + shown + "}");
    }
}

TEST(FindVariable, GivesTheFirstMark) {
    EXPECT_EQ(FindVariable(u"#{"), 0u);
    EXPECT_EQ(FindVariable(u"0123456789#{"), 10u);
    EXPECT_EQ(FindVariable(u"##{a}#{b}"), 1u);
}

TEST(FindVariable, GivesNposWithoutAMark) {
    for (const char16_t* text : {u"", u"#", u"# {", u"{#}", u"0123456789#"}) {
        EXPECT_EQ(FindVariable(text), std::u16string_view::npos) << ExactText(String(text));
    }
}

TEST(InstanceParameters, AreTheNameAndTheLoopVariable) {
    const InstanceParameters parameters(u"Bank7", u"i", -2147483647 - 1);
    EXPECT_FALSE(parameters.IsEmpty());
    EXPECT_EQ(Expanded(u"#{name} #{NAME} #{i} #{I} #{j} #{}", parameters),
              "Bank7 Bank7 -2147483648 -2147483648 #{j} #{}");
}

TEST(InstanceParameters, EmptyVariableIsNone) {
    EXPECT_EQ(Expanded(u"#{name}#{}#{ }", InstanceParameters(u"Bank7", u"", 1)), "Bank7#{}#{}");
}

TEST(InstanceParameters, NameWinsOverAVariableOfThatName) {
    EXPECT_EQ(Expanded(u"#{name}", InstanceParameters(u"x", u"Name", 1)), "x");
}

TEST(ExpandVariables, WithoutAnyParameterTheTextStaysWithItsBlanks) {
    EXPECT_EQ(Expanded(u"a#{ x }b", MapParameters(ParameterMap())), "a#{ x }b");
}

// --- Texts of a document ---

TEST(OpenElementParameters, AreTheAttributesOfAllOpenElements) {
    ASSERT_TREE("<R J='j'><A K='k'><B L='l'><V M='m'>#{J}#{K}#{L}#{M}#{N}</V></B></A></R>", R"(
R:R
  A:A
    B:B
      V=jklm#{N}
)");
}

TEST(OpenElementParameters, OutermostWins) {
    ASSERT_TREE("<R><A Speed='out'><B Speed='in'><V Speed='own'>#{Speed}</V></B></A></R>", R"(
R:R
  A:A
    B:B
      V=out
)");
}

TEST(OpenElementParameters, AreBlindToCase) {
    ASSERT_TREE("<R SPEED='out'><A speed='in'><V>#{Speed}</V></A></R>", R"(
R:R
  A:A
    V=out
)");
}

TEST(OpenElementParameters, UnitsThatDoNotCountMakeNoDifference) {
    EXPECT_EQ(TreeOf("<R K='k' name='r'><V>#{K&#173;}#{&#173;K}#{na&#173;me}</V></R>"), "\nr:R\n  V=kk#{na{00AD}me}\n");
}

// Windows has an order of its own outside printable ASCII: docs/platforms.md lists where it differs.
TEST(OpenElementParameters, DeleteCharactersMakeNoDifferenceAsOnlyLinuxOrdersSo) {
    EXPECT_EQ(TreeOf("<R K='k' name='r'><V>#{K&#127;}#{&#127;K}#{na&#127;me}</V></R>"),
              "\nr:R\n  V=kk#{na\x7F"
              "me}\n");
}

TEST(OpenElementParameters, HyphensMakeADifference) {
    ASSERT_TREE("<R ab='1' a-b='2'><V>#{a-b}#{A-B}#{ab}#{-ab}#{a--b}#{'ab}</V></R>", R"(
R:R
  V=221#{-ab}#{a--b}#{'ab}
)");
}

TEST(OpenElementParameters, NamesOutsideAsciiAreComparedByTheLanguage) {
    ASSERT_TREE("<R \xC3\xA9t='1'><V>#{\xC3\x89T}#{et}</V></R>", R"(
R:R
  V=1#{et}
)");
}

TEST(OpenElementParameters, WidthMakesNoDifferenceAsOnlyLinuxOrdersSo) {
    ASSERT_TREE("<R K='2'><V>#{\xEF\xBC\xAB}</V></R>", R"(
R:R
  V=2
)");
}

TEST(OpenElementParameters, NamesMayHaveAnyLength) {
    for (size_t length = 1; length <= 70; ++length) {
        const std::string name(length, 'n');
        EXPECT_EQ(TreeOf("<R " + name + "='v'><V>#{" + std::string(length, 'N') + "}#{" + name + "n}</V></R>"),
                  "\nR:R\n  V=v#{" + name + "n}\n");
    }
}

TEST(OpenElementParameters, ValuesMayHaveAnyLength) {
    for (size_t length = 0; length <= 40; ++length) {
        const std::string value(length, 'v');
        EXPECT_EQ(TreeOf("<R K='" + value + "' L='\xC3\xA9" + value + "'><V>[#{K}#{L}]</V></R>"),
                  "\nR:R\n  V=[" + value + "{00E9}" + value + "]\n");
    }
}

TEST(OpenElementParameters, OfAttributesThatDifferOnlyInCaseTheFirstStays) {
    ASSERT_TREE("<R k='1' K='2'><V>#{K}</V></R>", R"(
R:R
  V=1
)");
}

TEST(OpenElementParameters, ClosedElementsDoNotCount) {
    ASSERT_TREE("<R><A K='a'/><B K='b'><C L='c'/><V L2='v'>1</V></B><W>#{K}#{L}#{L2}</W></R>", R"(
R:R
  A=
  B:B
    C=
    V=1
  W=#{K}#{L}#{L2}
)");
}

TEST(OpenElementParameters, KeywordsAreParametersToo) {
    ASSERT_TREE(
        "<R ordered='no' xml:space='s'><A type='t' next='n' replace='0'><V "
        "localize='0'>#{ordered}#{xml:space}#{type}#{next}#{replace}#{localize}</V></A></R>",
        R"(
R:R
  A:A
    V=nostn00
)");
}

TEST(OpenElementParameters, NameIsLeftToInstances) {
    ASSERT_TREE("<R name='r'><A name='a'><V>#{name} #{NAME}</V></A></R>", R"(
r:R
  a:A
    V=#{name} #{NAME}
)");
}

TEST(OpenElementParameters, UnknownOnesStayWithoutTheirBlanks) {
    ASSERT_TREE("<R><V>#{ x } #{ y</V></R>", R"(
R:R
  V=#{x} #{ y
)");
}

TEST(OpenElementParameters, EmptyValueIsAValue) {
    ASSERT_TREE("<R K=''><V>[#{K}]</V></R>", R"(
R:R
  V=[]
)");
}

TEST(OpenElementParameters, ValueWithAMarkIsNotScannedAgain) {
    ASSERT_TREE("<R K='#{L}' L='l'><V>#{K}</V></R>", R"(
R:R
  V=#{L}
)");
}

TEST(OpenElementParameters, DocumentRootIsAPath) {
    ASSERT_TREE("<R><A><V>#{document-root}|#{ Document-Root }</V></A></R>", R"(
R:R
  A:A
    V=/|/
)");
    ASSERT_CHILD_TREE("<D name='a/b'><A><V>#{document-root}</V></A></D>", R"(
Root:Root
  a/b:D
    A:A
      V=/a\/b
)");
}

TEST(OpenElementParameters, AttributeWinsOverTheDocumentRoot) {
    ASSERT_TREE("<R><A Document-Root='mine'><V>#{document-root}</V></A></R>", R"(
R:R
  A:A
    V=mine
)");
}

TEST(OpenElementParameters, LoopVariableHidesTheDocumentRoot) {
    ASSERT_TREE("<R><X names='P[document-root=1..2]'><V>#{document-root}</V></X></R>", R"(
R:R
  P1:X
    V=1
  P2:X
    V=2
)");
}

TEST(OpenElementParameters, ThereIsNoDocumentRootBeforeTheFirstNode) {
    ASSERT_CHILD_TREE("<A K='k'>#{K} #{ document-root }</A>", R"(
Root:Root
  A=k #{document-root}
)");
}

TEST(OpenElementParameters, WithoutAnyTheTextStaysWithItsBlanks) {
    ASSERT_TREE("<A>#{ x }</A>", R"(
:
  A=#{ x }
)");
    ASSERT_TREE("<A K='k'>#{ x }</A>", R"(
:
  A=#{x}
)");
    ASSERT_CHILD_TREE("<A>#{ document-root }</A>", R"(
Root:Root
  A=#{ document-root }
)");
}

TEST(OpenElementParameters, PreservedSpaceStaysAroundAValue) {
    ASSERT_TREE("<R K=' k '><V xml:space='preserve'> #{K} </V><W>#{K}</W></R>", R"(
R:R
  V=  k  
  W= k 
)");
}

TEST(OpenElementParameters, TextMayAskForVeryMany) {
    std::string attributes;
    std::string text;
    std::string expected;
    for (int i = 0; i < 10000; ++i) {
        const std::string number = std::to_string(i);
        attributes += " a" + number + "='v" + number + "'";
        text += "#{A" + number + "}";
        expected += "v" + number;
    }
    auto root = MakeUnnamedRoot();
    Load(*root, "<R" + attributes + "><A a5='own' b='b'><V>" + text + "#{b}#{c}</V></A></R>");
    EXPECT_EQ(TextAt(At(*root, u"A"), u"V"), expected + "b#{c}");
}

// The first questions are answered one by one, later ones from a map.
TEST(OpenElementParameters, ManyQuestionsGetTheSameAnswersAsFew) {
    const std::string few = "#{K}#{name}#{i}#{document-root}#{L}";
    std::string many;
    std::string expected;
    for (int i = 0; i < 10; ++i) {
        many += few;
        expected += "out#{name}#{i}/#{L}";
    }
    auto root = MakeUnnamedRoot();
    Load(*root, "<R K='out' name='r' i='attribute'><X names='P[i=0..0]' K='in'><V>" + many + "</V></X></R>");
    EXPECT_EQ(TextAt(At(*root, u"P0"), u"V"), expected);
}

// --- Documents so deep that attributes are found by name ---

// `inner` inside 20 levels "<L>", inside a document element R with `attributes`; the node of the innermost level.
class DeepParameters : public ::testing::Test {
  protected:
    ResTreeNode& Read(const std::string& attributes, const std::string& inner) {
        std::string document = "<R" + attributes + ">";
        for (int i = 0; i < 20; ++i) {
            document += "<L>";
        }
        document += inner;
        for (int i = 0; i < 20; ++i) {
            document += "</L>";
        }
        Load(*root, document + "</R>");
        ResTreeNode* node = root.get();
        while (const NodeEntry* entry = node->FindRaw(u"L")) {
            node = entry->Child();
        }
        return *node;
    }

    std::unique_ptr<ResTreeNode> root = MakeUnnamedRoot();
};

TEST_F(DeepParameters, SiblingsDoNotSeeAClosedElement) {
    ResTreeNode& node = Read(" K='k'",
                             "<A a='1' K='no'><B b='2'><C c='3'><V>#{a}#{b}#{c}#{K}</V></C></B></A>"
                             "<D d='4'><E><V>#{a}#{b}#{c}#{d}#{K}</V></E></D><V>#{a}#{d}#{K}</V>");
    EXPECT_EQ(TextAt(At(node, u"A/B/C"), u"V"), "123k");
    EXPECT_EQ(TextAt(At(node, u"D/E"), u"V"), "#{a}#{b}#{c}4k");
    EXPECT_EQ(TextAt(node, u"V"), "#{a}#{d}k");
}

TEST_F(DeepParameters, AttributeOfAClosedElementGivesWayToTheNextOne) {
    ResTreeNode& node = Read("", "<A a='1'><B><V>#{a}</V></B></A><C><D a='2'><V>#{A}</V></D></C><V a='3'>#{a}</V>");
    EXPECT_EQ(TextAt(At(node, u"A/B"), u"V"), "1");
    EXPECT_EQ(TextAt(At(node, u"C/D"), u"V"), "2");
    EXPECT_EQ(TextAt(node, u"V"), "3");
}

TEST_F(DeepParameters, ElementsThatReturnToAFlatLevelAreSeenThere) {
    // The lower frames are known by name by then, and the upper ones are looked at.
    Read(" K='k' J='j'", "<V>#{K}</V>");
    Load(*root,
         "<R K='k' J='j'><A a='a'><B><C><D><E><F><G><H><V>#{a}</V></H></G></F></E></D></C></B>"
         "<V J='own'>#{K}#{a}#{J}</V></A><W a='w'>#{a}#{J}</W></R>");
    EXPECT_EQ(TextAt(At(*root, u"A/B/C/D/E/F/G/H"), u"V"), "a");
    EXPECT_EQ(TextAt(At(*root, u"A"), u"V"), "kaj");
    EXPECT_EQ(TextAt(*root, u"W"), "wj");
}

TEST_F(DeepParameters, OfAttributesThatDifferOnlyInCaseTheFirstStays) {
    ResTreeNode& node = Read(" speed='1' SPEED='2'", "<A Speed='3' b='4' B='5'><V sPeed='6'>#{Speed}#{b}</V></A>");
    EXPECT_EQ(TextAt(At(node, u"A"), u"V"), "14");
}

TEST_F(DeepParameters, NameIsLeftToInstances) {
    ResTreeNode& node = Read(" name='r' K='k'", "<A name='a'><B NAME='b'><V>#{name}#{Name}#{K}</V></B></A>");
    EXPECT_EQ(TextAt(At(node, u"a/b"), u"V"), "#{name}#{Name}k");
}

TEST_F(DeepParameters, DocumentRootIsAPathUnlessAnAttributeSaysOtherwise) {
    EXPECT_EQ(TextAt(At(Read("", "<A><V>#{document-root}</V></A>"), u"A"), u"V"), "/");
    root = MakeUnnamedRoot();
    EXPECT_EQ(TextAt(At(Read("", "<A Document-Root='own'><V>#{document-root}</V></A>"), u"A"), u"V"), "own");
    root = MakeUnnamedRoot();
    EXPECT_EQ(TextAt(At(Read("", "<A><V document-ROOT='v'>#{document-root}</V></A>"), u"A"), u"V"), "v");
}

TEST_F(DeepParameters, LoopVariablesAreLeftToInstances) {
    ResTreeNode& node = Read(" i='r' j='r' k='r'",
                             "<A names='P[i=1..2],Q[j=3..3]' I='a'><B><V>#{i}#{J}#{k}</V></B></A><C><V>#{i}</V></C>");
    EXPECT_EQ(TextAt(At(node, u"P1/B"), u"V"), "1#{J}r");
    EXPECT_EQ(TextAt(At(node, u"P2/B"), u"V"), "2#{J}r");
    EXPECT_EQ(TextAt(At(node, u"Q3/B"), u"V"), "#{i}3r");
    EXPECT_EQ(TextAt(At(node, u"C"), u"V"), "r");
}

TEST_F(DeepParameters, LoopVariableOfAnOuterElementOutlivesThatOfAnInnerOne) {
    ResTreeNode& node = Read(" i='r'",
                             "<A names='P[i=1..2]'><B names='Q[i=5..6]'><C><V>#{i}</V></C></B><D><V>#{i}</V></D></A>"
                             "<E><V>#{i}</V></E>");
    EXPECT_EQ(TextAt(At(node, u"P1/Q5/C"), u"V"), "5");
    EXPECT_EQ(TextAt(At(node, u"P2/Q6/C"), u"V"), "6");
    EXPECT_EQ(TextAt(At(node, u"P1/D"), u"V"), "1");
    EXPECT_EQ(TextAt(At(node, u"P2/D"), u"V"), "2");
    EXPECT_EQ(TextAt(At(node, u"E"), u"V"), "r");
}

TEST_F(DeepParameters, LoopVariableMayHideTheDocumentRoot) {
    ResTreeNode& node = Read("", "<A names='P[document-root=1..2]'><B><V>#{ document-root }#{ x }</V></B></A>");
    EXPECT_EQ(TextAt(At(node, u"P2/B"), u"V"), "2#{x}");
    root = MakeUnnamedRoot();
    ResTreeNode& single = Read(" names='R'", "<A names='P[document-root=1..1]'><B><V>#{ x }</V></B></A>");
    EXPECT_EQ(TextAt(At(single, u"P1/B"), u"V"), "#{x}");
}

TEST_F(DeepParameters, ManyQuestionsGetTheSameAnswersAsFew) {
    std::string text;
    std::string expected;
    for (int i = 0; i < 40; ++i) {
        text += "#{K}#{own}#{Own2}#{name}#{x}#{document-root}";
        expected += "k12#{name}#{x}/";
    }
    ResTreeNode& node = Read(" K='k'", "<A K='a'><V own='1' own2='2' K='v' xml:space='preserve'>" + text +
                                           "</V><W own='w'>#{own}#{own2}</W></A>");
    EXPECT_EQ(TextAt(At(node, u"A"), u"V"), expected);
    EXPECT_EQ(TextAt(At(node, u"A"), u"W"), "w#{own2}");
}

TEST_F(DeepParameters, XmlValuesTakeTheirPlaceInTheFrame) {
    ResTreeNode& node = Read("", "<A a='1'><B type='xml' b='2'><i c='3'/><j/></B><V>#{a}#{b}#{c}</V></A>");
    EXPECT_EQ(TextAt(At(node, u"A"), u"B"), "<i c=\"3\"></i><j></j>");
    EXPECT_EQ(TextAt(At(node, u"A"), u"V"), "1#{b}#{c}");
}

TEST_F(DeepParameters, PrototypesAreFilledInFromAllLevels) {
    ResTreeNode& node = Read(" K='k'",
                             "<P><V>#{a}#{b}#{K}#{x}</V></P><A a='1'><B><C b='2' K='no' prototype='../../P'/>"
                             "<D prototype='../../P' b='3'><W>#{b}</W></D></B></A>");
    EXPECT_EQ(TextAt(At(node, u"P"), u"V"), "#{a}#{b}k#{x}");
    EXPECT_EQ(TextAt(At(node, u"A/B/C"), u"V"), "12k#{x}");
    EXPECT_EQ(TextAt(At(node, u"A/B/D"), u"V"), "13k#{x}");
    EXPECT_EQ(TextAt(At(node, u"A/B/D"), u"W"), "3");
}

TEST_F(DeepParameters, TenThousandAttributesAreTenThousandParameters) {
    std::string attributes;
    std::string text;
    std::string expected;
    for (int i = 0; i < 10000; ++i) {
        const std::string number = std::to_string(i);
        attributes += " a" + number + "='" + number + "'";
        text += "#{a" + number + "}";
        expected += number;
    }
    ResTreeNode& node =
        Read("", "<A" + attributes + "><V>" + text + "</V></A><V" + attributes + ">" + text + "</V><W>#{a5}</W>");
    EXPECT_EQ(TextAt(At(node, u"A"), u"V"), expected);
    EXPECT_EQ(TextAt(node, u"V"), expected);
    EXPECT_EQ(TextAt(node, u"W"), "#{a5}");
}

// --- A whole tree ---

TEST(ApplyParameters, ExpandsTextsAtAnyDepthAndNothingElse) {
    auto root = MakeUnnamedRoot();
    Load(*root,
         "<R><T name='#{K}'/><A><V>#{K}</V><L localize='1'>eng=#{K}</L><:Link "
         "name='#{K}l'>../#{K}</:Link><BList><V>#{K}</V><V>#{ J }</V></BList></A></R>");
    ParameterMap values;
    values.emplace(u"K", u"k");
    root->ApplyParameters(MapParameters(std::move(values)));
    EXPECT_EQ("\n" + DumpTree(*root), R"(
R:R
  #{K}:T
  A:A
    #{K}l->../#{K}
    BList:BList ordered
      V=k
      V=#{J}
    L~k{0000}eng=k
    V=k
)");
}

TEST(ApplyParameters, WithoutAnyLeavesTheBlanks) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><V/></R>");
    root->SetProperty(u"V", u"#{ x }");
    root->ApplyParameters(MapParameters(ParameterMap()));
    EXPECT_EQ(TextAt(*root, u"V"), "#{ x }");
}

TEST(ApplyParameters, InstanceHasItsNameAndItsVariable) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><V>#{name} #{i} #{ j }</V></R>");
    root->ApplyInstance(u"n", u"I", -5);
    EXPECT_EQ(TextAt(*root, u"V"), "n -5 #{j}");
}

TEST(ApplyParameters, InstanceWithoutAVariableHasItsNameAlone) {
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><V>#{name} #{i} #{}</V></R>");
    root->ApplyInstance(u"n", u"", 5);
    EXPECT_EQ(TextAt(*root, u"V"), "n #{i} #{}");
}

// --- Observers that change what is being expanded ---

// A root with "count" texts "#{K}" under the keys 1000, 1001, ... and an observer of them, which acts once.
class ExpandedUnderObservers : public ::testing::TestWithParam<std::tuple<bool, int>> {
  protected:
    ExpandedUnderObservers() {
        for (int i = 0; i < Count(); ++i) {
            root->AddTextEntry(Key(i).View(), u"#{K}", TextEntry);
        }
        values.emplace(u"K", u"k");
    }
    ~ExpandedUnderObservers() override { root->RemoveObserver(&observer, -1, true); }

    static int Count() { return std::get<1>(GetParam()); }
    static String Key(int i) { return Wide(std::to_string(1000 + i)); }

    void Once(ResTreeNode& node, std::function<void()> action) {
        node.AddObserver(&observer, PropertyChanged, 0);
        observer.reaction = [action = std::move(action), done = false](ResTreeNode&, uint32_t) mutable {
            if (!std::exchange(done, true)) {
                action();
            }
        };
    }
    void Apply() { root->ApplyParameters(MapParameters(std::move(values))); }

    // How many texts of `node` there are, all of which must have been expanded.
    static int CountExpanded(ResTreeNode& node) {
        int count = 0;
        for (EntryIterator entry = node.Begin(); !entry.IsEnd(); ++entry) {
            if (entry->IsText()) {
                EXPECT_EQ(ExactText(*entry->Text()), "k") << ExactText(entry->Key());
                ++count;
            }
        }
        return count;
    }

    ChangeLog log;
    LoggingObserver observer{log, "o"};
    std::unique_ptr<ResTreeNode> root = MakeRootNode(std::get<0>(GetParam()));
    ParameterMap values;
};

INSTANTIATE_TEST_SUITE_P(BothForms, ExpandedUnderObservers,
                         ::testing::Combine(::testing::Bool(), ::testing::Values(3, 32, 500)), [](const auto& form) {
                             return std::string(std::get<0>(form.param) ? "Ordered" : "Unordered") +
                                    std::to_string(std::get<1>(form.param));
                         });

TEST_P(ExpandedUnderObservers, EntryThatWasJustExpandedMayGo) {
    Once(*root, [this] { root->RemoveEntryByName(Key(0).View()); });
    Apply();
    EXPECT_EQ(CountExpanded(*root), Count() - 1);
}

TEST_P(ExpandedUnderObservers, EveryEntryMayGoWhenItHasBeenExpanded) {
    root->AddObserver(&observer, PropertyChanged, 0);
    observer.reaction = [](ResTreeNode& node, uint32_t) { node.RemoveEntry(node.Begin()); };
    Apply();
    EXPECT_EQ(CountExpanded(*root), 0);
}

TEST_P(ExpandedUnderObservers, NextEntryMayGo) {
    Once(*root, [this] { root->RemoveEntryByName(Key(1).View()); });
    Apply();
    EXPECT_EQ(CountExpanded(*root), Count() - 1);
}

TEST_P(ExpandedUnderObservers, LastEntryMayGoWhileItIsNext) {
    int heard = 0;
    root->AddObserver(&observer, PropertyChanged, 0);
    observer.reaction = [&](ResTreeNode&, uint32_t) {
        if (++heard == Count() - 1) {
            root->RemoveEntryByName(Key(Count() - 1).View());
        }
    };
    Apply();
    EXPECT_EQ(heard, Count() - 1);
    EXPECT_EQ(CountExpanded(*root), Count() - 1);
}

TEST_P(ExpandedUnderObservers, AllEntriesMayGo) {
    Once(*root, [this] {
        while (!root->Begin().IsEnd()) {
            root->RemoveEntry(root->Begin());
        }
    });
    Apply();
    EXPECT_TRUE(root->Begin().IsEnd());
}

TEST_P(ExpandedUnderObservers, EntriesMayComeInFront) {
    Once(*root, [this] {
        const String first = Key(0);
        for (int i = 0; i < 200; ++i) {
            root->AddTextEntry(Wide("0" + std::to_string(1000 + i)).View(), u"k", TextEntry, &first);
        }
    });
    Apply();
    EXPECT_EQ(CountExpanded(*root), Count() + 200);
}

TEST_P(ExpandedUnderObservers, EntriesThatComeBehindAreExpandedToo) {
    Once(*root, [this] {
        for (int i = 0; i < 200; ++i) {
            root->AddTextEntry(Wide("z" + std::to_string(1000 + i)).View(), u"#{K}", TextEntry);
        }
    });
    Apply();
    EXPECT_EQ(CountExpanded(*root), Count() + 200);
}

TEST_P(ExpandedUnderObservers, ChildThatIsBeingWalkedMayGo) {
    ResTreeNode* child = AddChild(*root, u"0child", u"T", std::get<0>(GetParam()));
    AddChild(*root, u"zchild");
    AddText(*root->Lookup(u"zchild", nullptr), u"V", u"#{K}");
    for (int i = 0; i < Count(); ++i) {
        child->AddTextEntry(Key(i).View(), u"#{K}", TextEntry);
    }
    Once(*child, [this] { root->RemoveEntryByName(u"0child"); });
    Apply();
    EXPECT_EQ(root->Lookup(u"0child", nullptr), nullptr);
    EXPECT_EQ(CountExpanded(*root), Count());
    EXPECT_EQ(CountExpanded(*root->Lookup(u"zchild", nullptr)), 1);
}

TEST_P(ExpandedUnderObservers, NodeItselfMayGo) {
    ResTreeNode* child = AddChild(*root, u"child", u"T", std::get<0>(GetParam()));
    for (int i = 0; i < Count(); ++i) {
        child->AddTextEntry(Key(i).View(), u"#{K}", TextEntry);
    }
    Once(*child, [this] { root->RemoveEntryByName(u"child"); });
    child->ApplyParameters(MapParameters(std::move(values)));
    EXPECT_EQ(root->Lookup(u"child", nullptr), nullptr);
}

class ParametersOfFiles : public ResourceFiles {};

TEST_F(ParametersOfFiles, DeferredContentsAreLoadedAndExpanded) {
    Write("board.xml", "<Board><V>#{K}</V></Board>");
    auto root = MakeUnnamedRoot();
    Load(*root, "<R><A><S name='s'/></A></R>");
    At(*root, u"A/s").SetProperty(u":DeferredLoadPath", u"board.xml");
    ParameterMap values;
    values.emplace(u"K", u"k");
    root->ApplyParameters(MapParameters(std::move(values)));
    EXPECT_EQ("\n" + DumpTree(*root), R"(
R:R
  A:A
    s:S
      V=k
)");
}

}  // namespace
}  // namespace zkhw
