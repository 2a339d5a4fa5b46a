// Paths as Windows takes them, and what it would make of names if it were asked in the ordinary way.

#include "qn/dsc/osdep/FileSystem.h"

#include <cerrno>

#include <gtest/gtest.h>

#include "qn/dsc/osdep/FileFinder.h"
#include "qn/dsc/osdep/path.h"
#include "support/TemporaryFolder.h"

namespace qn::dsc::osdep {
namespace {

int AttributesError(const String& path) {
    FileAttributes attributes;
    return GetFileSystem().ReadAttributes(path, attributes);
}

TEST(FileSystemOfWindows, FullStopsAndBlanksAtTheEndOfANameStay) {
    const TemporaryFolder folder;
    folder.WriteFile("end./file ", "x");
    EXPECT_TRUE(IsDirectory(folder.System(u"end.")));
    EXPECT_TRUE(IsExistingFile(folder.System(u"end.\\file ")));
    EXPECT_FALSE(IsDirectory(folder.System(u"end")));
    EXPECT_FALSE(IsExistingFile(folder.System(u"end.\\file")));
}

TEST(FileSystemOfWindows, NamesOfDevicesAreNamesOfFiles) {
    const TemporaryFolder folder;
    folder.WriteFile("aux.xml", "x");
    EXPECT_TRUE(IsExistingFile(folder.System(u"aux.xml")));
    EXPECT_FALSE(IsExistingFile(folder.System(u"nul")));
}

TEST(FileSystemOfWindows, DevicesNameNothing) {
    EXPECT_EQ(AttributesError(u"\\\\.\\pipe"), ENOENT);
    EXPECT_EQ(AttributesError(u"\\\\?\\C:\\"), ENOENT);
    EXPECT_EQ(AttributesError(u"\\\\server"), ENOENT);
}

TEST(FileSystemOfWindows, DotsAreFoldedAsText) {
    const TemporaryFolder folder;
    folder.MakeFolder("a");
    EXPECT_TRUE(IsDirectory(folder.System(u"missing\\..\\.\\a")));
    EXPECT_TRUE(IsDirectory(folder.System(u"a/../a//")));
    EXPECT_TRUE(IsDirectory(u"C:\\..\\.."));
}

TEST(FileSystemOfWindows, AFileWithASeparatorBehindItNamesNothing) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "x");
    EXPECT_NE(AttributesError(folder.System(u"file\\")), 0);
    EXPECT_EQ(AttributesError(folder.System(u"file")), 0);
    FileIdentity identity;
    EXPECT_EQ(GetFileSystem().ReadIdentity(folder.System(u"file\\"), identity), ENOTDIR);
    EXPECT_EQ(GetFileSystem().ReadIdentity(folder.System(u"file"), identity), 0);
}

TEST(FileSystemOfWindows, AFolderHasOneIdentityWithASeparatorAndWithout) {
    const TemporaryFolder folder;
    folder.MakeFolder("a/b");
    FileIdentity plain;
    FileIdentity separated;
    FileIdentity other;
    ASSERT_EQ(GetFileSystem().ReadIdentity(folder.System(u"a"), plain), 0);
    ASSERT_EQ(GetFileSystem().ReadIdentity(folder.System(u"A\\"), separated), 0);
    ASSERT_EQ(GetFileSystem().ReadIdentity(folder.System(u"a\\b"), other), 0);
    EXPECT_TRUE(plain == separated);
    EXPECT_FALSE(plain == other);
}

TEST(FileSystemOfWindows, RelativePathsBeginAtTheWorkingFolder) {
    const TemporaryFolder folder;
    folder.MakeFolder("a/b");
    const WorkingFolderScope scope(folder.Native("a"));
    EXPECT_EQ(AttributesError(u"b"), 0);
    EXPECT_EQ(AttributesError(u"..\\a\\b"), 0);
    EXPECT_EQ(AttributesError(u"C:b"), 0);
    EXPECT_EQ(AttributesError(u"c"), ENOENT);
}

TEST(FileSystemOfWindows, PathsMayBeLongerThan260Units) {
    const TemporaryFolder folder;
    folder.MakeNestedFolders("a name of some length", 40);
    String path = folder.System();
    for (int i = 0; i < 40; ++i) {
        path.Append(u"\\a name of some length");
    }
    EXPECT_TRUE(IsDirectory(path));
    CreateOneDirectory(path + u"\\below");
    EXPECT_EQ(FileFinder().ListFiles(path + u"\\B*").size(), 1u);
}

TEST(FileSystemOfWindows, NamesMatchByTheirFullFormAlone) {
    const TemporaryFolder folder;
    folder.WriteFile("a.xmlx", "");
    folder.WriteFile("b.xml", "");
    const std::vector<String> found = FileFinder().ListFiles(folder.System(u"*.xml"));
    ASSERT_EQ(found.size(), 1u);
    EXPECT_EQ(GetFileName(found[0]).View(), u"b.xml");
}

}  // namespace
}  // namespace qn::dsc::osdep
