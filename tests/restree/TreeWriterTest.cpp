#include "restree/TreeWriter.h"

#include <memory>
#include <new>
#include <string>

#include <gtest/gtest.h>

#include "qn/dsc/osdep/AllocationFault.h"
#include "restree/ResTreeNode.h"
#include "support/ExactText.h"
#include "support/SmallStack.h"
#include "support/TemporaryFolder.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::osdep::ClearAllocationFault;
using qn::dsc::osdep::FailAllocation;
using qn::dsc::osdep::RunOnSmallStack;
using qn::dsc::osdep::TemporaryFolder;

using Node = std::unique_ptr<ResTreeNode>;

Node MakeNode(std::u16string_view name, std::u16string_view type, bool ordered = false) {
    return std::make_unique<ResTreeNode>(name, type, ordered);
}

ResTreeNode& AddChild(ResTreeNode& parent, std::u16string_view name, std::u16string_view type, bool ordered = false) {
    ResTreeNode* child = nullptr;
    EXPECT_TRUE(parent.AddChildEntry(name, type, ordered, child).isNew);
    return *child;
}

void AddText(ResTreeNode& node, const char16_t* key, std::u16string_view value, EntryKind kind = TextEntry) {
    EXPECT_TRUE(node.AddTextEntry(key, value, kind).isNew);
}

void AddLink(ResTreeNode& node, const char16_t* key, const char16_t* path) {
    EXPECT_TRUE(node.AddLinkEntry(key, path).isNew);
}

std::string Written(ResTreeNode& node, std::u16string_view indent = u"") {
    String out;
    WriteNode(node, out, indent);
    return ExactText(out);
}

std::string WrittenProperty(ResTreeNode& node, std::u16string_view key, const String* type = nullptr,
                            const String* fallback = nullptr) {
    String out;
    WriteProperty(node, out, key, u"   ", type, fallback);
    return ExactText(out);
}

TEST(TreeWriter, NodeNamedAsItsTypeHasNoNameAttribute) {
    EXPECT_EQ(Written(*MakeNode(u"Target", u"Target")), "\n<Target>\n</Target>");
}

TEST(TreeWriter, NameThatDiffersFromTheTypeInCaseAloneIsNotWritten) {
    EXPECT_EQ(Written(*MakeNode(u"Target", u"target")), "\n<target>\n</target>");
}

TEST(TreeWriter, NameThatDiffersFromTheTypeIsAnAttribute) {
    EXPECT_EQ(Written(*MakeNode(u"BoardOne", u"Target")), "\n<Target name=\"BoardOne\">\n</Target>");
}

TEST(TreeWriter, EmptyNameIsAnAttribute) {
    EXPECT_EQ(Written(*MakeNode(u"", u"Root")), "\n<Root name=\"\">\n</Root>");
}

TEST(TreeWriter, NameIsEscapedWithItsQuotes) {
    EXPECT_EQ(Written(*MakeNode(u"a&<>'\"b", u"T")), "\n<T name=\"a&amp;&lt;&gt;&apos;&quot;b\">\n</T>");
}

TEST(TreeWriter, OrderedNodeOfAListTypeIsNotMarked) {
    EXPECT_EQ(Written(*MakeNode(u"ResourceList", u"ResourceList", true)), "\n<ResourceList>\n</ResourceList>");
    EXPECT_EQ(Written(*MakeNode(u"FooLIST", u"FooLIST", true)), "\n<FooLIST>\n</FooLIST>");
}

TEST(TreeWriter, OrderedNodeOfAnotherTypeIsMarked) {
    EXPECT_EQ(Written(*MakeNode(u"Foo", u"Foo", true)), "\n<Foo ordered=\"true\">\n</Foo>");
}

TEST(TreeWriter, OrderedAttributeStandsBehindTheName) {
    EXPECT_EQ(Written(*MakeNode(u"B", u"Target", true)), "\n<Target name=\"B\" ordered=\"true\">\n</Target>");
}

TEST(TreeWriter, UnorderedNodeOfAListTypeIsNotMarked) {
    EXPECT_EQ(Written(*MakeNode(u"ResourceList", u"ResourceList")), "\n<ResourceList>\n</ResourceList>");
}

TEST(TreeWriter, TypeThatHasListInItsMiddleIsMarked) {
    EXPECT_EQ(Written(*MakeNode(u"Lists", u"Lists", true)), "\n<Lists ordered=\"true\">\n</Lists>");
}

TEST(TreeWriter, TextStandsEscapedInItsElement) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"Key", u"a < b & \"c\" > 'd'");
    EXPECT_EQ(Written(*node), "\n<N>\n   <Key>a &lt; b &amp; &quot;c&quot; &gt; &apos;d&apos;</Key>\n</N>");
}

TEST(TreeWriter, OtherCharactersOfATextAreLeftAlone) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", std::u16string_view(u"\x01\t\n\u20AC\0x", 6));
    EXPECT_EQ(Written(*node), "\n<N>\n   <K>\x01\t\n{20AC}{0000}x</K>\n</N>");
}

TEST(TreeWriter, KeyOfATextIsNotEscaped) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"a&b", u"");
    EXPECT_EQ(Written(*node), "\n<N>\n   <a&b></a&b>\n</N>");
}

TEST(TreeWriter, LocalisedTextGivesTheListBehindItsNul) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", std::u16string_view(u"Clock\0eng=Clock,jpn=X", 21), LocalizedTextEntry);
    EXPECT_EQ(Written(*node), "\n<N>\n   <K localize=\"true\">eng=Clock,jpn=X</K>\n</N>");
}

TEST(TreeWriter, LocalisedTextIsCutAtItsFirstNulOnly) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", std::u16string_view(u"A\0b\0c", 5), LocalizedTextEntry);
    EXPECT_EQ(Written(*node), "\n<N>\n   <K localize=\"true\">b{0000}c</K>\n</N>");
}

TEST(TreeWriter, LocalisedTextWithoutANulIsWrittenWhole) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", u"fra=X", LocalizedTextEntry);
    EXPECT_EQ(Written(*node), "\n<N>\n   <K localize=\"true\">fra=X</K>\n</N>");
}

TEST(TreeWriter, LocalisedTextThatEndsInItsNulIsWrittenWhole) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", std::u16string_view(u"A\0", 2), LocalizedTextEntry);
    EXPECT_EQ(Written(*node), "\n<N>\n   <K localize=\"true\">A{0000}</K>\n</N>");
}

TEST(TreeWriter, PlainTextWithANulIsWrittenWhole) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", std::u16string_view(u"A\0eng=A", 7));
    EXPECT_EQ(Written(*node), "\n<N>\n   <K>A{0000}eng=A</K>\n</N>");
}

TEST(TreeWriter, LinkHasTwoBlanksAndNoEscapes) {
    const Node node = MakeNode(u"N", u"N");
    AddLink(*node, u"a&\"b", u"../c&d<e");
    EXPECT_EQ(Written(*node), "\n<N>\n   <:Link  name=\"a&\"b\">../c&d<e</:Link>\n</N>");
}

TEST(TreeWriter, ChildStandsUnderItsOwnNameAndNotUnderItsKey) {
    const Node node = MakeNode(u"N", u"N");
    AddChild(*node, u"Own", u"T");
    ASSERT_TRUE(node->RenameEntry(u"Own", u"Key"));
    EXPECT_EQ(Written(*node), "\n<N>\n   <T name=\"Own\">\n   </T>\n</N>");
}

TEST(TreeWriter, EachLevelAddsThreeBlanksToTheIndent) {
    const Node node = MakeNode(u"A", u"A");
    ResTreeNode& b = AddChild(*node, u"B", u"B");
    ResTreeNode& c = AddChild(b, u"C", u"C");
    AddText(c, u"K", u"v");
    EXPECT_EQ(Written(*node, u"> "),
              "\n> <A>\n>    <B>\n>       <C>\n>          <K>v</K>\n>       </C>\n>    </B>\n> </A>");
}

TEST(TreeWriter, UnorderedNodeIsWrittenInTheOrderOfItsKeys) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"c", u"3");
    AddChild(*node, u"B", u"T");
    AddText(*node, u"a", u"1");
    EXPECT_EQ(Written(*node), "\n<N>\n   <a>1</a>\n   <T name=\"B\">\n   </T>\n   <c>3</c>\n</N>");
}

TEST(TreeWriter, OrderedNodeIsWrittenInTheOrderOfInsertion) {
    const Node node = MakeNode(u"L", u"List", true);
    AddText(*node, u"c", u"3");
    AddLink(*node, u"b", u"..");
    AddText(*node, u"C", u"4");
    AddText(*node, u"a", u"1");
    EXPECT_EQ(Written(*node),
              "\n<List name=\"L\">\n   <c>3</c>\n   <:Link  name=\"b\">..</:Link>\n   <C>4</C>\n   <a>1</a>\n</List>");
}

TEST(TreeWriter, ProtocolsStandsBehindTheTagAndAgainInItsPlace) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"Alpha", u"1");
    AddText(*node, u"Protocols", u"P,Q");
    AddText(*node, u"Zeta", u"2");
    EXPECT_EQ(Written(*node),
              "\n<N>\n   <Protocols>P,Q</Protocols>\n   <Alpha>1</Alpha>\n   <Protocols>P,Q</Protocols>\n"
              "   <Zeta>2</Zeta>\n</N>");
}

TEST(TreeWriter, ProtocolsThatIsANodeStandsTwiceAtEveryLevel) {
    const Node node = MakeNode(u"N", u"N");
    ResTreeNode& outer = AddChild(*node, u"Protocols", u"O");
    AddChild(outer, u"Protocols", u"I");
    const std::string inner = "\n      <I name=\"Protocols\">\n      </I>";
    const std::string block = "\n   <O name=\"Protocols\">" + inner + inner + "\n   </O>";
    EXPECT_EQ(Written(*node), "\n<N>" + block + block + "\n</N>");
}

TEST(TreeWriter, OpenTagWritesProtocolsWhateverItsKind) {
    const Node link = MakeNode(u"N", u"N");
    AddLink(*link, u"protocols", u"../x");
    String out;
    WriteOpenTag(*link, out, u"   ", true);
    EXPECT_EQ(ExactText(out), "\n   <N>\n      <:Link  name=\"protocols\">../x</:Link>");

    const Node child = MakeNode(u"N", u"N");
    AddText(AddChild(*child, u"Protocols", u"P"), u"K", u"v");
    out = u"";
    WriteOpenTag(*child, out, u"", true);
    EXPECT_EQ(ExactText(out), "\n<N>\n   <P name=\"Protocols\">\n      <K>v</K>\n   </P>");
}

TEST(TreeWriter, OpenTagCanStandInForMissingProtocols) {
    const Node node = MakeNode(u"N", u"N");
    String out;
    WriteOpenTag(*node, out, u"   ", true);
    EXPECT_EQ(ExactText(out), "\n   <N>\n      <Protocols></Protocols>");
}

TEST(TreeWriter, OpenTagWithoutDefaultLeavesMissingProtocolsOut) {
    const Node node = MakeNode(u"N", u"N");
    String out;
    WriteOpenTag(*node, out, u"   ", false);
    EXPECT_EQ(ExactText(out), "\n   <N>");
}

TEST(TreeWriter, CloseTagHasALineOfItsOwn) {
    const Node node = MakeNode(u"Name", u"Type");
    String out(u"x");
    WriteCloseTag(*node, out, u"  ");
    EXPECT_EQ(ExactText(out), "x\n  </Type>");
}

TEST(TreeWriter, EntriesStandOneLevelDeeperThanTheIndent) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", u"v");
    AddText(AddChild(*node, u"M", u"M"), u"L", u"w");
    String out;
    WriteEntries(*node, out, u"-");
    EXPECT_EQ(ExactText(out), "\n-   <K>v</K>\n-   <M>\n-      <L>w</L>\n-   </M>");
}

TEST(TreeWriter, EntriesDoNotRepeatProtocols) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"Protocols", u"P");
    String out;
    WriteEntries(*node, out, u"");
    EXPECT_EQ(ExactText(out), "\n   <Protocols>P</Protocols>");
}

TEST(TreeWriter, EveryOperationAppends) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", u"v");
    String out(u"<?xml version=\"1.0\"?>");
    WriteNode(*node, out, u"");
    WriteNode(*node, out, u"");
    EXPECT_EQ(ExactText(out), "<?xml version=\"1.0\"?>\n<N>\n   <K>v</K>\n</N>\n<N>\n   <K>v</K>\n</N>");
}

TEST(TreeWriter, PropertyStandsAtTheIndentItself) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", u"v");
    EXPECT_EQ(WrittenProperty(*node, u"K"), "\n   <K>v</K>");
}

TEST(TreeWriter, PropertyKeepsTheLetterCaseOfTheStoredKey) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"DeviceIDs", u"7");
    EXPECT_EQ(WrittenProperty(*node, u"DEVICEids"), "\n   <DeviceIDs>7</DeviceIDs>");
}

TEST(TreeWriter, MissingPropertyIsWrittenFromItsFallback) {
    const Node node = MakeNode(u"N", u"N");
    const String empty;
    const String fallback(u"a&b");
    EXPECT_EQ(WrittenProperty(*node, u"Missing", nullptr, &empty), "\n   <Missing></Missing>");
    EXPECT_EQ(WrittenProperty(*node, u"Missing", nullptr, &fallback), "\n   <Missing>a&amp;b</Missing>");
}

TEST(TreeWriter, MissingPropertyWithoutAFallbackAddsNothing) {
    EXPECT_EQ(WrittenProperty(*MakeNode(u"N", u"N"), u"Missing"), "");
}

TEST(TreeWriter, FallbackOfAPropertyThatIsThereIsNotUsed) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", u"v");
    const String fallback(u"other");
    EXPECT_EQ(WrittenProperty(*node, u"K", nullptr, &fallback), "\n   <K>v</K>");
}

TEST(TreeWriter, PropertyTakesTheFormOfItsKind) {
    const Node node = MakeNode(u"N", u"N");
    AddLink(*node, u"L", u"../t");
    AddText(*node, u"T", std::u16string_view(u"A\0eng=A", 7), LocalizedTextEntry);
    AddChild(*node, u"C", u"D");
    EXPECT_EQ(WrittenProperty(*node, u"L"), "\n   <:Link  name=\"L\">../t</:Link>");
    EXPECT_EQ(WrittenProperty(*node, u"T"), "\n   <T localize=\"true\">eng=A</T>");
    EXPECT_EQ(WrittenProperty(*node, u"C"), "\n   <D name=\"C\">\n   </D>");
}

TEST(TreeWriter, TypeIsAnAttributeOfATextElementAlone) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"T", u"v");
    AddLink(*node, u"L", u"x");
    AddChild(*node, u"C", u"C");
    const String type(u"path");
    const String empty;
    EXPECT_EQ(WrittenProperty(*node, u"T", &type), "\n   <T type=\"path\">v</T>");
    EXPECT_EQ(WrittenProperty(*node, u"M", &type, &empty), "\n   <M type=\"path\"></M>");
    EXPECT_EQ(WrittenProperty(*node, u"L", &type), "\n   <:Link  name=\"L\">x</:Link>");
    EXPECT_EQ(WrittenProperty(*node, u"C", &type), "\n   <C>\n   </C>");
}

TEST(TreeWriter, TypeStandsBeforeLocalizeAndIsNotEscaped) {
    String out;
    const String type(u"a&b");
    WriteTextElement(out, u"K", u"v", u"", &type, true);
    EXPECT_EQ(ExactText(out), "\n<K type=\"a&b\" localize=\"true\">v</K>");
}

TEST(TreeWriter, EntryIsWrittenUnderTheKeyThatIsGiven) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"K", u"v");
    String out;
    WriteEntry(*node->Find(u"K"), out, u"Other", u" ", nullptr);
    EXPECT_EQ(ExactText(out), "\n <Other>v</Other>");
}

class TreeWriterLoad : public testing::Test {
  protected:
    // A child of `parent` whose contents stand in a file.
    ResTreeNode& AddStub(ResTreeNode& parent, const char16_t* name, const char* contents) {
        const std::string file = ExactText(String(name)) + ".xml";
        folder.WriteFile(file, "<T>" + std::string(contents) + "</T>");
        ResTreeNode& stub = AddChild(parent, name, u"T");
        AddText(stub, u":DeferredLoadPath", folder.System(String(file.c_str()).CStr()).View());
        return stub;
    }

    TemporaryFolder folder;
};

TEST_F(TreeWriterLoad, NodeIsLoadedBeforeItsEntriesAreWritten) {
    const Node root = MakeNode(u"R", u"R");
    AddStub(*root, u"S", "<K>v</K>");
    EXPECT_EQ(Written(*root), "\n<R>\n   <T name=\"S\">\n      <K>v</K>\n   </T>\n</R>");
}

TEST_F(TreeWriterLoad, ProtocolsOfALoadedNodeStandsOnceBecauseTheTagComesFirst) {
    const Node root = MakeNode(u"R", u"R");
    AddStub(*root, u"S", "<Protocols>P</Protocols>");
    EXPECT_EQ(Written(*root), "\n<R>\n   <T name=\"S\">\n      <Protocols>P</Protocols>\n   </T>\n</R>");
}

TEST_F(TreeWriterLoad, TagAndPropertyLoadNothing) {
    const Node root = MakeNode(u"R", u"R");
    ResTreeNode& stub = AddStub(*root, u"S", "<K>v</K><Protocols>P</Protocols>");
    String out;
    WriteOpenTag(stub, out, u"", true);
    WriteProperty(stub, out, u"K", u"", nullptr, nullptr);
    WriteCloseTag(stub, out, u"");
    EXPECT_EQ(ExactText(out), "\n<T name=\"S\">\n   <Protocols></Protocols>\n</T>");
    EXPECT_NE(stub.FindRaw(u":DeferredLoadPath"), nullptr);
}

// Removes an entry of `node` when it hears of a change.
class Remover : public ResTreeNodeChangeObserver {
  public:
    Remover(ResTreeNode& parent, std::u16string_view entry) : node(parent), key(entry) {}
    void OnNodeChanged(ResTreeNode*, uint32_t, int32_t) override { node.RemoveEntryByName(key.View()); }

  private:
    ResTreeNode& node;
    String key;
};

TEST_F(TreeWriterLoad, SiblingThatGoesDuringALoadIsNotWritten) {
    const Node root = MakeNode(u"R", u"R");
    ResTreeNode& stub = AddStub(*root, u"A", "<K>v</K>");
    AddChild(*root, u"B", u"T");
    Remover remover(*root, u"B");
    stub.AddObserver(&remover, PropertyAdded, 7);
    EXPECT_EQ(Written(*root), "\n<R>\n   <T name=\"A\">\n      <K>v</K>\n   </T>\n</R>");
    stub.RemoveObserver(&remover, 7, false);
}

TEST_F(TreeWriterLoad, NodeThatGoesDuringItsOwnLoadIsClosedAndTheWalkGoesOn) {
    const Node root = MakeNode(u"R", u"R", true);
    ResTreeNode& stub = AddStub(*root, u"A", "<K>v</K>");
    AddChild(*root, u"B", u"T");
    AddChild(*root, u"C", u"T");
    Remover remover(*root, u"A");
    stub.AddObserver(&remover, PropertyAdded, 7);
    const std::string text = Written(*root);
    // The positions behind A have moved up by one, so B, which now stands in its place, is passed over.
    EXPECT_EQ(text, "\n<R ordered=\"true\">\n   <T name=\"A\">\n   </T>\n   <T name=\"C\">\n   </T>\n</R>");
    EXPECT_EQ(root->Find(u"A"), nullptr);
}

TEST_F(TreeWriterLoad, ManySiblingsMayGoDuringALoad) {
    const Node root = MakeNode(u"R", u"R", true);
    for (int i = 0; i < 300; ++i) {
        AddText(*root, u"Before", u"1");
    }
    ResTreeNode& stub = AddStub(*root, u"S", "<K>v</K>");
    struct RemoveTexts : ResTreeNodeChangeObserver {
        explicit RemoveTexts(ResTreeNode& parent) : node(parent) {}
        void OnNodeChanged(ResTreeNode*, uint32_t, int32_t) override {
            while (node.FindRaw(u"Before") != nullptr) {
                node.RemoveEntryByName(u"Before");
            }
        }
        ResTreeNode& node;
    } remover(*root);
    stub.AddObserver(&remover, PropertyAdded, 7);
    EXPECT_TRUE(Written(*root).ends_with("</Before>\n   <T name=\"S\">\n      <K>v</K>\n   </T>\n</R>"));
    stub.RemoveObserver(&remover, 7, false);
}

TEST(TreeWriter, DepthTakesNoStack) {
    // The indent alone makes the text of n levels 3 * n * n units long, which bounds the depth of what can be written.
    constexpr uint32_t depth = 4000;
    const Node root = MakeNode(u"D", u"D");
    ResTreeNode* node = root.get();
    for (uint32_t i = 1; i < depth; ++i) {
        node = &AddChild(*node, u"D", u"D");
    }
    String out;
    RunOnSmallStack([&] { WriteNode(*root, out, u""); });
    // "\n<D>" and "\n</D>", and the indents of both.
    EXPECT_EQ(out.Length(), depth * 9 + 2 * 3 * (depth - 1) * depth / 2);
    EXPECT_EQ(ExactText(out.Substring(0, 19)), "\n<D>\n   <D>\n      <");
}

TEST(TreeWriter, WideNodeIsWrittenToItsLastEntry) {
    const Node root = MakeNode(u"R", u"R", true);
    for (int i = 0; i < 100000; ++i) {
        AddText(*root, u"K", u"v");
    }
    String out;
    WriteNode(*root, out, u"");
    const std::string frame = "\n<R ordered=\"true\">\n</R>";
    const std::string entry = "\n   <K>v</K>";
    EXPECT_EQ(out.Length(), frame.size() + 100000 * entry.size());
}

TEST(TreeWriter, NoMemoryLeavesWhatCameBefore) {
    const Node node = MakeNode(u"N", u"N");
    AddText(*node, u"A", u"1");
    AddText(*node, u"B", String(1000, u'x').View());
    String out;
    out.Reserve(100);
    FailAllocation(1, true);
    EXPECT_THROW(WriteNode(*node, out, u""), std::bad_alloc);
    ClearAllocationFault();
    EXPECT_EQ(ExactText(out), "\n<N>\n   <A>1</A>\n   <B>");
}

// What `text` says as a node of its own, written again.
std::string ReadAndWritten(const std::string& text) {
    const Node root = MakeNode(u"", u"Root");
    ResTreeNode* node = nullptr;
    EXPECT_EQ(root->LoadResourceText(String(text.c_str()), true, &node), 0);
    if (node == nullptr) {
        return "nothing";
    }
    return Written(*node);
}

TEST(TreeWriter, WrittenTreeReadsBackAsItWas) {
    const Node root = MakeNode(u"Board & Co", u"Target", true);
    AddText(*root, u"Zeta", u" < & > ' \" ");
    ResTreeNode& list = AddChild(*root, u"L", u"ResourceList", true);
    AddText(list, u"K", u"2");
    AddText(list, u"K", u"1");
    AddText(*root, u"Name", std::u16string_view(u"Clock\0eng=Clock,jpn=X", 21), LocalizedTextEntry);
    AddLink(*root, u"Here", u"L");
    AddChild(*root, u"Empty", u"Thing");
    const std::string text = Written(*root);
    EXPECT_EQ(ReadAndWritten(text),
              "\n<Target name=\"Board &amp; Co\" ordered=\"true\">\n"
              // The reader takes blanks from both ends of a text.
              "   <Zeta>&lt; &amp; &gt; &apos; &quot;</Zeta>\n"
              "   <ResourceList name=\"L\">\n      <K>2</K>\n      <K>1</K>\n   </ResourceList>\n"
              "   <Name localize=\"true\">eng=Clock,jpn=X</Name>\n"
              "   <:Link  name=\"Here\">L</:Link>\n"
              "   <Thing name=\"Empty\">\n   </Thing>\n</Target>");
}

TEST(TreeWriter, DoubledProtocolsOfAnUnorderedNodeReadsBackAsOne) {
    const Node root = MakeNode(u"N", u"N");
    AddText(*root, u"Protocols", u"P");
    EXPECT_EQ(ReadAndWritten(Written(*root)), Written(*root));
}

TEST(TreeWriter, UnorderedNodeOfAListTypeComesBackOrdered) {
    const Node root = MakeNode(u"L", u"FooList");
    AddText(*root, u"K", u"v");
    ASSERT_FALSE(root->IsOrdered());
    const Node parent = MakeNode(u"", u"Root");
    ResTreeNode* node = nullptr;
    ASSERT_EQ(parent->LoadResourceText(String(Written(*root).c_str()), true, &node), 0);
    ASSERT_NE(node, nullptr);
    EXPECT_TRUE(node->IsOrdered());
}

TEST(TreeWriter, EmptyNodeNamedAsItsTypeComesBackAsAText) {
    const Node root = MakeNode(u"R", u"R");
    AddChild(*root, u"Empty", u"Empty");
    EXPECT_EQ(Written(*root), "\n<R>\n   <Empty>\n   </Empty>\n</R>");
    EXPECT_EQ(ReadAndWritten(Written(*root)), "\n<R>\n   <Empty></Empty>\n</R>");
}

TEST(TreeWriter, LinkWithAnAmpersandDoesNotReadBack) {
    const Node root = MakeNode(u"R", u"R");
    AddLink(*root, u"a&b", u"..");
    const Node parent = MakeNode(u"", u"Root");
    EXPECT_LT(parent->LoadResourceText(String(Written(*root).c_str()), true, nullptr), 0);
}

}  // namespace
}  // namespace zkhw
