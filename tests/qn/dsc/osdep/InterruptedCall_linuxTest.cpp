// System calls that a signal interrupts, and one that fails when it no longer matters. The calls themselves are
// replaced here, in a program of their own.

#include <dirent.h>
#include <dlfcn.h>
#include <fcntl.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <cerrno>
#include <cstdarg>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "qn/dsc/osdep/FileFinder.h"
#include "qn/dsc/osdep/FileSystem.h"
#include "qn/dsc/osdep/TextStream.h"
#include "support/ExactText.h"
#include "support/TemporaryFolder.h"

namespace {

// How many of the next calls fail.
int opensToInterrupt = 0;
int listingsToInterrupt = 0;
int namesToInterrupt = 0;
int settingsToRefuse = 0;

bool Fails(int& count, int error) {
    if (count == 0) {
        return false;
    }
    --count;
    errno = error;
    return true;
}

}  // namespace

extern "C" int openat(int folder, const char* path, int flags, ...) {
    if (Fails(opensToInterrupt, EINTR)) {
        return -1;
    }
    std::va_list arguments;
    va_start(arguments, flags);
    const auto permissions = va_arg(arguments, mode_t);
    va_end(arguments);
    return static_cast<int>(syscall(SYS_openat, folder, path, flags, permissions));
}

extern "C" ssize_t getdents64(int folder, void* listing, size_t size) {
    return Fails(listingsToInterrupt, EINTR) ? -1 : syscall(SYS_getdents64, folder, listing, size);
}

extern "C" dirent* readdir(DIR* folder) {
    static auto* const original = reinterpret_cast<dirent* (*)(DIR*)>(dlsym(RTLD_NEXT, "readdir"));
    return Fails(namesToInterrupt, EINTR) ? nullptr : original(folder);
}

extern "C" int fcntl(int file, int command, ...) {
    std::va_list arguments;
    va_start(arguments, command);
    const long argument = va_arg(arguments, long);
    va_end(arguments);
    if (command == F_SETFL && Fails(settingsToRefuse, EPERM)) {
        return -1;
    }
    return static_cast<int>(syscall(SYS_fcntl, file, command, argument));
}

namespace qn::dsc::osdep {
namespace {

std::string NamesOfWalk(FolderWalk& walk) {
    std::string names;
    EXPECT_EQ(walk.List(), 0);
    for (size_t number = 0; number < walk.EntryCount(); ++number) {
        names += ExactText(String(walk.EntryAt(number).name)) + ' ';
    }
    return names;
}

TEST(InterruptedCall, OpenOfAFileIsBegunAnew) {
    const TemporaryFolder folder;
    folder.WriteFile("a", "text");
    opensToInterrupt = 2;
    TextStream stream;
    EXPECT_TRUE(stream.OpenForReading(NarrowString(folder.System(u"a"))));
    EXPECT_EQ(opensToInterrupt, 0);
}

TEST(InterruptedCall, OpenOfAFolderToWalkIsBegunAnew) {
    const TemporaryFolder folder;
    folder.WriteFile("a/b", "");
    std::unique_ptr<FolderWalk> walk;
    opensToInterrupt = 1;
    ASSERT_EQ(GetFileSystem().BeginWalk(folder.System(u""), u"*", walk), 0);
    EXPECT_EQ(opensToInterrupt, 0);
    EXPECT_EQ(NamesOfWalk(*walk), ". .. a ");
    opensToInterrupt = 1;
    WayIn way = WayIn::Indirect;
    EXPECT_EQ(walk->Enter(2, way), 0);
    EXPECT_EQ(opensToInterrupt, 0);
    EXPECT_EQ(way, WayIn::Direct);
}

TEST(InterruptedCall, ListingOfAWalkIsBegunAnew) {
    const TemporaryFolder folder;
    folder.WriteFile("a", "");
    std::unique_ptr<FolderWalk> walk;
    ASSERT_EQ(GetFileSystem().BeginWalk(folder.System(u""), u"*", walk), 0);
    listingsToInterrupt = 3;
    EXPECT_EQ(NamesOfWalk(*walk), ". .. a ");
    EXPECT_EQ(listingsToInterrupt, 0);
}

TEST(InterruptedCall, SearchIsBegunAnew) {
    const TemporaryFolder folder;
    folder.WriteFile("a", "");
    opensToInterrupt = 1;
    namesToInterrupt = 2;
    const std::vector<String> found = FileFinder().ListFiles(folder.System(u"a"));
    EXPECT_EQ(opensToInterrupt, 0);
    EXPECT_EQ(namesToInterrupt, 0);
    ASSERT_EQ(found.size(), 1u);
    EXPECT_EQ(ExactText(found[0]), ExactText(folder.System(u"a")));
}

TEST(RefusedSetting, FileThatWasOpenedForWritingIsWritten) {
    const TemporaryFolder folder;
    folder.WriteFile("a", "old");
    settingsToRefuse = 1;
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(NarrowString(folder.System(u"a"))));
    EXPECT_EQ(settingsToRefuse, 0);
    EXPECT_EQ(stream.Put("new text"), 0);
    stream.Close();
    EXPECT_EQ(folder.ReadFile("a"), "new text");
}

}  // namespace
}  // namespace qn::dsc::osdep
