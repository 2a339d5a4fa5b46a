#include <cerrno>
#include <filesystem>
#include <iterator>
#include <memory>
#include <string>
#include <vector>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <unistd.h>

#include "qn/dsc/osdep/FileSystem.h"
#include "support/ExactText.h"
#include "support/TemporaryFolder.h"

// The walk of a folder on a disk whose names are bytes, with the descriptors that it costs.

namespace qn::dsc::osdep {

namespace {

std::unique_ptr<FolderWalk> WalkAt(const String& folder, const char16_t* pattern = u"*resource.xml") {
    std::unique_ptr<FolderWalk> walk;
    EXPECT_EQ(GetNativeFileSystem().BeginWalk(folder, pattern, walk), 0);
    return walk;
}

// "name" for a match, "name/" for what may be a folder, "name|" for both.
std::string Listed(FolderWalk& walk) {
    std::string text;
    EXPECT_EQ(walk.List(), 0);
    for (size_t number = 0; number < walk.EntryCount(); ++number) {
        const WalkEntry entry = walk.EntryAt(number);
        text += (text.empty() ? "" : " ") + ExactText(String(entry.name));
        if (entry.mayBeFolder) {
            text += entry.isMatch ? "|" : "/";
        }
    }
    return text;
}

std::ptrdiff_t OpenDescriptors() {
    const std::filesystem::directory_iterator begin("/proc/self/fd");
    return std::distance(begin, std::filesystem::directory_iterator());
}

// Leaves room for so many descriptors more, until its end.
class DescriptorLimit {
  public:
    explicit DescriptorLimit(rlim_t room) {
        getrlimit(RLIMIT_NOFILE, &before);
        const int next = open("/dev/null", O_RDONLY | O_CLOEXEC);
        close(next);
        const rlimit lower{static_cast<rlim_t>(next) + room, before.rlim_max};
        setrlimit(RLIMIT_NOFILE, &lower);
    }
    ~DescriptorLimit() { setrlimit(RLIMIT_NOFILE, &before); }

    DescriptorLimit(const DescriptorLimit&) = delete;
    DescriptorLimit& operator=(const DescriptorLimit&) = delete;

  private:
    rlimit before{};
};

// Goes down as far as there are folders. How many there were.
uint32_t GoDown(FolderWalk& walk) {
    uint32_t levels = 0;
    WayIn way = WayIn::Direct;
    while (walk.List() == 0 && walk.EntryCount() > 0 && walk.Enter(0, way) == 0) {
        ++levels;
    }
    return levels;
}

TEST(FolderWalk, ListsMatchesAndFoldersInTheOrderOfTheirUpperCase) {
    const TemporaryFolder folder;
    folder.WriteFile("b_resource.xml", "");
    folder.WriteFile("A_RESOURCE.XML", "");
    folder.WriteFile("c.xml", "");
    folder.MakeFolder("d_resource.xml");
    folder.MakeFolder("Aa");
    folder.MakeLink("nowhere", "aB");
    EXPECT_EQ(Listed(*WalkAt(folder.System())), "Aa/ aB/ A_RESOURCE.XML b_resource.xml d_resource.xml|");
}

TEST(FolderWalk, DotsAreMatchesAndNoFolders) {
    const TemporaryFolder folder;
    folder.WriteFile("!", "");
    EXPECT_EQ(Listed(*WalkAt(folder.System(), u"*")), ". .. !");
}

TEST(FolderWalk, ALastUnitOutsideAsciiMatchesInOtherLetterCase) {
    const TemporaryFolder folder;
    folder.WriteFile("caf\xC3\x89", "");
    folder.WriteFile("cafe", "");
    EXPECT_EQ(WalkAt(folder.System(), u"*\u00E9")->List(), 0);
    const auto walk = WalkAt(folder.System(), u"*\u00E9");
    EXPECT_EQ(Listed(*walk), ExactText(String(u"caf\u00C9")));
}

TEST(FolderWalk, AFolderIsEnteredDirectlyAndALinkIsNot) {
    const TemporaryFolder folder;
    folder.MakeFolder("a/in");
    folder.MakeLink("a", "b");
    folder.WriteFile("file", "");
    folder.MakeLink("file", "c");
    const auto walk = WalkAt(folder.System());
    ASSERT_EQ(Listed(*walk), "a/ b/ c/");
    WayIn way = WayIn::Indirect;
    ASSERT_EQ(walk->Enter(0, way), 0);
    EXPECT_EQ(way, WayIn::Direct);
    EXPECT_EQ(Listed(*walk), "in/");
    walk->Leave();
    ASSERT_EQ(walk->Enter(1, way), 0);
    EXPECT_EQ(way, WayIn::Indirect);
    EXPECT_EQ(Listed(*walk), "in/");
    walk->Leave();
    EXPECT_EQ(walk->Enter(2, way), ENOTDIR);
    EXPECT_EQ(walk->EntryCount(), 3u);
}

TEST(FolderWalk, LevelsHaveTheIdentityOfTheirFolders) {
    const TemporaryFolder folder;
    folder.MakeFolder("a");
    const auto walk = WalkAt(folder.System());
    ASSERT_EQ(walk->List(), 0);
    WayIn way = WayIn::Direct;
    ASSERT_EQ(walk->Enter(0, way), 0);
    FileIdentity start;
    FileIdentity below;
    FileIdentity expected;
    ASSERT_EQ(walk->ReadIdentity(0, start), 0);
    ASSERT_EQ(walk->ReadIdentity(1, below), 0);
    ASSERT_EQ(GetNativeFileSystem().ReadIdentity(folder.System(), expected), 0);
    EXPECT_EQ(start, expected);
    ASSERT_EQ(GetNativeFileSystem().ReadIdentity(folder.System(u"a"), expected), 0);
    EXPECT_EQ(below, expected);
}

TEST(FolderWalk, TimesAreThoseOfTheFileSystem) {
    const TemporaryFolder folder;
    folder.WriteFile("a_resource.xml", "");
    folder.MakeLink("a_resource.xml", "b_resource.xml");
    folder.MakeLink("nowhere", "c_resource.xml");
    folder.SetFileTime("a_resource.xml", 1, 200);
    const auto walk = WalkAt(folder.System());
    ASSERT_EQ(walk->List(), 0);
    for (const size_t number : {0u, 1u}) {
        uint64_t time = 0;
        EXPECT_EQ(walk->ReadWriteTime(number, time), 0);
        EXPECT_EQ(time, 116444736010000002u);
    }
    uint64_t time = 7;
    EXPECT_EQ(walk->ReadWriteTime(2, time), ENOENT);
    EXPECT_EQ(time, 7u);
}

TEST(FolderWalk, NothingBeginsWhereThereIsNoFolder) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    std::unique_ptr<FolderWalk> walk;
    EXPECT_EQ(GetNativeFileSystem().BeginWalk(folder.System(u"nope"), u"*", walk), ENOENT);
    EXPECT_EQ(GetNativeFileSystem().BeginWalk(folder.System(u"file"), u"*", walk), ENOTDIR);
    EXPECT_EQ(GetNativeFileSystem().BeginWalk(u"D:\\", u"*", walk), ENOENT);
    EXPECT_EQ(walk, nullptr);
}

TEST(FolderWalk, AFolderThatIsGoneIsNoLongerEntered) {
    const TemporaryFolder folder;
    folder.MakeFolder("a");
    const auto walk = WalkAt(folder.System());
    ASSERT_EQ(Listed(*walk), "a/");
    folder.Remove("a");
    WayIn way = WayIn::Direct;
    EXPECT_EQ(walk->Enter(0, way), ENOENT);
}

TEST(FolderWalk, DepthCostsNoDescriptors) {
    const TemporaryFolder folder;
    folder.MakeNestedFolders("d", 500);
    const std::ptrdiff_t before = OpenDescriptors();
    const auto walk = WalkAt(folder.System());
    EXPECT_EQ(GoDown(*walk), 500u);
    EXPECT_LE(OpenDescriptors() - before, 16);
}

TEST(FolderWalk, APathHasAtMost32767Units) {
    const TemporaryFolder folder;
    folder.MakeNestedFolders(std::string(200, 'd'), 200);
    EXPECT_EQ(GoDown(*WalkAt(folder.System())), (32767 - folder.System().Length()) / 201);
}

TEST(FolderWalk, AFolderFarAboveIsOpenedAgain) {
    const TemporaryFolder folder;
    folder.MakeNestedFolders("d", 100);
    folder.MakeFolder("e/in");
    folder.WriteFile("z_resource.xml", "");
    const auto walk = WalkAt(folder.System());
    const uint32_t levels = GoDown(*walk);
    EXPECT_EQ(levels, 100u);
    for (uint32_t level = 0; level < levels; ++level) {
        walk->Leave();
    }
    uint64_t time = 0;
    EXPECT_EQ(walk->ReadWriteTime(2, time), 0);
    WayIn way = WayIn::Indirect;
    ASSERT_EQ(walk->Enter(1, way), 0);
    EXPECT_EQ(way, WayIn::Direct);
    EXPECT_EQ(Listed(*walk), "in/");
}

// Down four folders and up again.
void ExpectWayDownAndUp(const TemporaryFolder& folder) {
    const auto walk = WalkAt(folder.System());
    EXPECT_EQ(GoDown(*walk), 4u);
    for (int level = 0; level < 4; ++level) {
        walk->Leave();
    }
    uint64_t time = 0;
    EXPECT_EQ(walk->ReadWriteTime(1, time), 0);
}

TEST(FolderWalk, OneDescriptorIsEnough) {
    const TemporaryFolder folder;
    folder.MakeFolder("a/b/c/d");
    folder.WriteFile("z_resource.xml", "");
    // Without the limit first: a sanitizer opens a pipe of its own when it meets an object of a type for the first
    // time.
    ExpectWayDownAndUp(folder);
    const DescriptorLimit limit(1);
    ExpectWayDownAndUp(folder);
}

TEST(FolderWalk, ItsEndClosesEverything) {
    const TemporaryFolder folder;
    folder.MakeNestedFolders("d", 30);
    const std::ptrdiff_t before = OpenDescriptors();
    auto walk = WalkAt(folder.System());
    GoDown(*walk);
    EXPECT_GT(OpenDescriptors(), before);
    walk.reset();
    EXPECT_EQ(OpenDescriptors(), before);
}

}  // namespace

}  // namespace qn::dsc::osdep
