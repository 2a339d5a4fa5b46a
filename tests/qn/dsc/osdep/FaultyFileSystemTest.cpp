#include "support/FaultyFileSystem.h"

#include <cerrno>

#include <gtest/gtest.h>

#include "support/TemporaryFolder.h"

// The tests' own file system has to do what it says.

namespace qn::dsc::osdep {

namespace {

int Ask(FileSystem& files, const String& path) {
    FileAttributes attributes;
    return files.ReadAttributes(path, attributes);
}

TEST(FaultyFileSystem, HandsOnWhatIsNotToFail) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    EXPECT_EQ(Ask(files, folder.System()), 0);
    EXPECT_EQ(Ask(files, folder.System(u"nope")), ENOENT);
}

TEST(FaultyFileSystem, FailsTheNthCallOnce) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    Ask(files, folder.System());
    files.Fail(FileCall::ReadAttributes, 2, EIO);
    EXPECT_EQ(Ask(files, folder.System()), 0);
    EXPECT_EQ(Ask(files, folder.System()), EIO);
    EXPECT_EQ(Ask(files, folder.System()), 0);
}

TEST(FaultyFileSystem, FailsFromACallOn) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    files.FailFromThenOn(FileCall::Any, 2, EIO);
    EXPECT_EQ(Ask(files, folder.System()), 0);
    EXPECT_EQ(Ask(files, folder.System()), EIO);
    EXPECT_EQ(Ask(files, folder.System()), EIO);
    files.Clear();
    EXPECT_EQ(Ask(files, folder.System()), 0);
}

TEST(FaultyFileSystem, FailsOnAPathInAnyCase) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "");
    FaultyFileSystem files;
    files.FailOnPath(FileCall::ReadAttributes, folder.System(u"FILE"), EACCES);
    EXPECT_EQ(Ask(files, folder.System()), 0);
    EXPECT_EQ(Ask(files, folder.System(u"file")), EACCES);
    FileIdentity identity;
    EXPECT_EQ(files.ReadIdentity(folder.System(u"file"), identity), 0);
}

TEST(FaultyFileSystem, CountsTheCallsOfEachKind) {
    const TemporaryFolder folder;
    FaultyFileSystem files;
    FileIdentity identity;
    Ask(files, folder.System());
    files.Fail(FileCall::Any, 1, EIO);
    Ask(files, folder.System());
    files.ReadIdentity(folder.System(), identity);
    EXPECT_EQ(files.Count(FileCall::ReadAttributes), 2u);
    EXPECT_EQ(files.Count(FileCall::ReadIdentity), 1u);
    EXPECT_EQ(files.Count(FileCall::Any), 3u);
    EXPECT_EQ(files.Count(FileCall::MakeFolder), 0u);
}

TEST(FaultyFileSystem, CountsWhatIsOpen) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "abc");
    FaultyFileSystem files;
    FileHandle file = noFile;
    ASSERT_EQ(files.OpenBinary(folder.System(u"file"), BinaryMode::Read, file), 0);
    EXPECT_EQ(files.OpenFiles(), 1);
    files.Fail(FileCall::CloseFile, 1, EIO);
    EXPECT_EQ(files.CloseFile(file), EIO);
    EXPECT_EQ(files.OpenFiles(), 0);
}

TEST(FaultyFileSystem, IsInPlaceForAScope) {
    FaultyFileSystem files;
    {
        const FileSystemScope scope(files);
        EXPECT_EQ(&GetFileSystem(), &files);
    }
    EXPECT_EQ(&GetFileSystem(), &GetNativeFileSystem());
}

}  // namespace

}  // namespace qn::dsc::osdep
