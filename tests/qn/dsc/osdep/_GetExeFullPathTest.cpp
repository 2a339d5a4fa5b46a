#include "qn/dsc/osdep/_GetExeFullPath.h"

#include <cerrno>

#include <gtest/gtest.h>

#include "qn/dsc/osdep/OSException.h"
#include "qn/dsc/osdep/path.h"
#include "support/ExactText.h"
#include "support/FaultyFileSystem.h"

namespace qn::dsc::osdep {

namespace {

// The base name of an executable at `path`.
std::string BaseNameOf(const char16_t* path) {
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.SetExecutablePath(path);
    return ExactText(GetExecutableBaseName());
}

std::string FolderOf(const char16_t* path) {
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.SetExecutablePath(path);
    files.SetWorkingFolder(u"C:\\work");
    return ExactText(GetExecutableDir());
}

TEST(GetExeFullPath, NamesTheFileOfThisProcess) {
    EXPECT_TRUE(IsAbsolutePath(_GetExeFullPath()));
    EXPECT_TRUE(IsExistingFile(_GetExeFullPath()));
}

TEST(GetExeFullPath, IsMadeAbsolute) {
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.SetExecutablePath(u"bin\\tool");
    files.SetWorkingFolder(u"C:\\work");
    EXPECT_EQ(ExactText(_GetExeFullPath()), "C:\\work\\bin\\tool");
}

TEST(GetExeFullPath, WithoutANameTheSystemsErrorIsThrown) {
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailFromThenOn(FileCall::ReadExecutablePath, 1, ENOENT);
    try {
        _GetExeFullPath();
        FAIL();
    } catch (const WinError& failure) {
        EXPECT_EQ(failure.GetSystemError(), 2u);
        EXPECT_EQ(failure.GetErrorCode(), 7);
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/osdep/_GetExeFullPath");
        EXPECT_GT(failure.GetLine(), 0);
    }
    EXPECT_THROW(GetExecutableDir(), WinError);
    EXPECT_THROW(GetExecutableBaseName(), WinError);
}

TEST(GetExecutableDir, EndsInABackslash) {
    EXPECT_EQ(FolderOf(u"C:\\opt\\host\\tool"), "C:\\opt\\host\\");
    EXPECT_TRUE(IsDirectory(GetExecutableDir()));
}

TEST(GetExecutableDir, OfAnExecutableInTheRootIsTheRoot) {
    EXPECT_EQ(FolderOf(u"C:\\tool"), "C:\\");
}

TEST(GetExecutableDir, IsAbsolute) {
    EXPECT_EQ(FolderOf(u"bin\\tool"), "C:\\work\\bin\\");
    EXPECT_EQ(FolderOf(u"tool"), "C:\\work\\");
}

TEST(GetExecutableBaseName, IsCutBeforeTheLastDot) {
    EXPECT_EQ(BaseNameOf(u"C:\\opt\\tool.exe"), "tool");
    EXPECT_EQ(BaseNameOf(u"C:\\opt\\tool.old.exe"), "tool.old");
    EXPECT_EQ(BaseNameOf(u"C:\\opt\\.exe"), "");
    EXPECT_EQ(BaseNameOf(u"C:\\opt\\tool."), "tool");
}

TEST(GetExecutableBaseName, WithoutADotIsTheWholeName) {
    EXPECT_EQ(BaseNameOf(u"C:\\opt.d\\tool"), "tool");
    EXPECT_EQ(BaseNameOf(u"C:\\zkfpga_make_resource_cache"), "zkfpga_make_resource_cache");
}

}  // namespace

}  // namespace qn::dsc::osdep
