#include "cachebuilder/FPGAResTree.h"

#include <memory>

#include <gtest/gtest.h>

#include "cachebuilder/Installation.h"
#include "cachebuilder/Tool.h"
#include "host/LoadedRuntime.h"
#include "restree/ResTreeNode.h"
#include "support/AllocationFaultScope.h"
#include "support/ExactText.h"
#include "support/TreeDump.h"
#include "zkfpga/exports.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::osdep::FileCall;
using qn::dsc::osdep::WorkingFolderScope;

constexpr int32_t failure = static_cast<int32_t>(0x80004005);
constexpr int32_t noMemory = static_cast<int32_t>(0x8007000E);

class FPGAResTreeOf : public testing::Test {
  protected:
    ~FPGAResTreeOf() override { delete root; }

    int32_t Build(const String& directory, bool useCache, const char16_t* executable = hostPath) {
        delete root;
        // What the field holds before doesn't matter.
        root = reinterpret_cast<ResTreeNode*>(this);
        ExecutableScope scope(installation, executable);
        const int32_t result = tree.BuildResourceTree(directory, useCache, root);
        listed = scope.Files().Count(FileCall::ListFolder);
        opened = scope.Files().Count(FileCall::OpenText);
        return result;
    }
    bool HasStub(const char16_t* name) {
        NodeEntry* entry = root->FindRaw(name);
        return entry != nullptr && entry->Child()->FindRaw(u":DeferredLoadPath") != nullptr;
    }

    Installation installation;
    FPGAResTree tree;
    ResTreeNode* root = nullptr;
    uint64_t listed = 0;
    uint64_t opened = 0;
};

TEST_F(FPGAResTreeOf, RootHasNoNameAndIsUnordered) {
    EXPECT_EQ(Build(installation.System(), false), 0);
    EXPECT_EQ(ExactText(root->GetName()), "");
    EXPECT_EQ(ExactText(root->GetType()), "ProviderResourceTreeRoot");
    EXPECT_FALSE(root->IsOrdered());
    EXPECT_NE(root->GetTypeTable(), nullptr);
}

TEST_F(FPGAResTreeOf, NoMemoryForTheRootIsReportedAndLeavesNull) {
    String directory = installation.System();
    int32_t result = 0;
    root = reinterpret_cast<ResTreeNode*>(this);
    {
        const support::AllocationFaultScope fault(1);
        result = tree.BuildResourceTree(std::move(directory), false, root);
    }
    EXPECT_EQ(result, noMemory);
    EXPECT_EQ(root, nullptr);
    EXPECT_FALSE(installation.HasCache());
}

TEST_F(FPGAResTreeOf, MissingFolderIsAFailureWithAnEmptyRoot) {
    EXPECT_EQ(Build(installation.System(u"missing"), false), failure);
    ASSERT_NE(root, nullptr);
    EXPECT_TRUE(root->Begin().IsEnd());
}

TEST_F(FPGAResTreeOf, FileInThePlaceOfTheFolderIsAFailure) {
    installation.Write("file", "");
    EXPECT_EQ(Build(installation.System(u"file"), false), failure);
    EXPECT_EQ(installation.Read("file"), "");
}

TEST_F(FPGAResTreeOf, RelativeFolderStartsAtTheWorkingFolder) {
    installation.Write("x_resource.xml", "<Target name=\"X\"/>");
    const WorkingFolderScope folder(installation.Root().Native("Targets"));
    EXPECT_EQ(Build(u"QN\\FPGA", false), 0);
    EXPECT_TRUE(installation.HasCache());
    EXPECT_NE(root->FindRaw(u"X"), nullptr);
}

TEST_F(FPGAResTreeOf, EmptyFolderIsTheWorkingFolder) {
    installation.Write("x_resource.xml", "<Target name=\"X\"/>");
    const WorkingFolderScope folder(installation.Root().Native("Targets/QN/FPGA"));
    EXPECT_EQ(Build(u"", false), 0);
    EXPECT_TRUE(installation.HasCache());
}

TEST_F(FPGAResTreeOf, ScanIgnoresAndReplacesTheCacheUnlessItIsWanted) {
    installation.Write("x_resource.xml", "<Target name=\"X\"/>");
    installation.Write("resource_cache.xml", CacheOf("\n   <Target name=\"Old\"/>"));
    installation.Root().SetFileTime(Installation::Below("resource_cache.xml"), 4000000000, 0);
    EXPECT_EQ(Build(installation.System(), false, toolPath), 0);
    EXPECT_EQ(root->FindRaw(u"Old"), nullptr);
    EXPECT_EQ(installation.Cache(), CacheOf(PlainTargetInCache("X", "Targets\\QN\\FPGA\\x_resource.xml")));
}

TEST_F(FPGAResTreeOf, FreshCacheIsReadAndLeftAlone) {
    installation.Write("x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    ASSERT_EQ(Build(installation.System(), false, toolPath), 0);
    installation.Root().SetFileTime(Installation::Below("x_resource.xml"), 1000, 0);
    installation.Root().SetFileTime(Installation::Below("resource_cache.xml"), 1000, 0);
    const std::string cache = installation.Cache();
    EXPECT_EQ(Build(installation.System(), true), 0);
    EXPECT_TRUE(HasStub(u"X"));
    EXPECT_EQ(installation.Cache(), cache);
    // The working directory and the folder of the tool, once each.
    EXPECT_EQ(listed, 2u);
    EXPECT_EQ(opened, 1u);
}

TEST_F(FPGAResTreeOf, MissingCacheIsWritten) {
    installation.Write("x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    EXPECT_EQ(Build(installation.System(), true), 0);
    EXPECT_FALSE(HasStub(u"X"));
    EXPECT_TRUE(installation.HasCache());
    EXPECT_EQ(listed, 2u);
}

TEST_F(FPGAResTreeOf, StaleCacheIsWrittenAnew) {
    installation.Write("x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    installation.Write("resource_cache.xml", CacheOf("\n   <Target name=\"Old\"/>"));
    installation.Root().SetFileTime(Installation::Below("resource_cache.xml"), 1000, 0);
    EXPECT_EQ(Build(installation.System(), true, toolPath), 0);
    EXPECT_FALSE(HasStub(u"X"));
    EXPECT_EQ(root->FindRaw(u"Old"), nullptr);
    EXPECT_EQ(installation.Cache(), CacheOf(PlainTargetInCache("X", "Targets\\QN\\FPGA\\x_resource.xml")));
    EXPECT_GE(listed, 3u);
}

TEST_F(FPGAResTreeOf, CacheWithoutATargetIsWrittenAnew) {
    installation.Write("x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    installation.Write("resource_cache.xml", CacheOf("\n   <Some><K>v</K></Some>"));
    installation.Root().SetFileTime(Installation::Below("resource_cache.xml"), 4000000000, 0);
    EXPECT_EQ(Build(installation.System(), true), 0);
    EXPECT_EQ(root->FindRaw(u"Some"), nullptr);
    EXPECT_NE(installation.Cache().find("\"X\""), std::string::npos);
}

TEST_F(FPGAResTreeOf, FolderInThePlaceOfTheCacheIsNoCache) {
    installation.Write("x_resource.xml", "<Target name=\"X\"/>");
    installation.Root().MakeFolder(Installation::Below("resource_cache.xml"));
    EXPECT_EQ(Build(installation.System(), true), failure);
    EXPECT_NE(root->FindRaw(u"X"), nullptr);
}

TEST_F(FPGAResTreeOf, CacheThatCannotBeWrittenLeavesTheTree) {
    installation.Write("x_resource.xml", "<Target name=\"X\"/>");
    installation.Root().MakeLink("/dev/full", Installation::Below("resource_cache.xml"));
    EXPECT_EQ(Build(installation.System(), false), failure);
    EXPECT_NE(root->FindRaw(u"X"), nullptr);
}

TEST_F(FPGAResTreeOf, HostFindsItsTargetsBesideItself) {
    installation.Write("x_resource.xml", "<Target name=\"X\"><K>v</K></Target>");
    ExecutableScope scope(installation, hostPath);
    FPGAResTree owner;
    ResTreeNode* first = nullptr;
    EXPECT_EQ(owner.GetRootNode(first), 0);
    ASSERT_NE(first, nullptr);
    EXPECT_NE(first->FindRaw(u"X"), nullptr);
    EXPECT_TRUE(installation.HasCache());
    ResTreeNode* second = nullptr;
    EXPECT_EQ(owner.GetRootNode(second), 0);
    EXPECT_EQ(second, first);
}

TEST_F(FPGAResTreeOf, HostWithoutTargetsIsToldOnceAndGoesOnWithAnEmptyTree) {
    const qn::dsc::osdep::TemporaryFolder empty;
    qn::dsc::osdep::FaultyFileSystem files;
    files.SetExecutablePath(empty.System(u"host"));
    const qn::dsc::osdep::FileSystemScope scope(files);
    FPGAResTree owner;
    ResTreeNode* node = nullptr;
    EXPECT_EQ(owner.GetRootNode(node), failure);
    EXPECT_EQ(node, nullptr);
    empty.WriteFile("Targets/QN/FPGA/x_resource.xml", "<Target name=\"X\"/>");
    EXPECT_EQ(owner.GetRootNode(node), 0);
    ASSERT_NE(node, nullptr);
    EXPECT_TRUE(node->Begin().IsEnd());
}

TEST_F(FPGAResTreeOf, HostRuntimeSaysWhereTheTargetsAre) {
    installation.Write("x_resource.xml", "<Target name=\"X\"/>");
    EXPECT_IN_CHILD([&] {
        LoadStandInRuntime().specialDirectories[28] =
            qn::dsc::NarrowString(installation.Root().System(u"Targets")).CStr();
        FPGAResTree owner;
        ResTreeNode* node = nullptr;
        return owner.GetRootNode(node) == 0 && node->FindRaw(u"X") != nullptr;
    });
}

TEST_F(FPGAResTreeOf, HostRuntimeWithoutAnAnswerLeavesAPathBelowTheWorkingFolder) {
    installation.Write("x_resource.xml", "<Target name=\"X\"/>");
    EXPECT_IN_CHILD([&] {
        LoadStandInRuntime().Fail("HostGetSpecialDir", 7);
        const WorkingFolderScope folder(installation.Root().Native("Targets"));
        FPGAResTree owner;
        ResTreeNode* node = nullptr;
        return owner.GetRootNode(node) == 0 && node->FindRaw(u"X") != nullptr;
    });
}

TEST(FPGAResTreeSingleton, IsMadeOnce) {
    EXPECT_IN_CHILD([] {
        FPGAResTree* tree = gFPGAResTree();
        return tree != nullptr && gFPGAResTree() == tree;
    });
}

TEST(FPGAResTreeSingletonDeathTest, TakesItsTreeDownAtExit) {
    const Installation installation;
    installation.Write("x_resource.xml", "<Target name=\"X\"><Sub><K>v</K></Sub></Target>");
    // The second file removes what the first one made.
    installation.Write("y_resource.xml", "<Some><A name=\"Same\"><K>v</K></A></Some>");
    installation.Write("z_resource.xml", "<Some><B name=\"Same\"><K>v</K></B></Some>");
    struct Farewell : ResTreeNodeChangeObserver {
        ~Farewell() override { std::fputs("gone", stderr); }
        void OnNodeChanged(ResTreeNode*, uint32_t, int32_t) override {}
        bool DeleteWithNode() override { return true; }
    };
    EXPECT_EXIT(
        {
            ExecutableScope scope(installation, hostPath);
            ResTreeNode* node = nullptr;
            if (gFPGAResTree()->GetRootNode(node) == 0) {
                node->Lookup(u"X/Sub", nullptr)->AddObserver(new Farewell, NodeDeleted, 7);
            }
            std::exit(0);
        },
        testing::ExitedWithCode(0), "^gone$");
}

TEST(ToolRun, GivesTheResultOfTheTreeOrElseOfTheMenus) {
    const Installation installation;
    installation.WriteDeviceSpecs();
    installation.Write("a/a_resource.xml", TargetOfFamily("A", "virtex5"));
    EXPECT_IN_CHILD([&] {
        ExecutableScope scope(installation, toolPath);
        std::string program = "tool";
        std::string missing = "missing";
        char* noArgument[] = {program.data(), nullptr};
        char* wrongArgument[] = {program.data(), missing.data(), nullptr};
        return RunTool(1, noArgument) == 0 && installation.Read("a/menu.txt") == "v5" &&
               RunTool(2, wrongArgument) == failure;
    });
}

TEST(ToolRun, NoMemoryForTheRootIsItsResult) {
    const Installation installation;
    EXPECT_IN_CHILD([&] {
        ExecutableScope scope(installation, toolPath);
        std::string program = "tool";
        std::string argument = installation.Root().Native("Targets/QN/FPGA");
        char* arguments[] = {program.data(), argument.data(), nullptr};
        // Which allocation is that of the root depends on what stands before it; all failures pass but that one.
        for (uint64_t nth = 1; nth < 100; ++nth) {
            const support::AllocationFaultScope fault(nth);
            try {
                if (RunTool(2, arguments) == noMemory) {
                    return true;
                }
            } catch (const std::bad_alloc&) {
            }
        }
        return false;
    });
}

}  // namespace
}  // namespace zkhw
