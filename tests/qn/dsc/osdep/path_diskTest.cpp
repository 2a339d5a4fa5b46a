#include <cerrno>
#include <new>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/OSException.h"
#include "qn/dsc/osdep/path.h"
#include "support/ExactText.h"
#include "support/FaultyFileSystem.h"
#include "support/TemporaryFolder.h"

// The operations of path.h that touch the disk. CopyDirectoryTree has a file of its own.

namespace qn::dsc::osdep {

namespace {

using Names = std::vector<std::string>;

TEST(IsDirectory, AFolderIsOne) {
    const TemporaryFolder folder;
    folder.MakeFolder("sub");
    EXPECT_TRUE(IsDirectory(folder.System()));
    EXPECT_TRUE(IsDirectory(folder.System(u"sub")));
    EXPECT_TRUE(IsDirectory(folder.System(u"sub\\")));
    EXPECT_TRUE(IsDirectory(folder.System(u"sub\\.")));
    EXPECT_TRUE(IsDirectory(u"C:\\"));
}

TEST(IsDirectory, AnythingElseIsNot) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    for (const char16_t* name : {u"file", u"file\\", u"nope", u"file\\x"}) {
        EXPECT_FALSE(IsDirectory(folder.System(name))) << ExactText(String(name));
    }
    EXPECT_FALSE(IsDirectory(u""));
}

// Windows has no pipes in folders, and Wine doesn't show links that lead nowhere.
TEST(IsDirectory, APipeOrADanglingLinkIsNotAsOnlyLinuxHasThem) {
    const TemporaryFolder folder;
    folder.MakePipe("pipe");
    folder.MakeLink("nowhere", "dangling");
    EXPECT_FALSE(IsDirectory(folder.System(u"pipe")));
    EXPECT_FALSE(IsDirectory(folder.System(u"dangling")));
}

TEST(IsDirectory, ARelativePathOfARealFolderIsNot) {
    const TemporaryFolder folder;
    folder.MakeFolder("sub");
    const WorkingFolderScope scope(folder.Native());
    EXPECT_FALSE(IsDirectory(u"sub"));
    EXPECT_FALSE(IsDirectory(u"."));
    EXPECT_FALSE(IsDirectory(u"\\"));
    EXPECT_FALSE(IsDirectory(u"C:"));
    EXPECT_FALSE(IsDirectory(u"C:/"));
    EXPECT_TRUE(IsDirectory(MakeAbsolutePath(u"sub")));
}

TEST(IsDirectory, ALinkToAFolderIsOne) {
    const TemporaryFolder folder;
    folder.MakeFolder("sub");
    folder.MakeLink("sub", "link");
    EXPECT_TRUE(IsDirectory(folder.System(u"link")));
}

TEST(IsDirectory, UnreadableAttributesMeanNo) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::ReadAttributes, 1, EACCES);
    EXPECT_FALSE(IsDirectory(folder.System()));
    EXPECT_TRUE(IsDirectory(folder.System()));
}

class NoMemory : public FaultyFileSystem {
  public:
    int ReadAttributes(const String&, FileAttributes&) override { throw std::bad_alloc(); }
};

TEST(IsDirectory, NeverThrows) {
    NoMemory files;
    const FileSystemScope scope(files);
    EXPECT_FALSE(IsDirectory(u"C:\\"));
    EXPECT_THROW(IsExistingFile(u"C:\\"), std::bad_alloc);
}

TEST(IsExistingFile, AFileIsOneAndAFolderIsNot) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    folder.MakeFolder("sub");
    EXPECT_TRUE(IsExistingFile(folder.System(u"file")));
    EXPECT_FALSE(IsExistingFile(folder.System(u"sub")));
    EXPECT_FALSE(IsExistingFile(folder.System(u"nope")));
    EXPECT_FALSE(IsExistingFile(u"D:\\file"));
}

// Windows has no pipes in folders.
TEST(IsExistingFile, WhatIsNoFolderIsAFileAsOnlyLinuxHasPipes) {
    const TemporaryFolder folder;
    folder.MakePipe("pipe");
    EXPECT_TRUE(IsExistingFile(folder.System(u"pipe")));
}

TEST(IsExistingFile, ATrailingBackslashNamesNothing) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    EXPECT_FALSE(IsExistingFile(folder.System(u"file\\")));
}

TEST(IsExistingFile, ARelativePathIsAnInvalidArgument) {
    EXPECT_THROW(IsExistingFile(u"file"), exception::InvalidArgument);
    EXPECT_THROW(IsExistingFile(u""), exception::InvalidArgument);
    EXPECT_THROW(IsExistingFile(u"C:"), exception::InvalidArgument);
    EXPECT_THROW(IsExistingFile(u"\\file"), exception::InvalidArgument);
}

TEST(IsExistingFile, UnreadableAttributesMeanNo) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::ReadAttributes, 1, EACCES);
    EXPECT_FALSE(IsExistingFile(folder.System(u"file")));
}

TEST(GetFileModificationTime, HasTheFullResolution) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    folder.SetFileTime("file", 1000000000, 123456700);
    // 1904 to 1970 is 24107 days. 0.1234567 as a double is 0x1.F9ADBB8F8DA72p-4.
    EXPECT_EQ(GetFileModificationTime(folder.System(u"file")),
              (TimeStamp{24107 * 86400LL + 1000000000, 0x1F9ADBB8F8DA7200}));
}

TEST(GetFileModificationTime, CountsTicksOf100Nanoseconds) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    folder.SetFileTime("file", 1000000000, 99);
    const TimeStamp first = GetFileModificationTime(folder.System(u"file"));
    folder.SetFileTime("file", 1000000000, 100);
    const TimeStamp second = GetFileModificationTime(folder.System(u"file"));
    EXPECT_EQ(first, (TimeStamp{24107 * 86400LL + 1000000000, 0}));
    EXPECT_LT(first, second);
}

TEST(GetFileModificationTime, FoldersAndLinksHaveOne) {
    const TemporaryFolder folder;
    folder.MakeFolder("sub");
    folder.SetFileTime("sub", 5, 0);
    folder.MakeLink("sub", "link");
    EXPECT_EQ(GetFileModificationTime(folder.System(u"sub")), (TimeStamp{24107 * 86400LL + 5, 0}));
    EXPECT_EQ(GetFileModificationTime(folder.System(u"link")), (TimeStamp{24107 * 86400LL + 5, 0}));
}

TEST(GetFileModificationTime, TimesBefore1970Count) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    folder.SetFileTime("file", -1, 500000000);
    EXPECT_EQ(GetFileModificationTime(folder.System(u"file")), (TimeStamp{24107 * 86400LL - 1, 0x8000000000000000}));
}

TEST(GetFileModificationTime, IsZeroIfItCantBeRead) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    EXPECT_EQ(GetFileModificationTime(folder.System(u"nope")), TimeStamp());
    EXPECT_EQ(GetFileModificationTime(u""), TimeStamp());
    EXPECT_EQ(GetFileModificationTime(u"D:\\file"), TimeStamp());
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::ReadAttributes, 1, EACCES);
    EXPECT_EQ(GetFileModificationTime(folder.System(u"file")), TimeStamp());
}

TEST(GetCurrentDirectoryPath, IsInTheSystemsForm) {
    const TemporaryFolder folder;
    folder.MakeFolder("a/Z\xC3\xBCrich");
    const WorkingFolderScope scope(folder.Native("a/Z\xC3\xBCrich"));
    EXPECT_EQ(ExactText(GetCurrentDirectoryPath()), ExactText(folder.System(u"a\\Z\u00FCrich")));
}

// Names are UTF-16 on Windows, and may not hold every sign.
TEST(GetCurrentDirectoryPath, MayHaveAnyBytesAsOnlyLinuxNamesAreBytes) {
    const TemporaryFolder folder;
    folder.MakeFolder("a\\b/\xFF");
    const WorkingFolderScope scope(folder.Native("a\\b/\xFF"));
    EXPECT_EQ(ExactText(GetCurrentDirectoryPath()), ExactText(folder.System(u"a\xF05C"
                                                                            u"b\\\xDCFF")));
}

// Each drive has a root on Windows.
TEST(GetCurrentDirectoryPath, OfTheRootIsTheDriveAsOnlyLinuxHasOneRoot) {
    const WorkingFolderScope scope("/");
    EXPECT_EQ(ExactText(GetCurrentDirectoryPath()), "C:\\");
}

// Windows doesn't remove the working folder of a process.
TEST(GetCurrentDirectoryPath, OfARemovedFolderIsEmptyAsOnlyLinuxRemovesOpenFolders) {
    const TemporaryFolder folder;
    folder.MakeFolder("sub");
    const WorkingFolderScope scope(folder.Native("sub"));
    folder.Remove("sub");
    EXPECT_EQ(ExactText(GetCurrentDirectoryPath()), "");
}

// The call that Windows is asked by gives at most 260 bytes.
TEST(GetCurrentDirectoryPath, MayBeLongerThan260UnitsAsOnlyLinuxHasNoLimit) {
    const TemporaryFolder folder;
    const std::string deep = std::string(200, 'a') + "/" + std::string(200, 'b');
    folder.MakeFolder(deep);
    const WorkingFolderScope scope(folder.Native(deep));
    EXPECT_EQ(GetCurrentDirectoryPath().Length(), folder.System().Length() + 402);
}

TEST(CopyFileTo, CopiesEveryByte) {
    const TemporaryFolder folder;
    std::string bytes;
    for (int i = 0; i < 3 * 4096 + 17; ++i) {
        bytes.push_back(static_cast<char>(i * 7 + i / 256));
    }
    for (const size_t size :
         {size_t{0}, size_t{1}, size_t{4095}, size_t{4096}, size_t{4097}, size_t{8192}, bytes.size()}) {
        folder.WriteFile("from", bytes.substr(0, size));
        CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
        EXPECT_EQ(folder.ReadFile("to"), bytes.substr(0, size));
        EXPECT_EQ(folder.ReadFile("from").size(), size);
    }
}

// Windows has no permission bits.
TEST(CopyFileTo, TheCopyBelongsToItsOwnerAloneAsOnlyLinuxHasPermissions) {
    const TemporaryFolder folder;
    folder.WriteFile("from", "abc");
    CopyFileTo(folder.System(u"from"), folder.System(u"to"), false);
    EXPECT_EQ(folder.Permissions("to"), 0600u);
}

TEST(CopyFileTo, BothPathsMustBeAbsolute) {
    const TemporaryFolder folder;
    folder.WriteFile("from", "abc");
    EXPECT_THROW(CopyFileTo(u"from", folder.System(u"to"), true), exception::InvalidArgument);
    EXPECT_THROW(CopyFileTo(folder.System(u"from"), u"to", true), exception::InvalidArgument);
    EXPECT_THROW(CopyFileTo(u"", u"", true), exception::InvalidArgument);
    EXPECT_EQ(folder.Tree(), (Names{"from"}));
}

TEST(CopyFileTo, OverwritesIfItMay) {
    const TemporaryFolder folder;
    folder.WriteFile("from", "new");
    folder.WriteFile("to", "old and longer");
    CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
    EXPECT_EQ(folder.ReadFile("to"), "new");
}

TEST(CopyFileTo, RefusesAFileThatStandsOtherwise) {
    const TemporaryFolder folder;
    folder.WriteFile("from", "new");
    folder.WriteFile("to", "old");
    EXPECT_THROW(CopyFileTo(folder.System(u"from"), folder.System(u"to"), false), exception::FileAlreadyExists);
    EXPECT_EQ(folder.ReadFile("to"), "old");
}

TEST(CopyFileTo, AFileIsNotCopiedOntoItself) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    CopyFileTo(folder.System(u"file"), folder.System(u"file"), true);
    CopyFileTo(folder.System(u"file"), folder.System(u"FILE"), true);
    EXPECT_EQ(folder.ReadFile("file"), "abc");
}

TEST(CopyFileTo, AFileThatStandsIsRefusedBeforeThePathsAreCompared) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    EXPECT_THROW(CopyFileTo(folder.System(u"file"), folder.System(u"file"), false), exception::FileAlreadyExists);
}

TEST(CopyFileTo, EqualPathsOfNoFileAreNoFailure) {
    const TemporaryFolder folder;
    CopyFileTo(folder.System(u"nope"), folder.System(u"NOPE"), true);
    EXPECT_EQ(folder.Tree(), Names{});
}

TEST(CopyFileTo, AMissingSourceLeavesTheDestination) {
    const TemporaryFolder folder;
    folder.WriteFile("to", "old");
    EXPECT_THROW(CopyFileTo(folder.System(u"nope"), folder.System(u"to"), true), PosixError);
    EXPECT_EQ(folder.ReadFile("to"), "old");
}

TEST(CopyFileTo, AFolderIsNotCopied) {
    const TemporaryFolder folder;
    folder.MakeFolder("sub");
    EXPECT_THROW(CopyFileTo(folder.System(u"sub"), folder.System(u"to"), true), PosixError);
    EXPECT_FALSE(folder.Exists("to"));
}

TEST(CopyFileTo, APipeIsNotCopiedAsOnlyLinuxHasPipes) {
    const TemporaryFolder folder;
    folder.MakePipe("pipe");
    EXPECT_THROW(CopyFileTo(folder.System(u"pipe"), folder.System(u"to"), true), PosixError);
    EXPECT_FALSE(folder.Exists("to"));
}

TEST(CopyFileTo, ADestinationInAMissingFolderIsAPosixError) {
    const TemporaryFolder folder;
    folder.WriteFile("from", "abc");
    EXPECT_THROW(CopyFileTo(folder.System(u"from"), folder.System(u"nope\\to"), true), PosixError);
}

TEST(CopyFileTo, AFailedReadIsReported) {
    const TemporaryFolder folder;
    folder.WriteFile("from", std::string(10000, 'x'));
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    // The second read is that of the destination, which has nothing.
    files.Fail(FileCall::ReadBytes, 3, EIO);
    EXPECT_THROW(CopyFileTo(folder.System(u"from"), folder.System(u"to"), true), exception::FileReadFailed);
    EXPECT_EQ(folder.ReadFile("to").size(), 4096u);
    EXPECT_EQ(files.OpenFiles(), 0);
}

TEST(CopyFileTo, AFailedWriteIsReported) {
    const TemporaryFolder folder;
    folder.WriteFile("from", std::string(10000, 'x'));
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::WriteBytes, 2, ENOSPC);
    EXPECT_THROW(CopyFileTo(folder.System(u"from"), folder.System(u"to"), true), exception::FileWriteFailed);
    EXPECT_EQ(folder.ReadFile("to").size(), 4096u);
    EXPECT_EQ(files.OpenFiles(), 0);
}

// Takes one byte less than it is given.
class AlmostFullDisk : public FaultyFileSystem {
  public:
    int WriteBytes(FileHandle file, const void* buffer, size_t count, size_t& put) override {
        return FaultyFileSystem::WriteBytes(file, buffer, count - 1, put);
    }
};

TEST(CopyFileTo, AShortWriteIsReported) {
    const TemporaryFolder folder;
    folder.WriteFile("from", "abc");
    AlmostFullDisk files;
    const FileSystemScope scope(files);
    EXPECT_THROW(CopyFileTo(folder.System(u"from"), folder.System(u"to"), true), exception::FileWriteFailed);
    EXPECT_EQ(files.OpenFiles(), 0);
}

TEST(CopyFileTo, ReadsBlocksOf4096AndWritesEachAtOnce) {
    const TemporaryFolder folder;
    folder.WriteFile("from", std::string(10000, 'x'));
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
    // Four of the source, and one of the destination.
    EXPECT_EQ(files.Count(FileCall::ReadBytes), 5u);
    EXPECT_EQ(files.Count(FileCall::WriteBytes), 3u);
    EXPECT_EQ(files.Count(FileCall::CutFile), 0u);
    EXPECT_EQ(files.Count(FileCall::CloseFile), 2u);
}

TEST(CopyFileTo, ACopyThatIsThereIsOnlyRead) {
    const TemporaryFolder folder;
    const std::string bytes = std::string(4096, 'a') + std::string(100, 'b');
    folder.WriteFile("from", bytes);
    folder.WriteFile("to", bytes);
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
    EXPECT_EQ(files.Count(FileCall::WriteBytes), 0u);
    EXPECT_EQ(folder.ReadFile("to"), bytes);
}

TEST(CopyFileTo, ACopyThatIsThereIsWrittenAtPresent) {
    const TemporaryFolder folder;
    folder.WriteFile("from", "same");
    folder.WriteFile("to", "same");
    folder.WriteFile("clock", "");
    folder.SetFileTime("from", 1000000000, 0);
    folder.SetFileTime("to", 1000000000, 0);
    CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
    // A file system may keep only every second one.
    const int64_t present = GetFileModificationTime(folder.System(u"clock")).seconds;
    EXPECT_GE(GetFileModificationTime(folder.System(u"to")).seconds, present - 2);
    EXPECT_LT(GetFileModificationTime(folder.System(u"from")).seconds, present - 2);
}

TEST(CopyFileTo, OverwritesFromTheFirstBlockThatDiffers) {
    const TemporaryFolder folder;
    const std::string same(4096, 'a');
    folder.WriteFile("from", same + std::string(4096, 'b') + std::string(10, 'c'));
    folder.WriteFile("to", same + std::string(4095, 'b') + std::string(5000, 'x'));
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
    EXPECT_EQ(files.Count(FileCall::WriteBytes), 2u);
    EXPECT_EQ(folder.ReadFile("to"), folder.ReadFile("from"));
}

TEST(CopyFileTo, ABeginningOfTheFileIsContinued) {
    const TemporaryFolder folder;
    const std::string bytes = std::string(4096, 'a') + std::string(4096, 'b') + "c";
    folder.WriteFile("from", bytes);
    for (const size_t size : {size_t{0}, size_t{1}, size_t{4095}, size_t{4096}, size_t{4097}, size_t{8192}}) {
        folder.WriteFile("to", bytes.substr(0, size));
        CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
        EXPECT_EQ(folder.ReadFile("to"), bytes) << size;
    }
}

TEST(CopyFileTo, WhatTheFileIsABeginningOfIsCut) {
    const TemporaryFolder folder;
    const std::string bytes = std::string(4096, 'a') + std::string(4096, 'b') + "c";
    folder.WriteFile("to", bytes);
    for (const size_t size : {size_t{8192}, size_t{4097}, size_t{4096}, size_t{4095}, size_t{1}, size_t{0}}) {
        folder.WriteFile("from", bytes.substr(0, size));
        CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
        EXPECT_EQ(folder.ReadFile("to"), bytes.substr(0, size));
    }
}

TEST(CopyFileTo, ShortReadsOfWhatStandsAreNoDifference) {
    const TemporaryFolder folder;
    folder.WriteFile("from", std::string(10000, 'x'));
    folder.WriteFile("to", std::string(10000, 'x'));
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.LimitTransfer(999);
    CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
    EXPECT_EQ(files.Count(FileCall::WriteBytes), 0u);
    EXPECT_EQ(folder.ReadFile("to").size(), 10000u);
}

TEST(CopyFileTo, AFileIsNotLostToAnotherNameOfIt) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    folder.MakeLink("file", "other");
    CopyFileTo(folder.System(u"file"), folder.System(u"other"), true);
    CopyFileTo(folder.System(u"other"), folder.System(u"file"), true);
    EXPECT_EQ(folder.ReadFile("file"), "abc");
}

TEST(CopyFileTo, WhatStandsAndCannotBeReadIsWrittenAnew) {
    const TemporaryFolder folder;
    folder.WriteFile("from", "abc");
    folder.WriteFile("to", "abc");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::ReadBytes, 2, EIO);
    CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
    EXPECT_EQ(files.Count(FileCall::WriteBytes), 1u);
    EXPECT_EQ(folder.ReadFile("to"), "abc");
}

TEST(CopyFileTo, WhatCannotBeCutIsReportedAndStays) {
    const TemporaryFolder folder;
    folder.WriteFile("from", "new");
    folder.WriteFile("to", "old and longer");
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::CutFile, 1, EIO);
    EXPECT_THROW(CopyFileTo(folder.System(u"from"), folder.System(u"to"), true), exception::FileWriteFailed);
    EXPECT_EQ(folder.ReadFile("to"), "old and longer");
    EXPECT_EQ(files.OpenFiles(), 0);
}

TEST(CopyFileTo, AReadThatFailsAmongWhatIsAlikeEndsTheCopyThere) {
    const TemporaryFolder folder;
    folder.WriteFile("from", std::string(10000, 'x'));
    folder.WriteFile("to", std::string(10000, 'x'));
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::ReadBytes, 3, EIO);
    EXPECT_THROW(CopyFileTo(folder.System(u"from"), folder.System(u"to"), true), exception::FileReadFailed);
    EXPECT_EQ(folder.ReadFile("to").size(), 4096u);
}

TEST(CopyFileTo, ShortReadsAreNoEnd) {
    const TemporaryFolder folder;
    folder.WriteFile("from", std::string(10000, 'x'));
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.LimitTransfer(999);
    CopyFileTo(folder.System(u"from"), folder.System(u"to"), true);
    EXPECT_EQ(folder.ReadFile("to").size(), 10000u);
}

TEST(CreateOneDirectory, CreatesOneFolder) {
    const TemporaryFolder folder;
    CreateOneDirectory(folder.System(u"a"));
    CreateOneDirectory(folder.System(u"a\\b\\"));
    EXPECT_EQ(folder.Tree(), (Names{"a/", "a/b/"}));
}

TEST(CreateOneDirectory, AFolderThatStandsIsReported) {
    const TemporaryFolder folder;
    folder.MakeFolder("a");
    EXPECT_THROW(CreateOneDirectory(folder.System(u"a")), exception::ObjectAlreadyExists);
    EXPECT_THROW(CreateOneDirectory(folder.System(u"A\\")), exception::ObjectAlreadyExists);
    EXPECT_EQ(folder.Tree(), (Names{"a/"}));
}

TEST(CreateOneDirectory, AFileOfThatNameIsReported) {
    const TemporaryFolder folder;
    folder.WriteFile("a", "x");
    EXPECT_THROW(CreateOneDirectory(folder.System(u"a")), exception::ObjectAlreadyExists);
    EXPECT_THROW(CreateOneDirectory(folder.System(u"A")), exception::ObjectAlreadyExists);
    EXPECT_EQ(folder.ReadFile("a"), "x");
}

TEST(CreateOneDirectory, AMissingParentIsAccessDeniedWithThePath) {
    const TemporaryFolder folder;
    const String path = folder.System(u"nope\\\x00E9");
    try {
        CreateOneDirectory(path);
        FAIL();
    } catch (const exception::AccessDenied& failure) {
        EXPECT_EQ(std::string(failure.what()), "Access denied: " + ExactText(folder.System(u"nope\\")) + "\xC3\xA9");
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/osdep/path");
    }
}

TEST(CreateOneDirectory, AnyOtherFailureIsAccessDenied) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    EXPECT_THROW(CreateOneDirectory(folder.System(u"file\\a")), exception::AccessDenied);
    EXPECT_THROW(CreateOneDirectory(u"D:\\a"), exception::AccessDenied);
    EXPECT_THROW(CreateOneDirectory(u""), exception::AccessDenied);
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    for (const int error : {EACCES, EROFS, ENOSPC}) {
        files.Fail(FileCall::MakeFolder, 1, error);
        EXPECT_THROW(CreateOneDirectory(folder.System(u"a")), exception::AccessDenied);
    }
    EXPECT_FALSE(folder.Exists("a"));
}

TEST(CreateDirectoryPath, CreatesEveryMissingFolder) {
    const TemporaryFolder folder;
    CreateDirectoryPath(folder.System(u"a\\b\\c\\"));
    EXPECT_EQ(folder.Tree(), (Names{"a/", "a/b/", "a/b/c/"}));
}

TEST(CreateDirectoryPath, WhatStandsBehindTheLastBackslashIsNotCreated) {
    const TemporaryFolder folder;
    CreateDirectoryPath(folder.System(u"a\\b"));
    EXPECT_EQ(folder.Tree(), (Names{"a/"}));
}

TEST(CreateDirectoryPath, FoldersThatStandAreLeftAlone) {
    const TemporaryFolder folder;
    folder.WriteFile("a/file", "x");
    CreateDirectoryPath(folder.System(u"A\\b\\"));
    CreateDirectoryPath(folder.System(u"a\\B\\"));
    CreateDirectoryPath(u"C:\\");
    EXPECT_EQ(folder.Tree(), (Names{"a/", "a/b/", "a/file"}));
}

TEST(CreateDirectoryPath, DoubledBackslashesAreNoLevels) {
    const TemporaryFolder folder;
    CreateDirectoryPath(folder.System(u"a\\\\b\\\\"));
    EXPECT_EQ(folder.Tree(), (Names{"a/", "a/b/"}));
}

TEST(CreateDirectoryPath, APathThatIsNotAbsoluteIsAnInvalidArgument) {
    EXPECT_THROW(CreateDirectoryPath(u"a\\b\\"), exception::InvalidArgument);
    EXPECT_THROW(CreateDirectoryPath(u""), exception::InvalidArgument);
    EXPECT_THROW(CreateDirectoryPath(static_cast<const char16_t*>(nullptr)), exception::InvalidArgument);
    EXPECT_THROW(CreateDirectoryPath(u"C:"), exception::InvalidArgument);
    EXPECT_THROW(CreateDirectoryPath(u"\\a\\"), exception::InvalidArgument);
}

TEST(CreateDirectoryPath, ANetworkPathNeedsABackslashBehindItsServer) {
    EXPECT_THROW(CreateDirectoryPath(u"\\\\"), exception::InvalidArgument);
    EXPECT_THROW(CreateDirectoryPath(u"\\\\server"), exception::InvalidArgument);
    // No folder is asked for.
    EXPECT_NO_THROW(CreateDirectoryPath(u"\\\\server\\"));
    EXPECT_NO_THROW(CreateDirectoryPath(u"\\\\server\\share"));
}

TEST(CreateDirectoryPath, TheServerOfANetworkPathIsNoLevel) {
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    try {
        CreateDirectoryPath(u"\\\\server.\\share\\a\\");
        FAIL();
    } catch (const exception::AccessDenied& failure) {
        EXPECT_STREQ(failure.what(), "Access denied: \\\\server.\\share");
    }
}

TEST(CreateDirectoryPath, ANameThatEndsInADotIsAnInvalidArgument) {
    const TemporaryFolder folder;
    for (const char16_t* path : {u"x.\\", u".\\", u"..\\", u"x..\\", u"x.\\y\\"}) {
        EXPECT_THROW(CreateDirectoryPath(folder.System(path)), exception::InvalidArgument);
    }
    EXPECT_EQ(folder.Tree(), Names{});
    EXPECT_NO_THROW(CreateDirectoryPath(folder.System(u"a.b\\.c\\d.")));
    EXPECT_EQ(folder.Tree(), (Names{"a.b/", "a.b/.c/"}));
}

TEST(CreateDirectoryPath, FoldersAboveANameThatEndsInADotAreMade) {
    const TemporaryFolder folder;
    EXPECT_THROW(CreateDirectoryPath(folder.System(u"a\\b\\c.\\d\\")), exception::InvalidArgument);
    EXPECT_EQ(folder.Tree(), (Names{"a/", "a/b/"}));
}

TEST(CreateDirectoryPath, AFileInTheWayIsReported) {
    const TemporaryFolder folder;
    folder.WriteFile("a", "");
    EXPECT_THROW(CreateDirectoryPath(folder.System(u"a\\")), exception::ObjectAlreadyExists);
    EXPECT_THROW(CreateDirectoryPath(folder.System(u"a\\b\\")), exception::ObjectAlreadyExists);
}

TEST(CreateDirectoryPath, ADriveThatIsNotThereIsAccessDenied) {
    EXPECT_THROW(CreateDirectoryPath(u"D:\\"), exception::AccessDenied);
    EXPECT_THROW(CreateDirectoryPath(u"D:\\a\\"), exception::AccessDenied);
}

TEST(CreateDirectoryPath, AFailureOnTheWayLeavesWhatWasMade) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.Fail(FileCall::MakeFolder, 2, EACCES);
    try {
        CreateDirectoryPath(folder.System(u"a\\b\\c\\"));
        FAIL();
    } catch (const exception::AccessDenied& failure) {
        EXPECT_EQ(std::string(failure.what()), "Access denied: " + ExactText(folder.System(u"a\\b")));
    }
    EXPECT_EQ(folder.Tree(), (Names{"a/"}));
}

TEST(CreateDirectoryPath, CreatesFoldersManyLevelsDeep) {
    const TemporaryFolder folder;
    String path = folder.System();
    for (int i = 0; i < 300; ++i) {
        path.Append(u"\\d");
    }
    CreateDirectoryPath(path + u"\\");
    EXPECT_TRUE(IsDirectory(path));
}

}  // namespace

}  // namespace qn::dsc::osdep
