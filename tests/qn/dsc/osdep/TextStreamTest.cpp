#include "qn/dsc/osdep/TextStream.h"

#include <cerrno>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "support/FaultyFileSystem.h"
#include "support/TemporaryFolder.h"

namespace qn::dsc::osdep {

namespace {

// As callers make it: narrow text in code page 0.
NarrowString Narrow(const String& path) {
    return NarrowString(path);
}

std::string ReadOnce(TextStream& stream, size_t count) {
    std::string bytes(count, '#');
    bytes.resize(stream.Read(bytes.data(), count));
    return bytes;
}

// Bytes above 0x7F too, but none that Windows translates.
std::string Pattern(size_t count) {
    std::string bytes;
    for (size_t i = 0; i < count; ++i) {
        const auto byte = static_cast<unsigned char>(i * 31 + i / 256);
        bytes.push_back(static_cast<char>(byte < ' ' ? byte + ' ' : byte));
    }
    return bytes;
}

TEST(TextStream, ReadsBlocksAndIsShortOnlyAtTheEnd) {
    const TemporaryFolder folder;
    const std::string bytes = Pattern(10000);
    folder.WriteFile("file", bytes);
    TextStream stream;
    ASSERT_TRUE(stream.OpenForReading(Narrow(folder.System(u"file"))));
    EXPECT_EQ(ReadOnce(stream, 4096), bytes.substr(0, 4096));
    EXPECT_EQ(ReadOnce(stream, 4096), bytes.substr(4096, 4096));
    EXPECT_EQ(ReadOnce(stream, 4096), bytes.substr(8192));
    EXPECT_EQ(ReadOnce(stream, 4096), "");
}

TEST(TextStream, AFileOfOneBlockEndsWithAnEmptyOne) {
    const TemporaryFolder folder;
    folder.WriteFile("file", Pattern(4096));
    TextStream stream;
    ASSERT_TRUE(stream.OpenForReading(Narrow(folder.System(u"file"))));
    EXPECT_EQ(ReadOnce(stream, 4096).size(), 4096u);
    EXPECT_EQ(ReadOnce(stream, 4096).size(), 0u);
}

// Windows translates line ends, and ends a text at 0x1A: TextStream_windowsTest.cpp.
TEST(TextStream, NothingIsTranslatedOnReadingAsOnlyLinuxTranslatesNothing) {
    const TemporaryFolder folder;
    const std::string bytes("a\r\nb\n\x1A\0c", 8);
    folder.WriteFile("file", bytes);
    TextStream stream;
    ASSERT_TRUE(stream.OpenForReading(Narrow(folder.System(u"file"))));
    EXPECT_EQ(ReadOnce(stream, 4096), bytes);
}

TEST(TextStream, AnEmptyFileGivesNothing) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    TextStream stream;
    ASSERT_TRUE(stream.OpenForReading(Narrow(folder.System(u"file"))));
    EXPECT_EQ(ReadOnce(stream, 4096), "");
}

TEST(TextStream, AReadThatTheSystemCutsShortGoesOn) {
    const TemporaryFolder folder;
    folder.WriteFile("file", Pattern(5000));
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.LimitTransfer(7);
    TextStream stream;
    ASSERT_TRUE(stream.OpenForReading(Narrow(folder.System(u"file"))));
    EXPECT_EQ(ReadOnce(stream, 4096), Pattern(5000).substr(0, 4096));
    EXPECT_EQ(ReadOnce(stream, 4096), Pattern(5000).substr(4096));
}

TEST(TextStream, AFailedReadIsShort) {
    const TemporaryFolder folder;
    folder.WriteFile("file", Pattern(5000));
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.LimitTransfer(1000);
    files.Fail(FileCall::ReadBytes, 3, EIO);
    TextStream stream;
    ASSERT_TRUE(stream.OpenForReading(Narrow(folder.System(u"file"))));
    EXPECT_EQ(ReadOnce(stream, 4096), Pattern(2000));
}

TEST(TextStream, WritesAllOfTheText) {
    const TemporaryFolder folder;
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_GE(stream.Put(Pattern(10000).c_str()), 0);
    EXPECT_EQ(folder.ReadFile("file"), Pattern(10000));
}

TEST(TextStream, NothingIsTranslatedOnWritingAsOnlyLinuxTranslatesNothing) {
    const TemporaryFolder folder;
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_GE(stream.Put("line\nsecond\r\n"), 0);
    EXPECT_EQ(folder.ReadFile("file"), "line\nsecond\r\n");
}

TEST(TextStream, CountedBytesMayHoldNul) {
    const TemporaryFolder folder;
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_GE(stream.Put("a\0b", 3), 0);
    EXPECT_EQ(folder.ReadFile("file"), std::string("a\0b", 3));
}

TEST(TextStream, NothingIsBuffered) {
    const TemporaryFolder folder;
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_EQ(folder.ReadFile("file"), "");
    EXPECT_GE(stream.Put("x"), 0);
    EXPECT_EQ(folder.ReadFile("file"), "x");
}

TEST(TextStream, OneTextIsOneWrite) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_GE(stream.Put(std::string(1000000, 'x').c_str()), 0);
    EXPECT_EQ(files.Count(FileCall::WriteBytes), 1u);
}

TEST(TextStream, AnEmptyTextIsWrittenWithoutFailure) {
    const TemporaryFolder folder;
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_GE(stream.Put(""), 0);
    EXPECT_EQ(folder.ReadFile("file"), "");
}

TEST(TextStream, AWriteThatTheSystemCutsShortGoesOn) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.LimitTransfer(3);
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_GE(stream.Put("0123456789"), 0);
    EXPECT_EQ(folder.ReadFile("file"), "0123456789");
    EXPECT_EQ(files.Count(FileCall::WriteBytes), 4u);
}

TEST(TextStream, AFailedWriteIsNegative) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.LimitTransfer(3);
    files.Fail(FileCall::WriteBytes, 2, ENOSPC);
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_LT(stream.Put("0123456789"), 0);
    EXPECT_EQ(folder.ReadFile("file"), "012");
}

TEST(TextStream, AWriteThatTakesNothingIsNegative) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.LimitTransfer(0);
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_LT(stream.Put("x"), 0);
}

// Windows has no /dev/full.
TEST(TextStream, AFullDiskIsNoticedAtOneByteAsOnlyLinuxHasFullDevices) {
    const TemporaryFolder folder;
    folder.MakeLink("/dev/full", "file");
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_LT(stream.Put("x"), 0);
}

TEST(TextStream, OpeningForWritingEmptiesTheFileAtOnce) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "old");
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_EQ(folder.ReadFile("file"), "");
}

// Windows has no permission bits.
TEST(TextStream, OpeningForWritingKeepsTheFilesOwnPermissionsAsOnlyLinuxHasPermissions) {
    const TemporaryFolder folder;
    TextStream stream;
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_EQ(folder.Permissions("file") & 0600u, 0600u);
    EXPECT_EQ(folder.Permissions("file") & 0111u, 0u);
}

TEST(TextStream, AMissingFileCantBeRead) {
    const TemporaryFolder folder;
    TextStream stream;
    EXPECT_FALSE(stream.OpenForReading(Narrow(folder.System(u"file"))));
    EXPECT_FALSE(stream.IsOpen());
    EXPECT_EQ(folder.Tree(), std::vector<std::string>{});
}

TEST(TextStream, AFolderIsNotOpened) {
    const TemporaryFolder folder;
    folder.MakeFolder("folder");
    TextStream stream;
    EXPECT_FALSE(stream.OpenForReading(Narrow(folder.System(u"folder"))));
    EXPECT_FALSE(stream.OpenForWriting(Narrow(folder.System(u"folder"))));
}

// Windows has no pipes in folders.
TEST(TextStream, OnlyRegularFilesAreOpenedForReadingAsOnlyLinuxHasPipes) {
    const TemporaryFolder folder;
    folder.MakeFolder("folder");
    folder.MakePipe("pipe");
    folder.MakeLink("/dev/zero", "device");
    folder.MakeLink("pipe", "link");
    TextStream stream;
    for (const char16_t* name : {u"folder", u"pipe", u"device", u"link"}) {
        EXPECT_FALSE(stream.OpenForReading(Narrow(folder.System(name))));
    }
}

TEST(TextStream, AFolderCantBeWritten) {
    const TemporaryFolder folder;
    folder.MakeFolder("folder");
    TextStream stream;
    EXPECT_FALSE(stream.OpenForWriting(Narrow(folder.System(u"folder"))));
}

TEST(TextStream, APipeThatNobodyReadsIsNotWaitedForByAWriterAsOnlyLinuxHasPipes) {
    const TemporaryFolder folder;
    folder.MakePipe("pipe");
    TextStream stream;
    EXPECT_FALSE(stream.OpenForWriting(Narrow(folder.System(u"pipe"))));
}

TEST(TextStream, AFileInAMissingFolderCantBeWritten) {
    const TemporaryFolder folder;
    TextStream stream;
    EXPECT_FALSE(stream.OpenForWriting(Narrow(folder.System(u"nope\\file"))));
    EXPECT_FALSE(stream.OpenForWriting(Narrow(u"D:\\file")));
    EXPECT_FALSE(stream.OpenForWriting(Narrow(u"")));
}

TEST(TextStream, LackOfPermissionLeavesTheOldFile) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "old");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailOnPath(FileCall::OpenText, folder.System(u"file"), EACCES);
    TextStream stream;
    EXPECT_FALSE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
    EXPECT_EQ(folder.ReadFile("file"), "old");
}

struct NameFacts {
    const char* native;
    const char16_t* system;
};

void ExpectToBeOpened(const std::vector<NameFacts>& names) {
    const TemporaryFolder folder;
    for (const NameFacts& row : names) {
        folder.WriteFile(row.native, row.native);
        TextStream stream;
        ASSERT_TRUE(stream.OpenForReading(Narrow(folder.System(row.system)))) << row.native;
        EXPECT_EQ(ReadOnce(stream, 4096), row.native);
    }
}

TEST(TextStream, NarrowPathsLeadToNamesOutsideAscii) {
    ExpectToBeOpened({{"plain", u"plain"}, {"\xC3\xA9", u"\x00E9"}, {"\xF0\x9F\x98\x80", u"\xD83D\xDE00"}});
}

// Names are UTF-16 on Windows, and may not hold every sign.
TEST(TextStream, NarrowPathsLeadToEveryNativeNameAsOnlyLinuxNamesAreBytes) {
    ExpectToBeOpened({{"\xFF\xC3", u"\xDCFF\xDCC3"},
                      {"a\\b",
                       u"a\xF05C"
                       u"b"},
                      {"\xEF\x81\x9C", u"\xF05C"}});
}

TEST(TextStream, NamesMatchBlindToLetterCase) {
    const TemporaryFolder folder;
    folder.WriteFile("Sub/File.XML", "abc");
    TextStream stream;
    ASSERT_TRUE(stream.OpenForReading(Narrow(folder.System(u"SUB\\file.xml"))));
    EXPECT_EQ(ReadOnce(stream, 10), "abc");
    ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"sub\\FILE.xml"))));
    EXPECT_GE(stream.Put("new"), 0);
    EXPECT_EQ(folder.Tree(), (std::vector<std::string>{"Sub/", "Sub/File.XML"}));
    EXPECT_EQ(folder.ReadFile("Sub/File.XML"), "new");
}

TEST(TextStream, AClosedStreamGivesNothing) {
    TextStream stream;
    char unit;
    EXPECT_FALSE(stream.IsOpen());
    EXPECT_EQ(stream.Read(&unit, 1), 0u);
    EXPECT_LT(stream.Put("x"), 0);
    EXPECT_LT(stream.Put(""), 0);
    stream.Close();
}

TEST(TextStream, OpeningAgainClosesTheFirstFile) {
    const TemporaryFolder folder;
    folder.WriteFile("a", "first");
    folder.WriteFile("b", "second");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    TextStream stream;
    ASSERT_TRUE(stream.OpenForReading(Narrow(folder.System(u"a"))));
    ASSERT_TRUE(stream.OpenForReading(Narrow(folder.System(u"b"))));
    EXPECT_EQ(files.OpenFiles(), 1);
    EXPECT_EQ(ReadOnce(stream, 10), "second");
    EXPECT_FALSE(stream.OpenForReading(Narrow(folder.System(u"nope"))));
    EXPECT_EQ(files.OpenFiles(), 0);
}

TEST(TextStream, TheDestructorCloses) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    {
        TextStream stream;
        ASSERT_TRUE(stream.OpenForWriting(Narrow(folder.System(u"file"))));
        EXPECT_EQ(files.OpenFiles(), 1);
    }
    EXPECT_EQ(files.OpenFiles(), 0);
}

}  // namespace

}  // namespace qn::dsc::osdep
