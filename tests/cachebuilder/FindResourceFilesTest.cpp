#include <algorithm>

#include <gtest/gtest.h>

#include "cachebuilder/TargetDiscovery.h"
#include "qn/dsc/osdep/AllocationFault.h"
#include "support/ExactText.h"
#include "support/FaultyFileSystem.h"
#include "support/SmallStack.h"
#include "support/TemporaryFolder.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::osdep::FaultyFileSystem;
using qn::dsc::osdep::FileCall;
using qn::dsc::osdep::FileSystemScope;
using qn::dsc::osdep::TemporaryFolder;
using Names = std::vector<std::string>;

class FindResourceFilesIn : public testing::Test {
  protected:
    // What is found, without the folder's own path.
    Names Found() const {
        std::vector<String> files;
        FindResourceFiles(folder.System(), u"*resource.xml", files);
        return WithoutFolder(files);
    }

    Names WithoutFolder(const std::vector<String>& files) const {
        const std::string head = ExactText(folder.System()) + "\\";
        Names names;
        for (const String& file : files) {
            const std::string name = ExactText(file);
            EXPECT_EQ(name.substr(0, head.size()), head);
            names.push_back(name.substr(head.size()));
        }
        return names;
    }

    TemporaryFolder folder;
};

TEST_F(FindResourceFilesIn, OwnMatchesComeBeforeThoseOfTheFolders) {
    folder.WriteFile("z_resource.xml", "");
    folder.WriteFile("a/a_resource.xml", "");
    folder.WriteFile("a/deep/d_resource.xml", "");
    folder.WriteFile("b/b_resource.xml", "");
    EXPECT_EQ(Found(), (Names{"z_resource.xml", "a\\a_resource.xml", "a\\deep\\d_resource.xml", "b\\b_resource.xml"}));
}

TEST_F(FindResourceFilesIn, NamesAscendBlindToLetterCase) {
    for (const char* name : {"b_resource.xml", "A_resource.xml", "_resource.xml", "C_RESOURCE.XML", "1resource.xml"}) {
        folder.WriteFile(name, "");
    }
    // "_" stands behind the upper-cased letters.
    EXPECT_EQ(Found(), (Names{"1resource.xml", "A_resource.xml", "b_resource.xml", "C_RESOURCE.XML", "_resource.xml"}));
}

TEST_F(FindResourceFilesIn, OnlyNamesThatEndAsThePatternAreFound) {
    folder.WriteFile("resource.xml", "");
    folder.WriteFile("resource_cache.xml", "");
    folder.WriteFile("a_resource.xml.bak", "");
    folder.WriteFile("a_resource.xm", "");
    folder.WriteFile("myresource.xml", "");
    EXPECT_EQ(Found(), (Names{"myresource.xml", "resource.xml"}));
}

TEST_F(FindResourceFilesIn, FolderWithTheNameOfAResourceFileIsListedAndEntered) {
    folder.WriteFile("odd_resource.xml/in_resource.xml", "");
    EXPECT_EQ(Found(), (Names{"odd_resource.xml", "odd_resource.xml\\in_resource.xml"}));
}

TEST_F(FindResourceFilesIn, AppendsToWhatIsThere) {
    folder.WriteFile("a_resource.xml", "");
    std::vector<String> files{u"before"};
    FindResourceFiles(folder.System(), u"*resource.xml", files);
    ASSERT_EQ(files.size(), 2u);
    EXPECT_EQ(ExactText(files[0]), "before");
}

TEST_F(FindResourceFilesIn, EmptyAndMissingFoldersGiveNothing) {
    EXPECT_EQ(Found(), Names{});
    std::vector<String> files;
    FindResourceFiles(folder.System(u"missing"), u"*resource.xml", files);
    EXPECT_TRUE(files.empty());
    FindResourceFiles(u"", u"*resource.xml", files);
    EXPECT_TRUE(files.empty());
}

TEST_F(FindResourceFilesIn, FolderThatIsALinkUpwardsIsNotEntered) {
    folder.WriteFile("a/a_resource.xml", "");
    folder.MakeLink("..", "a/up");
    folder.MakeLink(".", "a/self");
    EXPECT_EQ(Found(), (Names{"a\\a_resource.xml"}));
}

TEST_F(FindResourceFilesIn, FolderReachedByTwoPathsIsEnteredTwice) {
    folder.WriteFile("a/a_resource.xml", "");
    folder.MakeLink("a", "b");
    EXPECT_EQ(Found(), (Names{"a\\a_resource.xml", "b\\a_resource.xml"}));
}

TEST_F(FindResourceFilesIn, TwoFoldersThatLinkToEachOtherEndTheWalk) {
    folder.WriteFile("a/a_resource.xml", "");
    folder.WriteFile("b/b_resource.xml", "");
    folder.MakeLink("../b", "a/other");
    folder.MakeLink("../a", "b/other");
    EXPECT_EQ(Found(), (Names{"a\\a_resource.xml", "a\\other\\b_resource.xml", "b\\b_resource.xml",
                              "b\\other\\a_resource.xml"}));
}

TEST_F(FindResourceFilesIn, LinkToAFileIsAFile) {
    folder.WriteFile("elsewhere/x.txt", "");
    folder.MakeLink("elsewhere/x.txt", "a_resource.xml");
    folder.MakeLink("nowhere", "b_resource.xml");
    EXPECT_EQ(Found(), (Names{"a_resource.xml", "b_resource.xml"}));
}

TEST_F(FindResourceFilesIn, FolderThatCannotBeListedIsPassedOver) {
    folder.WriteFile("a/a_resource.xml", "");
    folder.WriteFile("b/b_resource.xml", "");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailOnPath(FileCall::ListFolder, folder.System(u"a"), EACCES);
    EXPECT_EQ(Found(), (Names{"b\\b_resource.xml"}));
}

TEST_F(FindResourceFilesIn, FolderWithoutAnIdentityIsStillEntered) {
    folder.WriteFile("a/a_resource.xml", "");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailFromThenOn(FileCall::ReadIdentity, 1, EIO);
    EXPECT_EQ(Found(), (Names{"a\\a_resource.xml"}));
}

TEST_F(FindResourceFilesIn, EachFolderIsListedOnce) {
    folder.MakeFolder("a/b");
    folder.WriteFile("c_resource.xml", "");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    Found();
    EXPECT_EQ(files.Count(FileCall::ListFolder), 3u);
    EXPECT_EQ(files.Count(FileCall::BeginSearch), 0u);
    EXPECT_EQ(files.OpenWalks(), 0);
}

TEST_F(FindResourceFilesIn, DeepFoldersTakeNoStack) {
    std::string deepest = "d";
    for (int i = 0; i < 900; ++i) {
        deepest += "/d";
    }
    folder.WriteFile(deepest + "/deep_resource.xml", "");
    Names found;
    qn::dsc::osdep::RunOnSmallStack([&] { found = Found(); });
    ASSERT_EQ(found.size(), 1u);
    EXPECT_TRUE(found[0].ends_with("\\d\\d\\deep_resource.xml"));
}

TEST_F(FindResourceFilesIn, RunningOutOfMemoryShortensTheListAndNothingElse) {
    folder.WriteFile("a/a_resource.xml", "");
    folder.WriteFile("b/b_resource.xml", "");
    folder.WriteFile("0_resource.xml", "");
    const Names all{"0_resource.xml", "a\\a_resource.xml", "b\\b_resource.xml"};
    const String directory = folder.System();
    const String pattern(u"*resource.xml");
    bool wasShort = false;
    bool wentOnBehindAFailure = false;
    uint64_t total = 0;
    for (uint64_t nth = 1; nth <= total + 1; ++nth) {
        std::vector<String> files;
        qn::dsc::osdep::FailAllocation(nth, false);
        FindResourceFiles(directory, pattern, files);
        qn::dsc::osdep::ClearAllocationFault();
        total = qn::dsc::osdep::AllocationCount();
        const Names found = WithoutFolder(files);
        EXPECT_TRUE(std::includes(all.begin(), all.end(), found.begin(), found.end())) << "allocation " << nth;
        wasShort |= found.size() < all.size();
        wentOnBehindAFailure |= found == Names{"0_resource.xml", "b\\b_resource.xml"};
    }
    EXPECT_TRUE(wasShort);
    EXPECT_TRUE(wentOnBehindAFailure);
    EXPECT_EQ(Found(), all);
}

}  // namespace
}  // namespace zkhw
