#include <cerrno>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/OSException.h"
#include "qn/dsc/osdep/path.h"
#include "support/ExactText.h"
#include "support/FaultyFileSystem.h"
#include "support/SmallStack.h"
#include "support/TemporaryFolder.h"

namespace qn::dsc::osdep {

namespace {

using Names = std::vector<std::string>;

// Every file and folder that is made, in order, as paths below `base`.
class RecordingFileSystem : public FaultyFileSystem {
  public:
    explicit RecordingFileSystem(const String& basePath) : base(ExactText(basePath)) {}

    int MakeFolder(const String& path) override {
        made.push_back(ExactText(path).substr(base.size()) + "/");
        return FaultyFileSystem::MakeFolder(path);
    }
    int OpenBinary(const String& path, uint32_t mode, FileHandle& file) override {
        if ((mode & BinaryMode::Create) != 0) {
            made.push_back(ExactText(path).substr(base.size()));
        }
        return FaultyFileSystem::OpenBinary(path, mode, file);
    }

    Names made;

  private:
    std::string base;
};

TEST(CopyDirectoryTree, CopiesFilesAndFolders) {
    const TemporaryFolder folder;
    folder.WriteFile("from/a", "in a");
    folder.WriteFile("from/sub/b", "in b");
    folder.MakeFolder("from/sub/empty");
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    EXPECT_EQ(folder.Tree(), (Names{"from/", "from/a", "from/sub/", "from/sub/b", "from/sub/empty/", "to/", "to/a",
                                    "to/sub/", "to/sub/b", "to/sub/empty/"}));
    EXPECT_EQ(folder.ReadFile("to/a"), "in a");
    EXPECT_EQ(folder.ReadFile("to/sub/b"), "in b");
}

TEST(CopyDirectoryTree, TakesPathsWithAndWithoutABackslashAtTheEnd) {
    const TemporaryFolder folder;
    folder.WriteFile("from/sub/a", "x");
    folder.MakeFolder("to");
    CopyDirectoryTree(folder.System(u"from\\"), folder.System(u"to"));
    EXPECT_EQ(folder.ReadFile("to/sub/a"), "x");
}

TEST(CopyDirectoryTree, OverwritesFilesOfTheSameNameAndLeavesTheOthers) {
    const TemporaryFolder folder;
    folder.WriteFile("from/a", "new");
    folder.WriteFile("from/sub/b", "new");
    folder.WriteFile("to/A", "old and longer");
    folder.WriteFile("to/SUB/B", "old");
    folder.WriteFile("to/other", "old");
    folder.WriteFile("to/SUB/other", "old");
    CopyDirectoryTree(folder.System(u"from\\"), folder.System(u"to\\"));
    EXPECT_EQ(folder.Tree(), (Names{"from/", "from/a", "from/sub/", "from/sub/b", "to/", "to/A", "to/SUB/", "to/SUB/B",
                                    "to/SUB/other", "to/other"}));
    EXPECT_EQ(folder.ReadFile("to/A"), "new");
    EXPECT_EQ(folder.ReadFile("to/SUB/B"), "new");
    EXPECT_EQ(folder.ReadFile("to/other"), "old");
}

TEST(CopyDirectoryTree, ASecondCopyChangesNothing) {
    const TemporaryFolder folder;
    folder.WriteFile("from/sub/a", "x");
    CopyDirectoryTree(folder.System(u"from\\"), folder.System(u"to\\"));
    const Names tree = folder.Tree();
    CopyDirectoryTree(folder.System(u"from\\"), folder.System(u"to\\"));
    EXPECT_EQ(folder.Tree(), tree);
    EXPECT_EQ(folder.ReadFile("to/sub/a"), "x");
}

TEST(CopyDirectoryTree, BothPathsMustBeAbsolute) {
    const TemporaryFolder folder;
    EXPECT_THROW(CopyDirectoryTree(u"a", folder.System()), exception::InvalidArgument);
    EXPECT_THROW(CopyDirectoryTree(folder.System(), u"a"), exception::InvalidArgument);
}

TEST(CopyDirectoryTree, ASourceThatIsNoFolderIsReported) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    EXPECT_THROW(CopyDirectoryTree(folder.System(u"nope"), folder.System(u"to\\")), exception::NonexistentException);
    EXPECT_THROW(CopyDirectoryTree(folder.System(u"file"), folder.System(u"to\\")), exception::NonexistentException);
    EXPECT_EQ(folder.Tree(), (Names{"file"}));
}

TEST(CopyDirectoryTree, CreatesTheFoldersAboveTheDestination) {
    const TemporaryFolder folder;
    folder.MakeFolder("from");
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"a\\b\\c\\"));
    EXPECT_EQ(folder.Tree(), (Names{"a/", "a/b/", "a/b/c/", "from/"}));
}

TEST(CopyDirectoryTree, ADestinationWithoutBackslashIsNotCreated) {
    const TemporaryFolder folder;
    folder.WriteFile("from/file", "");
    EXPECT_THROW(CopyDirectoryTree(folder.System(u"from"), folder.System(u"to")), PosixError);
    EXPECT_FALSE(folder.Exists("to"));
}

TEST(CopyDirectoryTree, CopiesTheContentOfAFolderWhenItIsMet) {
    const TemporaryFolder folder;
    for (const char* name : {"c", "A", "b/z", "b/y/x", "b/w", "D/v", "e"}) {
        folder.WriteFile(std::string("from/") + name, name);
    }
    RecordingFileSystem files(folder.System(u""));
    const FileSystemScope scope(files);
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    EXPECT_EQ(files.made, (Names{"to/", "to\\A", "to\\b/", "to\\b\\w", "to\\b\\y/", "to\\b\\y\\x", "to\\b\\z", "to\\c",
                                 "to\\D/", "to\\D\\v", "to\\e"}));
}

// On Windows no two names of a folder differ in letter case alone.
TEST(CopyDirectoryTree, NamesThatDifferInCaseBecomeOneAsOnlyLinuxTellsCaseApart) {
    const TemporaryFolder folder;
    folder.WriteFile("from/FILE", "upper");
    folder.WriteFile("from/file", "lower");
    folder.WriteFile("from/SUB/a", "upper");
    folder.WriteFile("from/sub/b", "lower");
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    const Names tree = folder.Tree();
    EXPECT_EQ(Names(tree.begin() + 7, tree.end()), (Names{"to/", "to/FILE", "to/SUB/", "to/SUB/a", "to/SUB/b"}));
    // The second one, in listing order, overwrote the first.
    EXPECT_EQ(folder.ReadFile("to/FILE"), "lower");
}

// Names are UTF-16 on Windows, and may not hold every sign.
TEST(CopyDirectoryTree, EveryNativeNameIsCopiedAsOnlyLinuxNamesAreBytes) {
    const TemporaryFolder folder;
    const Names names = {"a\\b", "\xFF",  "\xF0\x9F\x98\x80", "C:", "a:b", "*", "...", "\xED\xA0\x80",
                         "x.",   ".\x01", "..\xE2\x80\x8B"};
    for (const std::string& name : names) {
        folder.WriteFile("from/" + name, name);
    }
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    for (const std::string& name : names) {
        EXPECT_EQ(folder.ReadFile("to/" + name), name);
    }
    EXPECT_EQ(folder.Tree().size(), 2 * (names.size() + 1));
}

TEST(CopyDirectoryTree, AFolderWhoseNameEndsInADotStopsTheCopy) {
    const TemporaryFolder folder;
    folder.WriteFile("from/a", "");
    folder.MakeFolder("from/b.");
    folder.WriteFile("from/c", "");
    EXPECT_THROW(CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\")), exception::InvalidArgument);
    EXPECT_TRUE(folder.Exists("to/a"));
    EXPECT_FALSE(folder.Exists("to/b."));
    EXPECT_FALSE(folder.Exists("to/c"));
}

TEST(CopyDirectoryTree, LinksAreFollowed) {
    const TemporaryFolder folder;
    folder.WriteFile("elsewhere/a", "in a");
    folder.MakeFolder("from");
    folder.MakeLink("../elsewhere", "from/folder");
    folder.MakeLink("../elsewhere/a", "from/file");
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    EXPECT_EQ(folder.ReadFile("to/folder/a"), "in a");
    EXPECT_EQ(folder.ReadFile("to/file"), "in a");
}

TEST(CopyDirectoryTree, ALinkBackUpThePathIsNotEntered) {
    const TemporaryFolder folder;
    folder.WriteFile("from/sub/a", "");
    folder.MakeLink("..", "from/sub/up");
    folder.MakeLink(".", "from/self");
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    const Names tree = folder.Tree();
    EXPECT_EQ(Names(tree.begin() + 5, tree.end()), (Names{"to/", "to/sub/", "to/sub/a"}));
}

TEST(CopyDirectoryTree, AFolderReachedByTwoPathsIsCopiedTwice) {
    const TemporaryFolder folder;
    folder.WriteFile("from/a/file", "x");
    folder.MakeLink("a", "from/b");
    folder.MakeLink("a", "from/c");
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    EXPECT_EQ(folder.ReadFile("to/a/file"), "x");
    EXPECT_EQ(folder.ReadFile("to/b/file"), "x");
    EXPECT_EQ(folder.ReadFile("to/c/file"), "x");
}

TEST(CopyDirectoryTree, LinksIntoEachOtherEnd) {
    const TemporaryFolder folder;
    folder.MakeFolder("from/a");
    folder.MakeFolder("from/b");
    folder.MakeLink("../b", "from/a/to_b");
    folder.MakeLink("../a", "from/b/to_a");
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    const Names tree = folder.Tree();
    EXPECT_EQ(Names(tree.begin() + 5, tree.end()), (Names{"to/", "to/a/", "to/a/to_b/", "to/b/", "to/b/to_a/"}));
}

TEST(CopyDirectoryTree, ACopyIntoAFolderOfItsOwnEnds) {
    const TemporaryFolder folder;
    folder.WriteFile("from/a", "x");
    folder.WriteFile("from/sub/b", "y");
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"from\\to\\"));
    EXPECT_EQ(folder.Tree(), (Names{"from/", "from/a", "from/sub/", "from/sub/b", "from/to/", "from/to/a",
                                    "from/to/sub/", "from/to/sub/b"}));
}

TEST(CopyDirectoryTree, ACopyIntoTheFolderAboveIsAnOrdinaryOne) {
    const TemporaryFolder folder;
    folder.WriteFile("top/from/a", "x");
    folder.WriteFile("top/from/from/b", "y");
    CopyDirectoryTree(folder.System(u"top\\from"), folder.System(u"top\\"));
    EXPECT_EQ(folder.Tree(),
              (Names{"top/", "top/a", "top/from/", "top/from/a", "top/from/b", "top/from/from/", "top/from/from/b"}));
}

// Wine doesn't show links that lead nowhere or in a circle.
TEST(CopyDirectoryTree, ADanglingLinkStopsTheCopyAsOnlyLinuxHasDanglingLinks) {
    const TemporaryFolder folder;
    folder.WriteFile("from/a", "");
    folder.MakeLink("nowhere", "from/b");
    EXPECT_THROW(CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\")), PosixError);
    EXPECT_TRUE(folder.Exists("to/a"));
}

// Windows has no pipes in folders.
TEST(CopyDirectoryTree, APipeStopsTheCopyAtOnceAsOnlyLinuxHasPipes) {
    const TemporaryFolder folder;
    folder.MakeFolder("from");
    folder.MakePipe("from/pipe");
    EXPECT_THROW(CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\")), PosixError);
}

TEST(CopyDirectoryTree, AnUnreadableFolderIsCopiedAsAnEmptyOne) {
    const TemporaryFolder folder;
    folder.WriteFile("from/a/file", "");
    folder.WriteFile("from/b/file", "");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailOnPath(FileCall::BeginSearch, folder.System(u"from\\a\\*"), EACCES);
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    EXPECT_TRUE(folder.Exists("to/a"));
    EXPECT_FALSE(folder.Exists("to/a/file"));
    EXPECT_TRUE(folder.Exists("to/b/file"));
}

TEST(CopyDirectoryTree, AFileInTheWayOfAFolderIsReported) {
    const TemporaryFolder folder;
    folder.MakeFolder("from/sub");
    folder.WriteFile("to/sub", "");
    EXPECT_THROW(CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\")), exception::ObjectAlreadyExists);
}

TEST(CopyDirectoryTree, AFolderInTheWayOfAFileIsReported) {
    const TemporaryFolder folder;
    folder.WriteFile("from/sub", "");
    folder.MakeFolder("to/sub");
    EXPECT_THROW(CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\")), PosixError);
}

TEST(CopyDirectoryTree, AFailureLeavesTheCopiesMadeSoFar) {
    const TemporaryFolder folder;
    folder.WriteFile("from/a", "in a");
    folder.WriteFile("from/b", "in b");
    folder.WriteFile("from/c", "in c");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::WriteBytes, 2, ENOSPC);
    EXPECT_THROW(CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\")), exception::FileWriteFailed);
    EXPECT_EQ(folder.ReadFile("to/a"), "in a");
    EXPECT_EQ(folder.ReadFile("to/b"), "");
    EXPECT_FALSE(folder.Exists("to/c"));
}

TEST(CopyDirectoryTree, NoFailureLeavesAnythingOpen) {
    const TemporaryFolder folder;
    folder.WriteFile("from/a", "in a");
    folder.WriteFile("from/sub/b", "in b");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to0\\"));
    const uint64_t calls = files.Count(FileCall::Any);
    ASSERT_GT(calls, 20u);
    for (uint64_t nth = 1; nth <= calls; ++nth) {
        const String destination = folder.System(u"to") + String(std::to_string(nth).c_str()) + u"\\";
        files.Fail(FileCall::Any, nth, EIO);
        try {
            CopyDirectoryTree(folder.System(u"from"), destination);
        } catch (const exception::Exception&) {
            // Which of them it is depends on the call.
        }
        files.Clear();
        EXPECT_EQ(files.OpenFiles(), 0) << nth;
        EXPECT_EQ(files.OpenSearches(), 0) << nth;
    }
}

TEST(CopyDirectoryTree, CopiesNestedFoldersOnASmallStack) {
    const TemporaryFolder folder;
    folder.MakeFolder("a");
    folder.MakeFolder("b");
    const uint32_t depth = FoldersBeyondTheSmallStack(2000);
    folder.MakeNestedFolders("d", depth);
    RunOnSmallStack([&folder] { EXPECT_NO_THROW(CopyDirectoryTree(folder.System(u"d"), folder.System(u"b\\"))); });
    String deepest = folder.System(u"b");
    for (uint32_t i = 1; i < depth; ++i) {
        deepest.Append(u"\\d");
    }
    EXPECT_TRUE(IsDirectory(deepest));
    EXPECT_FALSE(IsDirectory(deepest + u"\\d"));
}

TEST(CopyDirectoryTree, CopiesAFolderOfManyFilesInReasonableTime) {
    const TemporaryFolder folder;
    constexpr int count = 3000;
    for (int i = 0; i < count; ++i) {
        folder.WriteFile("from/n" + std::to_string(i), "");
    }
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    CopyDirectoryTree(folder.System(u"from"), folder.System(u"to\\"));
    EXPECT_EQ(folder.Tree().size(), 2u * (count + 1));
}

}  // namespace

}  // namespace qn::dsc::osdep
