#include "qn/dsc/osdep/BinaryFile.h"

#include <cerrno>
#include <cstring>
#include <string>

#include <gtest/gtest.h>

#include "qn/dsc/osdep/OSException.h"
#include "support/FaultyFileSystem.h"
#include "support/TemporaryFolder.h"

namespace qn::dsc::osdep {

namespace {

std::string ReadAll(BinaryFile& file) {
    std::string bytes;
    char block[16];
    for (int32_t got = file.Read(block, sizeof block); got > 0; got = file.Read(block, sizeof block)) {
        bytes.append(block, static_cast<size_t>(got));
    }
    return bytes;
}

// The number that opening fails with; 0 if it doesn't.
uint32_t OpenError(const String& path, uint32_t mode) {
    try {
        const BinaryFile file(path, mode);
        return 0;
    } catch (const PosixError& failure) {
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/osdep/BinaryFile");
        EXPECT_GT(failure.GetLine(), 0);
        return failure.GetSystemError();
    }
}

TEST(BinaryFile, ModeBitsHaveTheirValues) {
    EXPECT_EQ(BinaryMode::Read, 1u);
    EXPECT_EQ(BinaryMode::Write, 2u);
    EXPECT_EQ(BinaryMode::ReadWrite, 4u);
    EXPECT_EQ(BinaryMode::Truncate, 8u);
    EXPECT_EQ(BinaryMode::Create, 16u);
}

TEST(BinaryFile, ReadsAFileToItsEnd) {
    const TemporaryFolder folder;
    const std::string bytes("line\r\n\x1A\0end\xFF", 12);
    folder.WriteFile("file", bytes);
    BinaryFile file(folder.System(u"file"), BinaryMode::Read);
    EXPECT_TRUE(file.IsOpen());
    EXPECT_EQ(ReadAll(file), bytes);
    char unit;
    EXPECT_EQ(file.Read(&unit, 1), 0);
}

TEST(BinaryFile, AReadOnlyFileCantBeWritten) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    BinaryFile file(folder.System(u"file"), BinaryMode::Read);
    EXPECT_EQ(file.Write("x", 1), -1);
    EXPECT_EQ(folder.ReadFile("file"), "abc");
}

TEST(BinaryFile, AWriteOnlyFileCantBeRead) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    BinaryFile file(folder.System(u"file"), BinaryMode::Write);
    char unit;
    EXPECT_EQ(file.Read(&unit, 1), -1);
    EXPECT_EQ(file.Write("X", 1), 1);
    EXPECT_EQ(folder.ReadFile("file"), "Xbc");
}

TEST(BinaryFile, AFileForBothCanBeReadAndWritten) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    BinaryFile file(folder.System(u"file"), BinaryMode::ReadWrite);
    char unit = 0;
    EXPECT_EQ(file.Read(&unit, 1), 1);
    EXPECT_EQ(unit, 'a');
    EXPECT_EQ(file.Write("X", 1), 1);
    EXPECT_EQ(folder.ReadFile("file"), "aXc");
}

TEST(BinaryFile, TruncateEmptiesTheFile) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    BinaryFile file(folder.System(u"file"), BinaryMode::Write | BinaryMode::Truncate);
    EXPECT_EQ(folder.ReadFile("file"), "");
}

TEST(BinaryFile, AMissingFileIsNotCreatedUnasked) {
    const TemporaryFolder folder;
    EXPECT_EQ(OpenError(folder.System(u"file"), BinaryMode::Read), static_cast<uint32_t>(ENOENT));
    EXPECT_EQ(OpenError(folder.System(u"file"), BinaryMode::ReadWrite | BinaryMode::Truncate),
              static_cast<uint32_t>(ENOENT));
    EXPECT_EQ(folder.Tree(), std::vector<std::string>{});
}

// Windows has no permission bits.
TEST(BinaryFile, CreateMakesAFileForItsOwnerAloneAsOnlyLinuxHasPermissions) {
    const TemporaryFolder folder;
    BinaryFile file(folder.System(u"file"), BinaryMode::Create | BinaryMode::ReadWrite);
    EXPECT_EQ(file.Write("abc", 3), 3);
    EXPECT_EQ(folder.ReadFile("file"), "abc");
    EXPECT_EQ(folder.Permissions("file"), 0600u);
}

TEST(BinaryFile, CreateKeepsAFileThatStands) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    BinaryFile file(folder.System(u"file"), BinaryMode::Create | BinaryMode::ReadWrite);
    EXPECT_EQ(ReadAll(file), "abc");
}

TEST(BinaryFile, CreateNeedsTheFolder) {
    const TemporaryFolder folder;
    EXPECT_EQ(OpenError(folder.System(u"nope\\file"), BinaryMode::Create | BinaryMode::Write),
              static_cast<uint32_t>(ENOENT));
}

TEST(BinaryFile, AFailedOpenTellsNumberAndText) {
    const TemporaryFolder folder;
    try {
        const BinaryFile file(folder.System(u"nope"), BinaryMode::Read);
        FAIL();
    } catch (const PosixError& failure) {
        EXPECT_EQ(failure.GetSystemError(), static_cast<uint32_t>(ENOENT));
        EXPECT_STREQ(failure.what(), std::strerror(ENOENT));
        EXPECT_EQ(failure.GetErrorCode(), 7);
    }
}

TEST(BinaryFile, LackOfPermissionIsAPosixError) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::OpenBinary, 1, EACCES);
    try {
        const BinaryFile file(folder.System(u"file"), BinaryMode::Read);
        FAIL();
    } catch (const PosixError& failure) {
        EXPECT_EQ(failure.GetSystemError(), static_cast<uint32_t>(EACCES));
        EXPECT_EQ(failure.GetErrorCode(), 42);
    }
}

TEST(BinaryFile, OpeningTwiceIsAPosixErrorAndKeepsTheFile) {
    const TemporaryFolder folder;
    folder.WriteFile("a", "first");
    folder.WriteFile("b", "second");
    BinaryFile file(folder.System(u"a"), BinaryMode::Read);
    EXPECT_THROW(file.Open(folder.System(u"b"), BinaryMode::Read), PosixError);
    EXPECT_TRUE(file.IsOpen());
    EXPECT_EQ(ReadAll(file), "first");
}

TEST(BinaryFile, AClosedFileGivesMinusOne) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    BinaryFile file(folder.System(u"file"), BinaryMode::ReadWrite);
    file.Close();
    char unit;
    EXPECT_FALSE(file.IsOpen());
    EXPECT_EQ(file.Read(&unit, 1), -1);
    EXPECT_EQ(file.Write("x", 1), -1);
    EXPECT_EQ(file.Read(&unit, 0), -1);
    EXPECT_EQ(folder.ReadFile("file"), "abc");
}

TEST(BinaryFile, AnObjectThatWasNeverOpenedGivesMinusOne) {
    BinaryFile file;
    char unit;
    EXPECT_FALSE(file.IsOpen());
    EXPECT_EQ(file.Read(&unit, 1), -1);
    EXPECT_EQ(file.Write("x", 1), -1);
    file.Close();
}

TEST(BinaryFile, CanBeOpenedAgainOnceClosed) {
    const TemporaryFolder folder;
    folder.WriteFile("a", "first");
    folder.WriteFile("b", "second");
    BinaryFile file(folder.System(u"a"), BinaryMode::Read);
    file.Close();
    file.Close();
    file.Open(folder.System(u"b"), BinaryMode::Read);
    EXPECT_EQ(ReadAll(file), "second");
}

TEST(BinaryFile, TheDestructorCloses) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    {
        const BinaryFile file(folder.System(u"file"), BinaryMode::Read);
        EXPECT_EQ(files.OpenFiles(), 1);
    }
    EXPECT_EQ(files.OpenFiles(), 0);
    EXPECT_EQ(files.Count(FileCall::CloseFile), 1u);
}

TEST(BinaryFile, FailedReadsAndWritesGiveMinusOne) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    BinaryFile file(folder.System(u"file"), BinaryMode::ReadWrite);
    files.Fail(FileCall::ReadBytes, 1, EIO);
    files.Fail(FileCall::WriteBytes, 1, ENOSPC);
    char unit;
    EXPECT_EQ(file.Read(&unit, 1), -1);
    EXPECT_EQ(file.Write("x", 1), -1);
    EXPECT_EQ(file.Read(&unit, 1), 1);
}

TEST(BinaryFile, AShortWriteTellsWhatWasTaken) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    BinaryFile file(folder.System(u"file"), BinaryMode::Create | BinaryMode::Write);
    files.LimitTransfer(2);
    EXPECT_EQ(file.Write("abc", 3), 2);
    EXPECT_EQ(folder.ReadFile("file"), "ab");
}

TEST(BinaryFile, IsCutToALength) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abcdef");
    BinaryFile file(folder.System(u"file"), BinaryMode::ReadWrite);
    EXPECT_TRUE(file.CutAt(2));
    EXPECT_EQ(folder.ReadFile("file"), "ab");
}

TEST(BinaryFile, GoesOnBehindWhatACutLeaves) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abcdef");
    BinaryFile file(folder.System(u"file"), BinaryMode::ReadWrite);
    char bytes[5];
    EXPECT_EQ(file.Read(bytes, 5), 5);
    EXPECT_TRUE(file.CutAt(2));
    EXPECT_EQ(file.Read(bytes, 5), 0);
    EXPECT_EQ(file.Write("x", 1), 1);
    EXPECT_EQ(folder.ReadFile("file"), "abx");
}

TEST(BinaryFile, ACutBehindTheEndFillsUpWithZeroes) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "ab");
    BinaryFile file(folder.System(u"file"), BinaryMode::ReadWrite);
    EXPECT_TRUE(file.CutAt(4));
    EXPECT_EQ(folder.ReadFile("file"), std::string("ab\0\0", 4));
}

TEST(BinaryFile, OnlyWhatIsOpenForWritingIsCut) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    BinaryFile file(folder.System(u"file"), BinaryMode::Read);
    EXPECT_FALSE(file.CutAt(1));
    file.Close();
    EXPECT_FALSE(file.CutAt(1));
    EXPECT_EQ(folder.ReadFile("file"), "abc");
}

TEST(BinaryFile, AFolderIsNotOpened) {
    const TemporaryFolder folder;
    folder.MakeFolder("folder");
    EXPECT_EQ(OpenError(folder.System(u"folder"), BinaryMode::Read), static_cast<uint32_t>(EACCES));
    EXPECT_EQ(OpenError(folder.System(u"folder"), BinaryMode::ReadWrite), static_cast<uint32_t>(EACCES));
}

// Windows has no pipes in folders.
TEST(BinaryFile, OnlyRegularFilesAreOpenedForReadingAsOnlyLinuxHasPipes) {
    const TemporaryFolder folder;
    folder.MakeFolder("folder");
    folder.MakePipe("pipe");
    folder.MakeLink("/dev/zero", "device");
    folder.MakeLink("folder", "link");
    for (const char16_t* name : {u"folder", u"pipe", u"device", u"link"}) {
        EXPECT_EQ(OpenError(folder.System(name), BinaryMode::Read), static_cast<uint32_t>(EACCES));
        EXPECT_EQ(OpenError(folder.System(name), BinaryMode::ReadWrite), static_cast<uint32_t>(EACCES));
    }
}

TEST(BinaryFile, AFolderCantBeOpenedForWriting) {
    const TemporaryFolder folder;
    folder.MakeFolder("folder");
    EXPECT_EQ(OpenError(folder.System(u"folder"), BinaryMode::Write), static_cast<uint32_t>(EACCES));
    EXPECT_EQ(OpenError(folder.System(u"folder"), BinaryMode::Write | BinaryMode::Create | BinaryMode::Truncate),
              static_cast<uint32_t>(EACCES));
}

TEST(BinaryFile, APipeThatNobodyReadsIsNotWaitedForByAWriterAsOnlyLinuxHasPipes) {
    const TemporaryFolder folder;
    folder.MakePipe("pipe");
    EXPECT_NE(OpenError(folder.System(u"pipe"), BinaryMode::Write), 0u);
}

// Windows has no /dev/full.
TEST(BinaryFile, AFullDeviceRefusesTheWriteAsOnlyLinuxHasFullDevices) {
    const TemporaryFolder folder;
    folder.MakeLink("/dev/full", "device");
    BinaryFile file(folder.System(u"device"), BinaryMode::Write);
    EXPECT_EQ(file.Write("x", 1), -1);
}

TEST(BinaryFile, ALinkToAFileIsFollowed) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    folder.MakeLink("file", "link");
    BinaryFile file(folder.System(u"link"), BinaryMode::Read);
    EXPECT_EQ(ReadAll(file), "abc");
}

// Wine doesn't show links that lead nowhere or in a circle.
TEST(BinaryFile, AFileCreatedThroughADanglingLinkIsWhereTheLinkLeadsAsOnlyLinuxHasDanglingLinks) {
    const TemporaryFolder folder;
    folder.MakeLink("target", "link");
    BinaryFile file(folder.System(u"link"), BinaryMode::Create | BinaryMode::Write);
    EXPECT_EQ(file.Write("x", 1), 1);
    EXPECT_EQ(folder.ReadFile("target"), "x");
}

}  // namespace

}  // namespace qn::dsc::osdep
