#include <memory>

#include <gtest/gtest.h>

#include "cachebuilder/FPGAResTree.h"
#include "cachebuilder/Installation.h"
#include "restree/ResTreeNode.h"
#include "support/ExactText.h"
#include "support/TreeDump.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::osdep::FileCall;

// A host looks at an installation whose cache the tool has written.
class ResourceCacheReader : public testing::Test {
  protected:
    ResourceCacheReader() {
        installation.Write("x/x_resource.xml",
                           "<Target name=\"X\"><DeviceIDs>7</DeviceIDs><Speed>40</Speed><Sub><K>v</K></Sub></Target>");
        installation.Write("a_resource.xml", "<Some><K>a</K></Some>");
        installation.Write("b_resource.xml", "<Some><L>b</L></Some>");
        installation.Write("hosts_resource.xml", "<FPGAHostSet><HostA>1</HostA></FPGAHostSet>");
    }

    void BuildCache() {
        ExecutableScope scope(installation, toolPath);
        ResTreeNode* built = nullptr;
        ASSERT_EQ(tree.BuildResourceTree(installation.System(), false, built), 0);
        delete built;
        SetTimes(0);
    }

    // The cache is this much newer than all else.
    void SetTimes(int64_t seconds, int64_t nanoseconds = 0) {
        for (const char* file : {"x/x_resource.xml", "a_resource.xml", "b_resource.xml", "hosts_resource.xml"}) {
            SetTime(file, 1000000, 0);
        }
        SetTime("resource_cache.xml", 1000000 + seconds, nanoseconds);
    }
    void SetTime(const std::string& file, int64_t seconds, int64_t nanoseconds) {
        installation.Root().SetFileTime(Installation::Below(file), seconds, nanoseconds);
    }

    int32_t Read() {
        return tree.ReadResourceCache(installation.System(), installation.System(u"resource_cache.xml"), *root);
    }

    ResTreeNode& Child(const char16_t* name) {
        NodeEntry* entry = root->FindRaw(name);
        return entry == nullptr || entry->Child() == nullptr ? *root : *entry->Child();
    }
    std::string SystemText(const char16_t* below) { return ExactText(installation.System(below)); }

    // How many of the files named so have been opened.
    uint64_t OpenedSince(uint64_t before) { return host.Files().Count(FileCall::OpenText) - before; }
    uint64_t Opened() { return host.Files().Count(FileCall::OpenText); }

    Installation installation;
    ExecutableScope host{installation, hostPath};
    FPGAResTree tree;
    std::unique_ptr<ResTreeNode> root = std::make_unique<ResTreeNode>(u"", u"ProviderResourceTreeRoot", false);
};

TEST_F(ResourceCacheReader, FreshCacheGivesStubs) {
    BuildCache();
    EXPECT_EQ(Read(), 0);
    EXPECT_EQ(DumpTree(*root),
              ":ProviderResourceTreeRoot\n"
              "  FPGAHostSet:FPGAHostSet\n"
              "    HostA=1\n"
              "  Some:Some\n"
              "    :DeferredLoadPath=Targets\\QN\\FPGA\\a_resource.xml,Targets\\QN\\FPGA\\b_resource.xml\n"
              "    FPGA_XMLSource=Targets\\QN\\FPGA\\a_resource.xml,Targets\\QN\\FPGA\\b_resource.xml\n"
              "    Protocols=\n"
              "  X:Target ordered\n"
              "    DeviceCategory=\n"
              "    EIOItemIconName=fpga\\IO.png\n"
              "    EIOItemTypeName=FPGA I/O\n"
              "    FPGAItemSubType=\n"
              "    SupportedFPGAHostList=\n"
              "    TargetClass=COM.QN.FPGA.X\n"
              "    TargetXMLPath=Targets\\QN\\FPGA\\x\\x_resource.xml\n"
              "    LocalizedInformationToDisplayWhenAddingNewTarget=\n"
              "    FindTargetVIPath=\n"
              "    DeviceIDs=7\n"
              "    CustomFPGAMethodList=\n"
              "    TargetDir=" +
                  SystemText(u"x") +
                  "\n"
                  "    TargetClassShortClassName=X\n"
                  "    :DeferredLoadPath=Targets\\QN\\FPGA\\x\\x_resource.xml\n");
}

TEST_F(ResourceCacheReader, ReadingOpensTheCacheAlone) {
    BuildCache();
    const uint64_t before = Opened();
    EXPECT_EQ(Read(), 0);
    EXPECT_EQ(OpenedSince(before), 1u);
}

TEST_F(ResourceCacheReader, TargetHasATypeTableOfItsOwn) {
    BuildCache();
    ASSERT_EQ(Read(), 0);
    EXPECT_NE(Child(u"X").GetTypeTable(), nullptr);
    EXPECT_EQ(Child(u"Some").GetTypeTable(), nullptr);
}

TEST_F(ResourceCacheReader, PropertyOfTheStubLoadsNothing) {
    BuildCache();
    ASSERT_EQ(Read(), 0);
    const uint64_t before = Opened();
    EXPECT_EQ(ExactText(Child(u"X").GetPropertyOrEmpty(u"DeviceIDs")), "7");
    EXPECT_EQ(ExactText(Child(u"X").GetPropertyOrEmpty(u"TargetDir")), SystemText(u"x"));
    EXPECT_EQ(OpenedSince(before), 0u);
    EXPECT_NE(Child(u"X").FindRaw(u":DeferredLoadPath"), nullptr);
}

TEST_F(ResourceCacheReader, MissingPropertyIsEmptyAfterwardsNotMissing) {
    installation.Write("y_resource.xml", "<Target name=\"Y\"><K>v</K></Target>");
    BuildCache();
    SetTime("y_resource.xml", 1000000, 0);
    ASSERT_EQ(Read(), 0);
    NodeEntry* ids = Child(u"Y").FindRaw(u"DeviceIDs");
    ASSERT_NE(ids, nullptr);
    ASSERT_TRUE(ids->IsText());
    EXPECT_EQ(ExactText(*ids->Text()), "");
}

TEST_F(ResourceCacheReader, FirstMissLoadsTheFileOfTheTarget) {
    BuildCache();
    ASSERT_EQ(Read(), 0);
    const uint64_t before = Opened();
    EXPECT_EQ(ExactText(Child(u"X").GetPropertyOrEmpty(u"Speed")), "40");
    EXPECT_EQ(OpenedSince(before), 1u);
    EXPECT_EQ(Child(u"X").FindRaw(u":DeferredLoadPath"), nullptr);
    ASSERT_NE(root->Lookup(u"X/Sub", nullptr), nullptr);
    EXPECT_EQ(ExactText(root->Lookup(u"X/Sub", nullptr)->GetPropertyOrEmpty(u"K")), "v");
    EXPECT_FALSE(Child(u"X").GetProperty(u"Nothing"));
    EXPECT_EQ(OpenedSince(before), 1u);
}

TEST_F(ResourceCacheReader, WalkOverTheEntriesLoadsTheFileOfTheTarget) {
    BuildCache();
    ASSERT_EQ(Read(), 0);
    bool hasSpeed = false;
    for (EntryIterator entry = Child(u"X").BeginLoaded(); !entry.IsEnd(); ++entry) {
        hasSpeed |= entry.Key() == u"Speed";
    }
    EXPECT_TRUE(hasSpeed);
}

TEST_F(ResourceCacheReader, StubGoesOnGivingItsOwnValuesAfterTheLoad) {
    BuildCache();
    ASSERT_EQ(Read(), 0);
    installation.Write("x/x_resource.xml", "<Target name=\"X\"><DeviceIDs>8</DeviceIDs><Speed>41</Speed></Target>");
    EXPECT_EQ(ExactText(Child(u"X").GetPropertyOrEmpty(u"Speed")), "41");
    EXPECT_EQ(ExactText(Child(u"X").GetPropertyOrEmpty(u"DeviceIDs")), "7");
}

TEST_F(ResourceCacheReader, OtherNodeLoadsAllItsFiles) {
    BuildCache();
    ASSERT_EQ(Read(), 0);
    EXPECT_EQ(ExactText(Child(u"Some").GetPropertyOrEmpty(u"K")), "a");
    EXPECT_EQ(ExactText(Child(u"Some").GetPropertyOrEmpty(u"L")), "b");
    EXPECT_EQ(Child(u"Some").FindRaw(u":DeferredLoadPath"), nullptr);
}

TEST_F(ResourceCacheReader, LoadingOneNodeLeavesTheOthersAsStubs) {
    BuildCache();
    ASSERT_EQ(Read(), 0);
    Child(u"X").GetProperty(u"Speed");
    EXPECT_NE(Child(u"Some").FindRaw(u":DeferredLoadPath"), nullptr);
}

TEST_F(ResourceCacheReader, FileThatIsGoneLeavesTheStubAsItWas) {
    BuildCache();
    ASSERT_EQ(Read(), 0);
    installation.Root().Remove(Installation::Below("x/x_resource.xml"));
    EXPECT_FALSE(Child(u"X").GetProperty(u"Speed"));
    EXPECT_EQ(ExactText(Child(u"X").GetPropertyOrEmpty(u"DeviceIDs")), "7");
    EXPECT_EQ(Child(u"X").FindRaw(u":DeferredLoadPath"), nullptr);
    EXPECT_EQ(Child(u"X").FindRaw(u"XMLParseErrors"), nullptr);
}

TEST_F(ResourceCacheReader, EqualTimesAreFresh) {
    BuildCache();
    SetTimes(0);
    EXPECT_EQ(Read(), 0);
}

TEST_F(ResourceCacheReader, NewerCacheIsFresh) {
    BuildCache();
    SetTimes(0, 100);
    EXPECT_EQ(Read(), 0);
}

TEST_F(ResourceCacheReader, OneNewerFileMakesTheCacheStale) {
    BuildCache();
    SetTime("x/x_resource.xml", 1000001, 0);
    EXPECT_EQ(Read(), 1);
    EXPECT_TRUE(root->Begin().IsEnd());
}

TEST_F(ResourceCacheReader, HundredNanosecondsMakeTheCacheStale) {
    BuildCache();
    SetTime("b_resource.xml", 1000000, 100);
    EXPECT_EQ(Read(), 1);
}

TEST_F(ResourceCacheReader, StaleCacheIsNotOpened) {
    BuildCache();
    SetTimes(-1);
    const uint64_t before = Opened();
    EXPECT_EQ(Read(), 1);
    EXPECT_EQ(OpenedSince(before), 0u);
}

TEST_F(ResourceCacheReader, FirstNewerFileEndsTheTest) {
    BuildCache();
    SetTimes(-1);
    const uint64_t before = host.Files().Count(FileCall::ReadWriteTime);
    EXPECT_EQ(Read(), 1);
    const uint64_t allStale = host.Files().Count(FileCall::ReadWriteTime) - before;
    SetTimes(0);
    SetTime("x/x_resource.xml", 1000001, 0);
    const uint64_t between = host.Files().Count(FileCall::ReadWriteTime);
    EXPECT_EQ(Read(), 1);
    const uint64_t lastStale = host.Files().Count(FileCall::ReadWriteTime) - between;
    // The other three were asked for their times.
    EXPECT_EQ(lastStale, allStale + 3);
}

TEST_F(ResourceCacheReader, DeletedFileKeepsTheCacheFresh) {
    BuildCache();
    installation.Root().Remove(Installation::Below("a_resource.xml"));
    EXPECT_EQ(Read(), 0);
    EXPECT_NE(root->FindRaw(u"Some"), nullptr);
}

TEST_F(ResourceCacheReader, NewFileWithAnOldTimeStaysUnseen) {
    BuildCache();
    installation.Write("new_resource.xml", "<Target name=\"New\"/>");
    SetTime("new_resource.xml", 999999, 0);
    EXPECT_EQ(Read(), 0);
    EXPECT_EQ(root->FindRaw(u"New"), nullptr);
}

TEST_F(ResourceCacheReader, FileWhoseTimeCannotBeReadIsOld) {
    BuildCache();
    SetTime("x/x_resource.xml", 2000000, 0);
    host.Files().FailOnPath(FileCall::ReadWriteTime, installation.System(u"x\\x_resource.xml"), EIO);
    EXPECT_EQ(Read(), 0);
}

TEST_F(ResourceCacheReader, LinkIsAsOldAsTheFileItLeadsTo) {
    BuildCache();
    installation.Write("elsewhere.txt", "");
    installation.Root().MakeLink("elsewhere.txt", Installation::Below("l_resource.xml"));
    SetTime("elsewhere.txt", 1000000, 0);
    EXPECT_EQ(Read(), 0);
    SetTime("elsewhere.txt", 2000000, 0);
    EXPECT_EQ(Read(), 1);
}

TEST_F(ResourceCacheReader, NewFolderWithTheNameOfAResourceFileMakesTheCacheStale) {
    BuildCache();
    installation.Root().MakeFolder(Installation::Below("f_resource.xml"));
    SetTime("f_resource.xml", 1000000, 0);
    EXPECT_EQ(Read(), 0);
    SetTime("f_resource.xml", 2000000, 0);
    EXPECT_EQ(Read(), 1);
}

TEST_F(ResourceCacheReader, FileWithoutAReadableTimeIsNewerThanACacheOfBefore1904) {
    BuildCache();
    for (const char* file : {"a_resource.xml", "b_resource.xml", "x/x_resource.xml"}) {
        SetTime(file, -2082844900, 0);
    }
    host.Files().FailFromThenOn(FileCall::ReadWriteTime, 1, EIO);
    SetTime("resource_cache.xml", -2082844800, 0);
    EXPECT_EQ(Read(), 0);
    SetTime("resource_cache.xml", -2082844801, 0);
    EXPECT_EQ(Read(), 1);
}

TEST_F(ResourceCacheReader, CacheWhoseTimeCannotBeReadIsStale) {
    BuildCache();
    SetTimes(1000);
    host.Files().FailOnPath(FileCall::ReadAttributes, installation.System(u"resource_cache.xml"), EIO);
    EXPECT_EQ(Read(), 1);
}

TEST_F(ResourceCacheReader, CacheWithoutATargetIsEmptiedOutOfTheRoot) {
    BuildCache();
    installation.Write("resource_cache.xml",
                       CacheOf("\n   <FPGAHostSet>\n      <HostA>1</HostA>\n   </FPGAHostSet>\n   <Text>x</Text>"));
    EXPECT_EQ(Read(), 1);
    EXPECT_TRUE(root->Begin().IsEnd());
}

TEST_F(ResourceCacheReader, CacheThatIsNoXmlIsEmptiedOutOfTheRoot) {
    BuildCache();
    installation.Write("resource_cache.xml", "no XML at all");
    EXPECT_EQ(Read(), 1);
    EXPECT_TRUE(root->Begin().IsEnd());
}

TEST_F(ResourceCacheReader, CacheOfTwoTagsIsUnusable) {
    BuildCache();
    installation.Write("resource_cache.xml", CacheOf(""));
    EXPECT_EQ(Read(), 1);
    EXPECT_TRUE(root->Begin().IsEnd());
}

TEST_F(ResourceCacheReader, CacheThatCannotBeOpenedIsUnusable) {
    BuildCache();
    host.Files().FailFromThenOn(FileCall::OpenText, 1, EACCES);
    EXPECT_EQ(Read(), 1);
    EXPECT_TRUE(root->Begin().IsEnd());
}

TEST_F(ResourceCacheReader, CacheThatBreaksOffBehindATargetIsFresh) {
    installation.Write("y_resource.xml", "<Target name=\"Y\"><K>v</K></Target>");
    BuildCache();
    const std::string whole = installation.Cache();
    installation.Write("resource_cache.xml", whole.substr(0, whole.find("<Target name=\"Y\"")));
    SetTime("resource_cache.xml", 3000000000, 0);
    EXPECT_EQ(Read(), 0);
    EXPECT_NE(root->FindRaw(u"X"), nullptr);
    EXPECT_EQ(root->FindRaw(u"Y"), nullptr);
    EXPECT_NE(root->FindRaw(u"XMLParseErrors"), nullptr);
    EXPECT_EQ(ExactText(Child(u"X").GetPropertyOrEmpty(u"Speed")), "40");
}

TEST_F(ResourceCacheReader, AbsolutePathOfATargetGivesItsFolder) {
    BuildCache();
    installation.Write("resource_cache.xml",
                       CacheOf("\n   <Target name=\"Z\" ordered=\"true\">\n      <TargetXMLPath type=\"string\">"
                               "C:\\else\\where\\z_resource.xml</TargetXMLPath>\n   </Target>"));
    SetTime("resource_cache.xml", 3000000000, 0);
    ASSERT_EQ(Read(), 0);
    EXPECT_EQ(ExactText(Child(u"Z").GetPropertyOrEmpty(u"TargetDir")), "C:\\else\\where");
}

TEST_F(ResourceCacheReader, TargetWithoutAPathStandsInTheFolderOfTheExecutable) {
    BuildCache();
    installation.Write("resource_cache.xml", CacheOf("\n   <Target name=\"Z\"/>"));
    SetTime("resource_cache.xml", 3000000000, 0);
    ASSERT_EQ(Read(), 0);
    EXPECT_EQ(DumpTree(Child(u"Z")), "Z:Target ordered\n  TargetDir=" + ExactText(installation.Root().System()) +
                                         "\\\n  TargetClassShortClassName=Z\n  :DeferredLoadPath=\n");
}

TEST_F(ResourceCacheReader, NodeWithoutSourcesIsNoStub) {
    BuildCache();
    installation.Write("resource_cache.xml",
                       CacheOf("\n   <Target name=\"Z\"/>\n   <Some>\n      <Protocols/>\n   </Some>"));
    SetTime("resource_cache.xml", 3000000000, 0);
    ASSERT_EQ(Read(), 0);
    EXPECT_EQ(DumpTree(Child(u"Some")), "Some:Some\n  Protocols=\n");
}

TEST_F(ResourceCacheReader, LocalisedPropertyKeepsItsList) {
    installation.Write("x/x_resource.xml",
                       "<Target name=\"X\"><DeviceCategory localize=\"yes\">eng=Board,jpn=J</DeviceCategory></Target>");
    BuildCache();
    ASSERT_EQ(Read(), 0);
    EXPECT_EQ(ExactText(Child(u"X").GetPropertyOrEmpty(u"DeviceCategory")), "Board{0000}eng=Board,jpn=J");
}

TEST_F(ResourceCacheReader, RootKeepsItsNameAndType) {
    BuildCache();
    ASSERT_EQ(Read(), 0);
    EXPECT_EQ(ExactText(root->GetName()), "");
    EXPECT_EQ(ExactText(root->GetType()), "ProviderResourceTreeRoot");
    EXPECT_FALSE(root->IsOrdered());
}

}  // namespace
}  // namespace zkhw
