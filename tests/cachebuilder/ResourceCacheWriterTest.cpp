#include <memory>
#include <new>

#include <gtest/gtest.h>

#include "cachebuilder/FPGAResTree.h"
#include "cachebuilder/Installation.h"
#include "qn/dsc/exception/Exception.h"
#include "restree/ResTreeNode.h"
#include "support/AllocationFaultScope.h"
#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::osdep::FileCall;
using qn::dsc::osdep::TemporaryFolder;

constexpr int32_t failure = static_cast<int32_t>(0x80004005);

class ResourceCacheWriter : public testing::Test {
  protected:
    void Load(const char* text) { ASSERT_EQ(root->LoadResourceText(String(text), true, nullptr), 0); }
    int32_t Write() { return tree.WriteResourceCache(*root, folder.System(u"resource_cache.xml")); }
    // What is written for the tree as it stands.
    std::string Written() {
        EXPECT_EQ(Write(), 0);
        return folder.ReadText("resource_cache.xml");
    }

    TemporaryFolder folder;
    FPGAResTree tree;
    std::unique_ptr<ResTreeNode> root = std::make_unique<ResTreeNode>(u"", u"ProviderResourceTreeRoot", false);
};

const char* const emptyCache =
    "<?xml version=\"1.0\"?>\n<ProviderResourceTreeRoot name=\"\">\n</ProviderResourceTreeRoot>";

TEST_F(ResourceCacheWriter, TreeWithoutAChildIsTwoTagsBehindTheDeclaration) {
    EXPECT_EQ(Written(), emptyCache);
}

TEST_F(ResourceCacheWriter, TargetHasElevenPropertiesInTheirOrder) {
    Load(
        "<Target name=\"B\"><CustomFPGAMethodList>11</CustomFPGAMethodList><DeviceIDs>10</DeviceIDs>"
        "<FindTargetVIPath>9</FindTargetVIPath>"
        "<LocalizedInformationToDisplayWhenAddingNewTarget>8</LocalizedInformationToDisplayWhenAddingNewTarget>"
        "<TargetXMLPath>7</TargetXMLPath><TargetClass>6</TargetClass>"
        "<SupportedFPGAHostList>5</SupportedFPGAHostList><FPGAItemSubType>4</FPGAItemSubType>"
        "<EIOItemTypeName>3</EIOItemTypeName><EIOItemIconName>2</EIOItemIconName>"
        "<DeviceCategory>1</DeviceCategory></Target>");
    EXPECT_EQ(Written(), CacheOf("\n   <Target name=\"B\" ordered=\"true\">"
                                 "\n      <DeviceCategory>1</DeviceCategory>"
                                 "\n      <EIOItemIconName>2</EIOItemIconName>"
                                 "\n      <EIOItemTypeName>3</EIOItemTypeName>"
                                 "\n      <FPGAItemSubType>4</FPGAItemSubType>"
                                 "\n      <SupportedFPGAHostList>5</SupportedFPGAHostList>"
                                 "\n      <TargetClass>6</TargetClass>"
                                 "\n      <TargetXMLPath>7</TargetXMLPath>"
                                 "\n      <LocalizedInformationToDisplayWhenAddingNewTarget>8"
                                 "</LocalizedInformationToDisplayWhenAddingNewTarget>"
                                 "\n      <FindTargetVIPath>9</FindTargetVIPath>"
                                 "\n      <DeviceIDs>10</DeviceIDs>"
                                 "\n      <CustomFPGAMethodList>11</CustomFPGAMethodList>"
                                 "\n   </Target>"));
}

const char* const emptyProperties =
    "\n      <DeviceCategory></DeviceCategory>"
    "\n      <EIOItemIconName></EIOItemIconName>"
    "\n      <EIOItemTypeName></EIOItemTypeName>"
    "\n      <FPGAItemSubType></FPGAItemSubType>"
    "\n      <SupportedFPGAHostList></SupportedFPGAHostList>"
    "\n      <TargetClass></TargetClass>"
    "\n      <TargetXMLPath></TargetXMLPath>"
    "\n      <LocalizedInformationToDisplayWhenAddingNewTarget></LocalizedInformationToDisplayWhenAddingNewTarget>"
    "\n      <FindTargetVIPath></FindTargetVIPath>"
    "\n      <DeviceIDs></DeviceIDs>"
    "\n      <CustomFPGAMethodList></CustomFPGAMethodList>";

TEST_F(ResourceCacheWriter, MissingPropertiesOfATargetAreEmptyElements) {
    Load("<Target name=\"B\"/>");
    EXPECT_EQ(Written(),
              CacheOf("\n   <Target name=\"B\" ordered=\"true\">" + std::string(emptyProperties) + "\n   </Target>"));
}

TEST_F(ResourceCacheWriter, NothingElseOfATargetIsWritten) {
    Load("<Target name=\"B\"><Speed>40</Speed><Sub><K>v</K></Sub><TargetDir>d</TargetDir></Target>");
    EXPECT_EQ(Written(),
              CacheOf("\n   <Target name=\"B\" ordered=\"true\">" + std::string(emptyProperties) + "\n   </Target>"));
}

TEST_F(ResourceCacheWriter, UnorderedTargetIsNotMarked) {
    Load("<Target name=\"B\" ordered=\"false\"/>");
    EXPECT_EQ(Written(), CacheOf("\n   <Target name=\"B\">" + std::string(emptyProperties) + "\n   </Target>"));
}

TEST_F(ResourceCacheWriter, ProtocolsOfATargetStandsBehindItsTag) {
    Load("<Target name=\"B\"><Protocols>P</Protocols></Target>");
    EXPECT_EQ(Written(), CacheOf("\n   <Target name=\"B\" ordered=\"true\">\n      <Protocols>P</Protocols>" +
                                 std::string(emptyProperties) + "\n   </Target>"));
}

TEST_F(ResourceCacheWriter, TypeThatInheritsFromTargetIsATarget) {
    root->GetTypeTable()->AddTypeRelation(u"Board", u"Target");
    Load("<Board name=\"B\"/>");
    EXPECT_EQ(Written(),
              CacheOf("\n   <Board name=\"B\" ordered=\"true\">" + std::string(emptyProperties) + "\n   </Board>"));
}

TEST_F(ResourceCacheWriter, KeyKeepsTheLetterCaseOfTheTarget) {
    Load("<Target name=\"B\"><deviceids>7</deviceids></Target>");
    EXPECT_NE(Written().find("\n      <deviceids>7</deviceids>\n"), std::string::npos);
}

TEST_F(ResourceCacheWriter, LocalisedPropertyStandsAsItsList) {
    Load("<Target name=\"B\"><DeviceCategory localize=\"true\">eng=Clock,jpn=X</DeviceCategory></Target>");
    EXPECT_NE(Written().find("\n      <DeviceCategory localize=\"true\">eng=Clock,jpn=X</DeviceCategory>\n"),
              std::string::npos);
}

TEST_F(ResourceCacheWriter, PropertyThatIsANodeOrALinkIsWrittenAsSuch) {
    Load("<Target name=\"B\"><DeviceIDs><A>1</A></DeviceIDs><:Link name=\"TargetClass\">DeviceIDs</:Link></Target>");
    const std::string text = Written();
    EXPECT_NE(text.find("\n      <DeviceIDs>\n         <A>1</A>\n      </DeviceIDs>\n"), std::string::npos) << text;
    EXPECT_NE(text.find("\n      <:Link  name=\"TargetClass\">DeviceIDs</:Link>\n"), std::string::npos) << text;
}

TEST_F(ResourceCacheWriter, ValuesAreEscapedAndReadBack) {
    Load("<Target name=\"a &amp; b\"><DeviceIDs>&lt;&amp;&gt;'\"</DeviceIDs></Target>");
    const std::string text = Written();
    EXPECT_NE(text.find("<Target name=\"a &amp; b\" ordered=\"true\">"), std::string::npos);
    EXPECT_NE(text.find("<DeviceIDs>&lt;&amp;&gt;&apos;&quot;</DeviceIDs>"), std::string::npos);
    ResTreeNode again(u"", u"ProviderResourceTreeRoot", false);
    ASSERT_EQ(again.LoadResourceText(String(text.c_str()), false, nullptr), 0);
    ResTreeNode* target = again.Lookup(u"a & b", nullptr);
    ASSERT_NE(target, nullptr);
    EXPECT_EQ(ExactText(target->GetPropertyOrEmpty(u"DeviceIDs")), "<&>'\"");
}

TEST_F(ResourceCacheWriter, HostSetIsWrittenInFull) {
    Load("<FPGAHostSet><HostA>1</HostA><Sub><K>v</K></Sub></FPGAHostSet>");
    EXPECT_EQ(Written(), CacheOf("\n   <FPGAHostSet>\n      <HostA>1</HostA>\n      <Sub>\n         <K>v</K>"
                                 "\n      </Sub>\n   </FPGAHostSet>"));
}

TEST_F(ResourceCacheWriter, HostSetMayHaveAnyLetterCaseAndType) {
    Load("<Set name=\"fpgaHOSTset\"><HostA>1</HostA></Set>");
    EXPECT_EQ(Written(), CacheOf("\n   <Set name=\"fpgaHOSTset\">\n      <HostA>1</HostA>\n   </Set>"));
}

TEST_F(ResourceCacheWriter, TargetNamedAsTheHostSetIsATarget) {
    Load("<Target name=\"FPGAHostSet\"><HostA>1</HostA></Target>");
    EXPECT_EQ(Written().find("HostA"), std::string::npos);
}

TEST_F(ResourceCacheWriter, OtherNodeHasItsProtocolsAndSources) {
    Load("<Some><K>v</K><FPGA_XMLSource>a.xml,b.xml</FPGA_XMLSource><Protocols>P,Q</Protocols></Some>");
    EXPECT_EQ(Written(), CacheOf("\n   <Some>\n      <Protocols>P,Q</Protocols>"
                                 "\n      <FPGA_XMLSource>a.xml,b.xml</FPGA_XMLSource>\n   </Some>"));
}

TEST_F(ResourceCacheWriter, OtherNodeWithoutProtocolsGetsThemEmpty) {
    Load("<Some><K>v</K></Some>");
    EXPECT_EQ(Written(), CacheOf("\n   <Some>\n      <Protocols></Protocols>\n   </Some>"));
}

TEST_F(ResourceCacheWriter, ChildrenStandInTheOrderOfTheRoot) {
    Load("<Some name=\"b\"/>");
    Load("<Some name=\"C\"/>");
    Load("<Some name=\"A\"/>");
    const std::string text = Written();
    const size_t a = text.find("\"A\"");
    const size_t b = text.find("\"b\"");
    const size_t c = text.find("\"C\"");
    EXPECT_LT(a, b);
    EXPECT_LT(b, c);
    EXPECT_NE(c, std::string::npos);
}

TEST_F(ResourceCacheWriter, EntriesOfTheRootThatAreNoNodesAreLeftOut) {
    root->SetProperty(u"XMLParseErrors", u"Error on line 1");
    root->AddLinkEntry(u"L", u"/x");
    EXPECT_EQ(Written(), emptyCache);
}

TEST_F(ResourceCacheWriter, ProtocolsOfTheRootItselfIsWritten) {
    root->SetProperty(u"Protocols", u"P");
    EXPECT_EQ(Written(), CacheOf("\n   <Protocols>P</Protocols>"));
}

TEST_F(ResourceCacheWriter, TextIsUtf8WithSurrogatesOneByOne) {
    root->SetProperty(u"Protocols", u"\u00E9\u20AC\xD83D\xDE00");
    EXPECT_EQ(Written(), CacheOf("\n   <Protocols>\xC3\xA9\xE2\x82\xAC\xED\xA0\xBD\xED\xB8\x80</Protocols>"));
}

TEST_F(ResourceCacheWriter, FileEndsAtTheFirstNul) {
    root->SetProperty(u"Protocols", std::u16string_view(u"P\0Q", 3));
    EXPECT_EQ(Written(), "<?xml version=\"1.0\"?>\n<ProviderResourceTreeRoot name=\"\">\n   <Protocols>P");
}

TEST_F(ResourceCacheWriter, OldFileIsReplacedWhole) {
    folder.WriteFile("resource_cache.xml", std::string(10000, 'x'));
    EXPECT_EQ(Written(), emptyCache);
}

TEST_F(ResourceCacheWriter, TreeIsNotTouched) {
    Load("<Target name=\"B\"/>");
    Load("<Some><K>v</K></Some>");
    Written();
    EXPECT_EQ(root->Lookup(u"B", nullptr)->FindRaw(u"DeviceIDs"), nullptr);
    EXPECT_EQ(root->Lookup(u"Some", nullptr)->FindRaw(u"Protocols"), nullptr);
}

TEST_F(ResourceCacheWriter, StubIsNotLoaded) {
    Load("<Target name=\"B\"/>");
    ResTreeNode* target = root->Lookup(u"B", nullptr);
    target->SetProperty(u":DeferredLoadPath", u"C:\\nowhere.xml");
    Written();
    EXPECT_NE(target->FindRaw(u":DeferredLoadPath"), nullptr);
}

TEST_F(ResourceCacheWriter, FileIsWrittenWithOneCall) {
    for (int i = 0; i < 300; ++i) {
        Load(("<Target name=\"T" + std::to_string(i) + "\"/>").c_str());
    }
    qn::dsc::osdep::FaultyFileSystem files;
    {
        const qn::dsc::osdep::FileSystemScope scope(files);
        EXPECT_EQ(Write(), 0);
    }
    EXPECT_EQ(files.Count(FileCall::WriteBytes), 1u);
    EXPECT_EQ(files.Count(FileCall::OpenText), 1u);
    EXPECT_EQ(files.OpenFiles(), 0);
    EXPECT_GT(folder.ReadText("resource_cache.xml").size(), 100000u);
}

TEST_F(ResourceCacheWriter, FileThatCannotBeOpenedIsAFailureAndStays) {
    folder.WriteFile("resource_cache.xml", "old");
    {
        qn::dsc::osdep::FaultyFileSystem files;
        const qn::dsc::osdep::FileSystemScope scope(files);
        files.Fail(FileCall::OpenText, 1, EACCES);
        EXPECT_EQ(Write(), failure);
    }
    EXPECT_EQ(folder.ReadText("resource_cache.xml"), "old");
}

TEST_F(ResourceCacheWriter, FolderInThePlaceOfTheFileIsAFailure) {
    folder.MakeFolder("resource_cache.xml");
    EXPECT_EQ(Write(), failure);
}

TEST_F(ResourceCacheWriter, MissingFolderIsAFailure) {
    EXPECT_EQ(tree.WriteResourceCache(*root, folder.System(u"missing\\resource_cache.xml")), failure);
    EXPECT_FALSE(folder.Exists("missing"));
}

TEST_F(ResourceCacheWriter, FullDiskIsAFailureAndLeavesWhatWasWritten) {
    folder.WriteFile("resource_cache.xml", "old");
    qn::dsc::osdep::FaultyFileSystem files;
    {
        const qn::dsc::osdep::FileSystemScope scope(files);
        files.LimitTransfer(10);
        files.Fail(FileCall::WriteBytes, 2, ENOSPC);
        EXPECT_EQ(Write(), failure);
    }
    EXPECT_EQ(folder.ReadText("resource_cache.xml"), "<?xml vers");
    EXPECT_EQ(files.OpenFiles(), 0);
}

TEST_F(ResourceCacheWriter, DeviceThatTakesNothingIsAFailureAtAnySize) {
    folder.MakeLink("/dev/full", "resource_cache.xml");
    EXPECT_EQ(Write(), failure);
}

TEST_F(ResourceCacheWriter, FailureOfTheCloseIsNotLookedAt) {
    qn::dsc::osdep::FaultyFileSystem files;
    {
        const qn::dsc::osdep::FileSystemScope scope(files);
        files.Fail(FileCall::CloseFile, 1, EIO);
        EXPECT_EQ(Write(), 0);
    }
    EXPECT_EQ(folder.ReadText("resource_cache.xml"), emptyCache);
}

TEST_F(ResourceCacheWriter, NoMemoryForTheTextPassesAndLeavesTheOldFile) {
    folder.WriteFile("resource_cache.xml", "old");
    const String path = folder.System(u"resource_cache.xml");
    {
        const support::AllocationFaultScope fault(1, true);
        EXPECT_THROW(tree.WriteResourceCache(*root, path), std::bad_alloc);
    }
    EXPECT_EQ(folder.ReadText("resource_cache.xml"), "old");
}

}  // namespace
}  // namespace zkhw
