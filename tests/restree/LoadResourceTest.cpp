// The load operations: what they give, how files reach the parser, and when observers hear of a load.

#include <memory>
#include <new>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "restree/LoadChain.h"
#include "restree/ParseStack.h"
#include "restree/ReadTree.h"
#include "support/AllocationFaultScope.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::FileCall;

// --- What a load of text gives ---

TEST(LoadResourceText, GivesTheNodeItself) {
    auto root = MakeUnnamedRoot();
    ResTreeNode* node = nullptr;
    EXPECT_EQ(root->LoadResourceText(u"<A/>", false, &node), 0);
    EXPECT_EQ(node, root.get());
}

TEST(LoadResourceText, GivesTheNodeItselfAlsoForAnEmptyDocumentElement) {
    auto root = MakeRoot();
    ResTreeNode* node = nullptr;
    EXPECT_EQ(root->LoadResourceText(u"<A name='x'/>", false, &node), 0);
    EXPECT_EQ(node, root.get());
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST(LoadResourceText, GivesTheChild) {
    auto root = MakeRoot();
    ResTreeNode* node = nullptr;
    EXPECT_EQ(root->LoadResourceText(u"<A name='x'><B name='y'/></A>", true, &node), 0);
    EXPECT_EQ(node, &At(*root, u"x"));
}

TEST(LoadResourceText, GivesTheChildThatWasThere) {
    auto root = MakeRoot();
    LoadChild(*root, "<A name='x'/>");
    ResTreeNode* const before = &At(*root, u"x");
    ResTreeNode* node = nullptr;
    EXPECT_EQ(root->LoadResourceText(u"<A name='x'/>", true, &node), 0);
    EXPECT_EQ(node, before);
}

TEST(LoadResourceText, GivesTheNewChildOfAnOrderedNode) {
    ResTreeNode root(u"Root", u"Root", true);
    for (int count = 0; count < 3; ++count) {
        ResTreeNode* node = nullptr;
        EXPECT_EQ(root.LoadResourceText(u"<A name='x'/>", true, &node), 0);
        EXPECT_EQ(root.Entries().Size(), static_cast<uint32_t>(count) + 1);
        EXPECT_EQ(node, root.Entries().At(root.Entries().Last())->Child());
    }
}

TEST(LoadResourceText, GivesTheFirstOfSeveralInstances) {
    auto root = MakeRoot();
    ResTreeNode* node = nullptr;
    EXPECT_EQ(root->LoadResourceText(u"<A names='x,y'/>", true, &node), 0);
    EXPECT_EQ(node, &At(*root, u"x"));
}

TEST(LoadResourceText, GivesNoChildForAValue) {
    auto root = MakeRoot();
    ResTreeNode* node = root.get();
    EXPECT_EQ(root->LoadResourceText(u"<A>text</A>", true, &node), 0);
    EXPECT_EQ(node, nullptr);
    EXPECT_EQ(TextAt(*root, u"A"), "text");
}

TEST(LoadResourceText, GivesTheNodeItselfForAValueThatStandsForIt) {
    auto root = MakeRoot();
    ResTreeNode* node = nullptr;
    EXPECT_EQ(root->LoadResourceText(u"<A>text</A>", false, &node), 0);
    EXPECT_EQ(node, root.get());
}

TEST(LoadResourceText, AsChildOfANodeWithoutATypeStandsForTheNode) {
    auto root = MakeUnnamedRoot();
    ResTreeNode* node = nullptr;
    EXPECT_EQ(root->LoadResourceText(u"<AList name='x'><V>1</V></AList>", true, &node), 0);
    EXPECT_EQ(node, root.get());
    EXPECT_EQ(DumpTree(*root), "x:AList ordered\n  V=1\n");
}

TEST(LoadResourceText, ThatFailsGivesNoNode) {
    for (const bool asChild : {false, true}) {
        for (const char16_t* xml : {u"", u"<A", u"<A name='x'><B/></A", u"<A name='x'/>junk"}) {
            auto root = MakeRoot();
            ResTreeNode* node = root.get();
            EXPECT_EQ(root->LoadResourceText(xml, asChild, &node), loadFailed);
            EXPECT_EQ(node, nullptr);
        }
    }
}

TEST(LoadResourceText, WorksWithoutAPlaceForTheNode) {
    auto root = MakeRoot();
    EXPECT_EQ(root->LoadResourceText(u"<A name='x'/>", true, nullptr), 0);
    EXPECT_EQ(root->LoadResourceText(u"<A name='x'", true, nullptr), loadFailed);
}

// --- Observers ---

struct Delivery : ResTreeNodeChangeObserver {
    void OnNodeChanged(ResTreeNode* node, uint32_t changes, int32_t) override {
        deliveries.push_back(qn::dsc::ExactText(node->GetName()) + " " + std::to_string(changes));
    }
    std::vector<std::string> deliveries;
};

TEST(LoadResourceText, DeliversItsChangesInOneGo) {
    auto root = MakeRoot();
    Load(*root, "<R><V>0</V></R>");
    Delivery observer;
    root->AddObserver(&observer, 0xFFFF, 0);
    Load(*root, "<R><V>1</V><W>2</W><C name='c'/><C name='d'/></R>");
    EXPECT_EQ(observer.deliveries,
              std::vector<std::string>{"Root " + std::to_string(PropertyChanged | PropertyAdded | ChildAdded)});
    EXPECT_TRUE(root->HasNoPendingChanges());
    root->RemoveObserver(&observer, -1, false);
}

TEST(LoadResourceText, DeliversThatAReportWasMade) {
    auto root = MakeRoot();
    Delivery observer;
    root->AddObserver(&observer, 0xFFFF, 0);
    EXPECT_EQ(root->LoadResourceText(u"<A>", false, nullptr), loadFailed);
    EXPECT_EQ(root->LoadResourceText(u"<A>", false, nullptr), loadFailed);
    EXPECT_EQ(observer.deliveries, (std::vector<std::string>{"Root " + std::to_string(PropertyAdded),
                                                             "Root " + std::to_string(PropertyChanged)}));
    root->RemoveObserver(&observer, -1, false);
}

TEST(LoadResourceText, InsideABracketWaitsForItsEnd) {
    auto root = MakeRoot();
    Delivery observer;
    root->AddObserver(&observer, 0xFFFF, 0);
    const uint32_t saved = root->BeginChanges();
    Load(*root, "<R><V>1</V></R>");
    EXPECT_TRUE(observer.deliveries.empty());
    root->EndChanges(saved, false);
    EXPECT_EQ(observer.deliveries, std::vector<std::string>{"Root " + std::to_string(PropertyAdded)});
    root->RemoveObserver(&observer, -1, false);
}

// --- No memory ---

TEST(LoadResourceText, WithoutMemoryLeavesATreeThatWorks) {
    const String xml(
        u"<R K='k'><P><V>#{K}</V><T localize='1'>eng=a,jpn=b</T></P><X names='a,b[i=1..2]'><V>#{name}#{i}</V></X>"
        u"<Q prototype='P'/><:Link name='l'>P</:Link><:Link>none</:Link><S type='xml'><i "
        u"x='1'/></S><AList><V/><V/></AList></R>");
    bool wasRefused = false;
    bool isDone = false;
    for (uint64_t nth = 1; !isDone; ++nth) {
        auto root = MakeRoot();
        Delivery observer;
        root->AddObserver(&observer, PropertyAdded, 0);
        int32_t result = -1;
        try {
            const support::AllocationFaultScope faults(nth);
            result = root->LoadResourceText(xml, true, nullptr);
        } catch (const std::bad_alloc&) {
            result = -1;
        }
        // Without a parser nothing is thrown and nothing reported.
        wasRefused |= result == loadFailed && Errors(*root) == "(none)";
        isDone = result == 0;
        // Notices are not held back any more, and a further load works.
        observer.deliveries.clear();
        EXPECT_TRUE(root->SetProperty(u"Afterwards", u"1"));
        EXPECT_EQ(observer.deliveries.size(), 1u) << nth;
        EXPECT_EQ(root->LoadResourceText(u"<Z name='z'/>", true, nullptr), 0);
        root->RemoveObserver(&observer, -1, false);
        ASSERT_LT(nth, 100000u);
    }
    EXPECT_TRUE(wasRefused);
}

TEST(LoadResourceText, ForgetsItsParametersWithoutMemory) {
    // So many questions that the open attributes and loop variables are known by name when memory runs out for good.
    const String xml(
        u"<R K='k'><P><V>#{a}#{b}#{K}#{i}#{e}#{f}#{g}#{h}#{j}#{l}#{m}#{n}#{o}#{p}#{q}#{r}#{s}#{t}#{u}#{v}</V></P>"
        u"<X names='x[i=1..2]' c='3'><Q prototype='../P' a='1' b='2' A='3'/></X></R>");
    bool isDone = false;
    for (uint64_t nth = 1; !isDone; ++nth) {
        auto root = MakeRoot();
        try {
            const support::AllocationFaultScope faults(nth, true);
            isDone = root->LoadResourceText(xml, true, nullptr) == 0;
        } catch (const std::bad_alloc&) {
            isDone = false;
        }
        EXPECT_EQ(root->LoadResourceText(u"<Z name='z'/>", true, nullptr), 0) << nth;
        EXPECT_NE(root->FindRaw(u"z"), nullptr) << nth;
        ASSERT_LT(nth, 100000u);
    }
}

// --- Files ---

class LoadResourceFile : public ResourceFiles {
  protected:
    // The text of the one value in a document with these bytes.
    std::string ValueIn(const std::string& bytes) {
        Write("f.xml", bytes);
        auto root = MakeUnnamedRoot();
        EXPECT_EQ(root->LoadResourceFile(PathOf(u"f.xml"), false, nullptr), 0) << Errors(*root);
        return TextAt(*root, u"V");
    }

    // Loads each of the files into a tree of its own.
    void ExpectThatNoneLoads(const std::vector<const char16_t*>& names) {
        for (const char16_t* name : names) {
            auto root = MakeRoot();
            root->SetProperty(u"XMLParseErrors", u"as it was");
            ResTreeNode* node = root.get();
            EXPECT_EQ(root->LoadResourceFile(PathOf(name), true, &node), loadFailed);
            EXPECT_EQ(node, nullptr);
            EXPECT_EQ(DumpTree(*root), "Root:Root\n  XMLParseErrors=as it was\n") << Shown(name);
        }
        EXPECT_EQ(files.OpenFiles(), 0);
    }
};

TEST_F(LoadResourceFile, ReadsAsTextDoes) {
    Write("f.xml", "<A name='x'><V>1</V></A>");
    auto root = MakeRoot();
    ResTreeNode* node = nullptr;
    EXPECT_EQ(root->LoadResourceFile(PathOf(u"f.xml"), true, &node), 0);
    EXPECT_EQ(node, &At(*root, u"x"));
    EXPECT_EQ(root->LoadResourceFile(PathOf(u"f.xml"), false, &node), 0);
    EXPECT_EQ(node, root.get());
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  V=1
  x:A
    V=1
)");
}

TEST_F(LoadResourceFile, ThatCannotBeOpenedLeavesTheTreeAlone) {
    folder.MakeFolder("sub");
    Write("secret.xml", "<A/>");
    files.FailOnPath(FileCall::OpenText, folder.System(u"secret.xml"), EACCES);
    ExpectThatNoneLoads(
        {u"missing.xml", u"sub", u"sub\\", u"secret.xml", u"secret.xml\\", u"secret.xml\\x", u"no\\such\\folder.xml"});
}

// Windows has no pipes in folders, and Wine doesn't show links that lead nowhere or in a circle.
TEST_F(LoadResourceFile, ThatIsAPipeOrLeadsNowhereLeavesTheTreeAloneAsOnlyLinuxHasThem) {
    folder.MakePipe("pipe");
    folder.MakeLink("nowhere", "dangling");
    folder.MakeLink("loop2", "loop1");
    folder.MakeLink("loop1", "loop2");
    ExpectThatNoneLoads({u"pipe", u"dangling", u"loop1"});
}

TEST_F(LoadResourceFile, OtherDrivesAndDevicesCannotBeOpened) {
    auto root = MakeRoot();
    for (const char* path : {"D:\\f.xml", "\\\\server\\share\\f.xml", "C:\\dev\\null", "C:\\dev\\zero", ""}) {
        EXPECT_EQ(root->LoadResourceFile(NarrowString(path), false, nullptr), loadFailed) << path;
    }
    EXPECT_EQ(DumpTree(*root), "Root:Root\n");
}

TEST_F(LoadResourceFile, FollowsLinksOfTheFileSystem) {
    Write("f.xml", "<A><V>1</V></A>");
    folder.MakeLink("f.xml", "link.xml");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(LoadFile(*root, u"link.xml"), "\nA:A\n  V=1\n");
}

TEST_F(LoadResourceFile, IsBlindToTheCaseOfItsName) {
    Write("Board_Resource.XML", "<A><V>1</V></A>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(LoadFile(*root, u"board_resource.xml"), "\nA:A\n  V=1\n");
}

TEST_F(LoadResourceFile, NamesMayBeOutsideAscii) {
    Write("n\xC3\xA9 \xF0\x9F\x98\x80.xml", "<A><V>1</V></A>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(LoadFile(*root, u"n\u00E9 \xD83D\xDE00.xml"), "\nA:A\n  V=1\n");
}

// Names are UTF-16 on Windows, and may not hold every sign.
TEST_F(LoadResourceFile, NamesMayHoldAnyBytesAsOnlyLinuxNamesAreBytes) {
    Write("bad\xFF\xE9.xml", "<A></B>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceFile(PathOf(u"bad\xDCFF\xDCE9.xml"), false, nullptr), loadFailed);
    EXPECT_EQ(Errors(*root), "Error on line 1 at column 5 of file" + Shown(u"bad\xDCFF\xDCE9.xml") +
                                 "\n   mismatched tag\n   <A></B>\n");
}

TEST_F(LoadResourceFile, IsClosedWhateverHappens) {
    Write("good.xml", "<A/>");
    Write("bad.xml", "<A>");
    auto root = MakeRoot();
    EXPECT_EQ(root->LoadResourceFile(PathOf(u"good.xml"), false, nullptr), 0);
    EXPECT_EQ(root->LoadResourceFile(PathOf(u"bad.xml"), false, nullptr), loadFailed);
    for (uint64_t nth = 1; nth < 40; ++nth) {
        try {
            const support::AllocationFaultScope faults(nth);
            root->LoadResourceFile(PathOf(u"good.xml"), true, nullptr);
        } catch (const std::bad_alloc&) {
            EXPECT_EQ(files.OpenFiles(), 0) << nth;
        }
    }
    EXPECT_EQ(files.OpenFiles(), 0);
}

TEST_F(LoadResourceFile, EndsWhereAReadFails) {
    Write("f.xml", "<A><V>1</V>" + std::string(5000, ' ') + "</A>");
    files.Fail(FileCall::ReadBytes, 2, EIO);
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(root->LoadResourceFile(PathOf(u"f.xml"), false, nullptr), loadFailed);
    EXPECT_EQ(TextAt(*root, u"V"), "1");
    EXPECT_EQ(Errors(*root).substr(0, 32), "Error on line 1 at column 4096 o");
    EXPECT_EQ(files.OpenFiles(), 0);
}

TEST_F(LoadResourceFile, ThatGivesLessThanWasAskedForIsReadToItsEnd) {
    files.LimitTransfer(7);
    EXPECT_EQ(ValueIn("<A>" + std::string(5000, ' ') + "<V>1</V></A>"), "1");
}

TEST_F(LoadResourceFile, OfAnySizeAroundABlockIsRead) {
    for (const size_t size : {15u, 4094u, 4095u, 4096u, 4097u, 4098u, 8191u, 8192u, 8193u, 12288u}) {
        const std::string value(size - 14, 'x');
        const std::string bytes = "<A><V>" + value + "</V></A>";
        ASSERT_EQ(bytes.size(), size);
        EXPECT_EQ(ValueIn(bytes), value) << size;
    }
}

TEST_F(LoadResourceFile, FullBlockIsFollowedByAnEmptyOne) {
    Write("f.xml", "<A><V>" + std::string(4096 - 14, 'x') + "</V></A>");
    auto root = MakeUnnamedRoot();
    const uint64_t before = files.Count(FileCall::ReadBytes);
    LoadFile(*root, u"f.xml");
    EXPECT_EQ(files.Count(FileCall::ReadBytes) - before, 2u);
}

// What stands around the end of the first block, at every place across it.
TEST_F(LoadResourceFile, AnythingMayCrossABlock) {
    struct Row {
        const char* bytes;
        const char* value;
    };
    const Row rows[] = {
        {"\xC3\xA9", "{00E9}"}, {"\xE5\x90\x8D", "{540D}"},    {"&amp;", "&"},          {"&#x20AC;", "{20AC}"},
        {"<![CDATA[<]]>", "<"}, {"<!-- comment -->", ""},      {"<?target data?>", ""}, {"\r\n", "\n"},
        {"]]x", "]]x"},         {"</V><W a='b'>w</W><V>", ""},
    };
    for (const Row& row : rows) {
        const std::string middle = row.bytes;
        for (size_t shift = 0; shift <= middle.size(); ++shift) {
            const std::string head = "<A><V>";
            const std::string fill(4096 - head.size() - shift, 'x');
            std::string expected = fill + row.value + "y";
            if (middle.substr(0, 4) == "</V>") {
                expected = "y";
            }
            EXPECT_EQ(ValueIn(head + fill + middle + "y</V></A>"), expected) << middle << " " << shift;
        }
    }
}

TEST_F(LoadResourceFile, NamesAndAttributesMayCrossABlock) {
    const std::string middle = "<Clock name='clock' ordered='true' K='v'><V>#{K}</V></Clock>";
    for (size_t shift = 0; shift <= middle.size(); ++shift) {
        Write("f.xml", "<A>" + std::string(4096 - 3 - shift, ' ') + middle + "</A>");
        auto root = MakeUnnamedRoot();
        EXPECT_EQ(LoadFile(*root, u"f.xml"), "\nA:A\n  clock:Clock ordered\n    V=v\n") << shift;
    }
}

// --- Encodings ---

TEST_F(LoadResourceFile, ByteOrderMarkOfUtf8IsSkipped) {
    EXPECT_EQ(ValueIn("\xEF\xBB\xBF<A><V>\xC3\xA9</V></A>"), "{00E9}");
}

TEST_F(LoadResourceFile, DeclaredEncodingIsOverridden) {
    for (const char* name :
         {"ISO-8859-1", "US-ASCII", "UTF-16", "windows-1252", "Shift_JIS", "no-such-encoding", "UTF-8", "utf-8"}) {
        EXPECT_EQ(ValueIn("<?xml version='1.0' encoding='" + std::string(name) + "'?><A><V>\xC3\xA9</V></A>"), "{00E9}")
            << name;
    }
}

std::string Utf16(const std::u16string& text, bool isBigEndian) {
    std::string bytes;
    for (const char16_t unit : text) {
        const char low = static_cast<char>(unit & 0xFF);
        const char high = static_cast<char>(unit >> 8);
        bytes.push_back(isBigEndian ? high : low);
        bytes.push_back(isBigEndian ? low : high);
    }
    return bytes;
}

TEST_F(LoadResourceFile, Utf16WithItsMarkIsUtf16) {
    const std::u16string document = u"\uFEFF<A><V>\u00E9\u540D</V></A>";
    EXPECT_EQ(ValueIn(Utf16(document, false)), "{00E9}{540D}");
    EXPECT_EQ(ValueIn(Utf16(document, true)), "{00E9}{540D}");
}

TEST_F(LoadResourceFile, Utf16MayDeclareAnything) {
    EXPECT_EQ(ValueIn(Utf16(u"\uFEFF<?xml version='1.0' encoding='utf-8'?><A><V>\u00E9</V></A>", false)), "{00E9}");
}

TEST_F(LoadResourceFile, Utf16MayCrossBlocks) {
    const std::u16string fill(6000, u'\u00E9');
    std::string expected;
    for (size_t i = 0; i < fill.size(); ++i) {
        expected += "{00E9}";
    }
    for (const size_t shift : {0u, 1u}) {
        const std::u16string document = u"\uFEFF<A>" + std::u16string(shift, u' ') + u"<V>" + fill + u"</V></A>";
        EXPECT_EQ(ValueIn(Utf16(document, true)), expected);
    }
}

// --- Characters of four bytes ---

TEST_F(LoadResourceFile, TextEventWithAFourByteCharacterIsDropped) {
    // The parser reports a text in pieces: up to a line end, the line end, and what a reference stands for.
    EXPECT_EQ(ValueIn("<A><V>a\xF0\x9F\x98\x80"
                      "b</V></A>"),
              "");
    EXPECT_EQ(ValueIn("<A><V>a\nx\xF0\x9F\x98\x80"
                      "b\nc</V></A>"),
              "a\n\nc");
    EXPECT_EQ(ValueIn("<A><V>\xC3\xA9&amp;\xF0\x9F\x98\x80</V></A>"), "{00E9}&");
    EXPECT_EQ(ValueIn("<A><V>a&#x1F600;b</V></A>"), "ab");
    EXPECT_EQ(ValueIn("<A><V>a<!-- -->\xF0\x9F\x98\x80<!-- -->b</V></A>"), "ab");
    EXPECT_EQ(ValueIn("<A><V>a<![CDATA[x\xF0\x9F\x98\x80]]>b</V></A>"), "ab");
}

TEST_F(LoadResourceFile, EndOfABlockEndsATextEvent) {
    const std::string head = "<A><V>";
    const std::string fill(4096 - head.size(), 'x');
    // Behind the end, across it (the beginning waits for the next block), and before it.
    EXPECT_EQ(ValueIn(head + fill + "\xF0\x9F\x98\x80y</V></A>"), fill);
    for (const size_t shift : {1u, 2u, 3u}) {
        EXPECT_EQ(ValueIn(head + fill.substr(shift) + "\xF0\x9F\x98\x80y</V></A>"), fill.substr(shift));
    }
    EXPECT_EQ(ValueIn(head + fill.substr(4) + "\xF0\x9F\x98\x80y</V></A>"), "y");
}

TEST_F(LoadResourceFile, AttributeWithAFourByteCharacterIsEmpty) {
    Write("f.xml",
          "<R K='a\xF0\x9F\x98\x80'><A name='x\xF0\x9F\x98\x80' ordered='true'/><B "
          "names='a,\xF0\x9F\x98\x80'><V>[#{K}]</V></B>"
          "<W type='xml'><i a='1' b='\xF0\x9F\x98\x80'/></W></R>");
    auto root = MakeUnnamedRoot();
    EXPECT_EQ(LoadFile(*root, u"f.xml"), R"(
R:R
  :A ordered
  B:B
    V=[]
  W=<i a="1" b=""></i>
)");
}

TEST_F(LoadResourceFile, FourByteCharactersElsewhereDoNotMatter) {
    EXPECT_EQ(
        ValueIn(
            "<!-- \xF0\x9F\x98\x80 --><?p \xF0\x9F\x98\x80?><A><!-- \xF0\x9F\x98\x80 --><V>1</V>\xF0\x9F\x98\x80</A>"),
        "1");
}

// --- Events as they come ---

// libexpat takes no character beyond 16 bits in a name. Another source of events may: the name is empty, and an element
// without a name is never pending, so its end tag ends the frame that it stands in.
TEST(ParseStack, ElementWhoseNameIsRefusedEndsTheFrameOfItsParent) {
    auto root = MakeRoot();
    const LoadChain chain(nullptr, nullptr);
    {
        ParseStack stack(*root, u"Root", chain);
        const char* const none[] = {nullptr};
        stack.StartElement("A", none);
        stack.StartElement("V", none);
        stack.EndElement("V");
        stack.StartElement("\xF0\x9F\x98\x80", none);
        stack.CharacterData("lost");
        stack.EndElement("\xF0\x9F\x98\x80");
        stack.StartElement("W", none);
        stack.CharacterData("1");
        stack.EndElement("W");
        stack.EndElement("A");
    }
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  A:A
    V=
  W=1
)");
}

TEST(ParseStack, RefusedNameOfAFirstChildMakesANodeOfItsParent) {
    auto root = MakeRoot();
    const LoadChain chain(nullptr, nullptr);
    {
        ParseStack stack(*root, u"Root", chain);
        const char* const none[] = {nullptr};
        stack.StartElement("A", none);
        stack.StartElement("B", none);
        stack.StartElement("\xF0\x9F\x98\x80", none);
        stack.EndElement("\xF0\x9F\x98\x80");
        stack.StartElement("W", none);
        stack.EndElement("W");
        stack.EndElement("B");
        stack.EndElement("A");
        EXPECT_EQ(stack.GetDocumentRoot(), root->FindRaw(u"A")->Child());
    }
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  A:A
    B:B
    W=
)");
}

TEST(ParseStack, RefusedNameOfAnAttributeIsEmptyAndTheFirstOfThoseStays) {
    auto root = MakeRoot();
    const LoadChain chain(nullptr, nullptr);
    {
        ParseStack stack(*root, u"Root", chain);
        const char* const type[] = {"type", "xml", nullptr};
        const char* const refused[] = {"b", "1", "\xF0\x9F\x98\x80", "2", "\xF0\x9F\x98\x81", "3", nullptr};
        stack.StartElement("V", type);
        stack.StartElement("i", refused);
        stack.EndElement("i");
        stack.EndElement("V");
    }
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  V=<i ="2" b="1"></i>
)");
}

TEST(ParseStack, FramesThatAreLeftLeaveTheTreeAlone) {
    auto root = MakeRoot();
    const LoadChain chain(nullptr, nullptr);
    {
        ParseStack stack(*root, u"Root", chain);
        const char* const none[] = {nullptr};
        stack.StartElement("A", none);
        stack.StartElement("B", none);
        stack.StartElement("C", none);
    }
    EXPECT_EQ("\n" + DumpTree(*root), R"(
Root:Root
  A:A
    B:B
)");
}

}  // namespace
}  // namespace zkhw
