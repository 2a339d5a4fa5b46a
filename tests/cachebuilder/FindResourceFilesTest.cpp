#include <algorithm>

#include <gtest/gtest.h>

#include "cachebuilder/TargetDiscovery.h"
#include "qn/dsc/osdep/AllocationFault.h"
#include "qn/dsc/osdep/FileFinder.h"
#include "qn/dsc/osdep/path.h"
#include "support/ExactText.h"
#include "support/FaultyFileSystem.h"
#include "support/SmallStack.h"
#include "support/TemporaryFolder.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::osdep::FaultyFileSystem;
using qn::dsc::osdep::FileCall;
using qn::dsc::osdep::FileFinder;
using qn::dsc::osdep::FileIdentity;
using qn::dsc::osdep::FileSystemScope;
using qn::dsc::osdep::GetFileName;
using qn::dsc::osdep::GetFileSystem;
using qn::dsc::osdep::IsDirectory;
using qn::dsc::osdep::JoinPath;
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
    EXPECT_EQ(Found(), Names{"a_resource.xml"});
}

// Wine doesn't show links that lead nowhere or in a circle.
TEST_F(FindResourceFilesIn, DanglingLinkIsAFileAsOnlyLinuxHasDanglingLinks) {
    folder.MakeLink("nowhere", "b_resource.xml");
    EXPECT_EQ(Found(), Names{"b_resource.xml"});
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
    folder.MakeLink("a", "b");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailFromThenOn(FileCall::ReadIdentity, 1, EIO);
    EXPECT_EQ(Found(), (Names{"a\\a_resource.xml", "b\\a_resource.xml"}));
    EXPECT_GT(files.Count(FileCall::ReadIdentity), 0u);
}

TEST_F(FindResourceFilesIn, FolderThatVanishesAheadOfTheWalkIsPassedOver) {
    folder.WriteFile("a/a_resource.xml", "");
    folder.WriteFile("b/b_resource.xml", "");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailOnPath(FileCall::EnterFolder, folder.System(u"a"), ENOENT);
    EXPECT_EQ(Found(), (Names{"b\\b_resource.xml"}));
}

TEST_F(FindResourceFilesIn, NothingIsFoundWhereTheWalkCannotBegin) {
    folder.WriteFile("a_resource.xml", "");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailOnPath(FileCall::BeginWalk, folder.System(), EACCES);
    EXPECT_EQ(Found(), Names{});
}

TEST_F(FindResourceFilesIn, EachSingleFailureCostsOneFolderAtMost) {
    folder.WriteFile("a/a_resource.xml", "");
    folder.WriteFile("a/deep/d_resource.xml", "");
    folder.WriteFile("b/b_resource.xml", "");
    folder.MakeLink("../b", "a/link");
    const Names all = Found();
    ASSERT_EQ(all.size(), 4u);
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    Found();
    const uint64_t total = files.Count(FileCall::Any);
    for (uint64_t nth = 1; nth <= total; ++nth) {
        files.Fail(FileCall::Any, nth, EIO);
        const Names found = Found();
        files.Clear();
        EXPECT_TRUE(std::includes(all.begin(), all.end(), found.begin(), found.end())) << "call " << nth;
        // Without the beginning there is nothing, and "a" has three.
        EXPECT_GE(found.size(), nth <= 2 ? 0u : 1u) << "call " << nth;
        EXPECT_EQ(files.OpenWalks(), 0) << "call " << nth;
    }
}

TEST_F(FindResourceFilesIn, NobodyIsAskedWhoAFolderIsWithoutALink) {
    folder.WriteFile("a/b/c/c_resource.xml", "");
    folder.MakeLink("a/b/c/c_resource.xml", "file");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    EXPECT_EQ(Found(), (Names{"a\\b\\c\\c_resource.xml"}));
    EXPECT_EQ(files.Count(FileCall::ReadIdentity), 0u);
}

TEST_F(FindResourceFilesIn, PlainFolderBehindALinkUpwardsIsNotEnteredAgain) {
    folder.WriteFile("top_resource.xml", "");
    folder.WriteFile("start/s_resource.xml", "");
    folder.WriteFile("other/o_resource.xml", "");
    folder.MakeLink("..", "start/up");
    std::vector<String> files;
    FindResourceFiles(folder.System(u"start"), u"*resource.xml", files);
    // "start\\up\\start" is where the walk began.
    EXPECT_EQ(WithoutFolder(files),
              (Names{"start\\s_resource.xml", "start\\up\\top_resource.xml", "start\\up\\other\\o_resource.xml"}));
}

// Only Linux ends a path at its 41st link.
TEST_F(FindResourceFilesIn, LoopOfLinksThatCannotBeIdentifiedEndsAtTheLimitOfTheSystemAsOnlyLinuxLimitsLinks) {
    folder.WriteFile("a_resource.xml", "");
    folder.MakeLink(".", "self");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailFromThenOn(FileCall::ReadIdentity, 1, EIO);
    // A path may lead through 40 links.
    EXPECT_EQ(Found().size(), 41u);
}

TEST_F(FindResourceFilesIn, FolderBehindALinkHasItsOwnFolders) {
    folder.WriteFile("real/in/x_resource.xml", "");
    folder.MakeLink("real/in", "z_resource.xml");
    EXPECT_EQ(Found(), (Names{"z_resource.xml", "real\\in\\x_resource.xml", "z_resource.xml\\x_resource.xml"}));
}

TEST_F(FindResourceFilesIn, PipeWithTheNameOfAResourceFileIsListedAndNotWaitedFor) {
    folder.MakePipe("p_resource.xml");
    folder.MakePipe("pipe");
    folder.MakeLink("pipe", "link");
    EXPECT_EQ(Found(), (Names{"p_resource.xml"}));
}

TEST_F(FindResourceFilesIn, StartMayBeWrittenInOtherLetterCaseAndWithASeparator) {
    folder.WriteFile("Sub/In/a_resource.xml", "");
    std::vector<String> files;
    FindResourceFiles(folder.System(u"SUB\\"), u"*resource.xml", files);
    EXPECT_EQ(WithoutFolder(files), (Names{"SUB\\In\\a_resource.xml"}));
}

TEST_F(FindResourceFilesIn, FoldersOfARelativeDirectoryAreNotEntered) {
    folder.WriteFile("sub/a_resource.xml", "");
    folder.WriteFile("sub/in/b_resource.xml", "");
    folder.WriteFile("c_resource.xml", "");
    const qn::dsc::osdep::WorkingFolderScope working(folder.Native());
    std::vector<String> files;
    FindResourceFiles(u"sub", u"*resource.xml", files);
    FindResourceFiles(u"", u"*resource.xml", files);
    ASSERT_EQ(files.size(), 2u);
    EXPECT_EQ(ExactText(files[0]), "sub\\a_resource.xml");
    EXPECT_EQ(ExactText(files[1]), "c_resource.xml");
}

// The definition, without regard to what it costs: the matches of a folder, then those of each folder in it.
void FindByDefinition(const String& directory, std::vector<FileIdentity> above, std::vector<String>& files) {
    FileIdentity identity;
    const bool isIdentified = GetFileSystem().ReadIdentity(directory, identity) == 0;
    if (isIdentified && std::find(above.begin(), above.end(), identity) != above.end()) {
        return;
    }
    above.push_back(isIdentified ? identity : FileIdentity());
    for (const String& match : FileFinder().ListFiles(JoinPath(directory, u"*resource.xml"))) {
        files.push_back(match);
    }
    for (const String& entry : FileFinder().ListFiles(JoinPath(directory, u"*"))) {
        const String name = GetFileName(entry);
        if (!(name == u".") && !(name == u"..") && IsDirectory(entry)) {
            FindByDefinition(entry, above, files);
        }
    }
}

// Names are UTF-16 on Windows, and may not hold every sign.
TEST_F(FindResourceFilesIn, OddNamesAndLinksAreFoundAsTheDefinitionSaysAsOnlyLinuxNamesAreBytes) {
    const char* const odd[] = {"\xFF\xFE",
                               "caf\xC3\xA9",
                               "CAF\xC3\x89",
                               "back\\slash",
                               "back\xEF\x81\x9Cslash",
                               "lone\xEF\x81\x9C",
                               "\xF0\x9F\x98\x80",
                               "\xED\xA0\x80",
                               "A",
                               "a",
                               "...",
                               "C:",
                               " "};
    folder.MakeFolder("links");
    for (const char* name : odd) {
        folder.WriteFile(std::string(name) + "/x_resource.xml", "");
        folder.WriteFile(std::string(name) + "/" + name + "resource.xml", "");
        folder.WriteFile(std::string(name) + "_Resource.XML", "");
        folder.MakeLink(std::string("../") + name, std::string("links/to") + name);
    }
    folder.MakeLink("../a", "A/over");
    folder.MakeLink("../A", "a/over");
    folder.MakeLink("..", "A/up");
    folder.MakeLink("nowhere", "dangling_resource.xml");
    folder.MakeLink("round", "round");
    std::vector<String> expected;
    FindByDefinition(folder.System(), {}, expected);
    std::vector<String> files;
    FindResourceFiles(folder.System(), u"*resource.xml", files);
    // 14 in the folder itself, two in each folder and behind each link, and two behind each way to an "over".
    EXPECT_EQ(files.size(), 74u);
    EXPECT_EQ(WithoutFolder(files), WithoutFolder(expected));
}

TEST_F(FindResourceFilesIn, FileAmongTenThousandIsFound) {
    for (int i = 0; i < 10000; ++i) {
        folder.WriteFile("f" + std::to_string(i) + (i % 5000 == 0 ? "_resource.xml" : "_resource.xm"), "");
    }
    EXPECT_EQ(Found(), (Names{"f0_resource.xml", "f5000_resource.xml"}));
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
    for (uint32_t i = 0; i < qn::dsc::osdep::FoldersBeyondTheSmallStack(900); ++i) {
        deepest += "/d";
    }
    folder.WriteFile(deepest + "/deep_resource.xml", "");
    Names found;
    qn::dsc::osdep::RunOnSmallStack([&] { found = Found(); });
    ASSERT_EQ(found.size(), 1u);
    EXPECT_TRUE(found[0].ends_with("\\d\\d\\deep_resource.xml"));
}

// The system below Wine takes no path of more than 4,095 bytes.
TEST_F(FindResourceFilesIn, WalkEndsWherePathsBecomeTooLongAsOnlyLinuxNestsSoDeep) {
    // A path has at most 32767 units: no folder further down has a path.
    folder.MakeNestedFolders(std::string(200, 'd'), 200);
    folder.WriteFile("a_resource.xml", "");
    folder.WriteFile("e/e_resource.xml", "");
    Names found;
    qn::dsc::osdep::RunOnSmallStack([&] { found = Found(); });
    EXPECT_EQ(found, (Names{"a_resource.xml", "e\\e_resource.xml"}));
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
