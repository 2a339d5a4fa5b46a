#include "qn/dsc/osdep/path.h"

#include <string>

#include <gtest/gtest.h>

#include "qn/dsc/exception/Exception.h"
#include "support/ExactText.h"
#include "support/FaultyFileSystem.h"

// The operations that are pure text. Those that touch the disk stand in path_diskTest.cpp.

namespace qn::dsc::osdep {

namespace {

TEST(IsAbsolutePath, DriveWithBackslashIs) {
    EXPECT_TRUE(IsAbsolutePath(u"C:\\"));
    EXPECT_TRUE(IsAbsolutePath(u"c:\\a"));
    EXPECT_TRUE(IsAbsolutePath(u"Z:\\a\\b"));
    EXPECT_TRUE(IsAbsolutePath(u"AB:\\"));
    EXPECT_TRUE(IsAbsolutePath(u"ab:\\x"));
}

TEST(IsAbsolutePath, NetworkPathIs) {
    EXPECT_TRUE(IsAbsolutePath(u"\\\\"));
    EXPECT_TRUE(IsAbsolutePath(u"\\\\server\\share"));
}

TEST(IsAbsolutePath, NothingElseIs) {
    const char16_t* paths[] = {u"",     u"\\",  u"\\a",   u"C:",    u"C",    u"AB:",    u"ABC:\\",
                               u"1:\\", u":\\", u"C:a",   u"a\\b",  u"a",    u"A1:\\",  u"C:/a",
                               u"//a",  u"/a",  u" C:\\", u"..\\a", u"C\\:", u"\\C:\\", u"A:B:\\"};
    for (const char16_t* path : paths) {
        EXPECT_FALSE(IsAbsolutePath(path)) << ExactText(String(path));
    }
}

TEST(IsAbsolutePath, OnlyAsciiLettersNameADrive) {
    EXPECT_FALSE(IsAbsolutePath(u"\x00E9:\\"));
    EXPECT_FALSE(IsAbsolutePath(u"C\x00E9:\\"));
    EXPECT_FALSE(IsAbsolutePath(u"@:\\"));
    EXPECT_FALSE(IsAbsolutePath(u"[:\\"));
    EXPECT_FALSE(IsAbsolutePath(u"`:\\"));
    EXPECT_FALSE(IsAbsolutePath(u"{:\\"));
}

TEST(JoinPath, PutsOneBackslashBetween) {
    EXPECT_EQ(ExactText(JoinPath(u"a", u"b")), "a\\b");
    EXPECT_EQ(ExactText(JoinPath(u"C:\\a", u"b\\c")), "C:\\a\\b\\c");
}

TEST(JoinPath, KeepsTheBackslashOfTheBase) {
    EXPECT_EQ(ExactText(JoinPath(u"C:\\", u"b")), "C:\\b");
    EXPECT_EQ(ExactText(JoinPath(u"a\\\\", u"b")), "a\\\\b");
}

TEST(JoinPath, EmptyBaseGivesThePart) {
    EXPECT_EQ(ExactText(JoinPath(u"", u"x")), "x");
    EXPECT_EQ(ExactText(JoinPath(u"", u"")), "");
}

TEST(JoinPath, EmptyPartGivesTheBaseWithABackslash) {
    EXPECT_EQ(ExactText(JoinPath(u"a", u"")), "a\\");
    EXPECT_EQ(ExactText(JoinPath(u"a\\", u"")), "a\\");
}

TEST(JoinPath, AbsoluteSecondPartWins) {
    EXPECT_EQ(ExactText(JoinPath(u"a", u"C:\\b")), "C:\\b");
    EXPECT_EQ(ExactText(JoinPath(u"C:\\a\\", u"\\\\server\\b")), "\\\\server\\b");
    EXPECT_EQ(ExactText(JoinPath(u"a", u"AB:\\b")), "AB:\\b");
}

TEST(JoinPath, ASingleLeadingBackslashDoesNotMakeThePartAbsolute) {
    EXPECT_EQ(ExactText(JoinPath(u"a", u"\\b")), "a\\\\b");
    EXPECT_EQ(ExactText(JoinPath(u"a\\", u"\\b")), "a\\\\b");
    EXPECT_EQ(ExactText(JoinPath(u"a", u"C:b")), "a\\C:b");
}

TEST(AppendPathPart, GivesWhatJoinPathGives) {
    struct Row {
        const char16_t* base;
        const char16_t* part;
        const char* joined;
    };
    constexpr Row rows[] = {{u"a", u"b", "a\\b"},     {u"C:\\a", u"b\\c", "C:\\a\\b\\c"},
                            {u"C:\\", u"b", "C:\\b"}, {u"", u"x", "x"},
                            {u"", u"", ""},           {u"a", u"", "a\\"},
                            {u"a\\", u"", "a\\"},     {u"a", u"C:\\b", "C:\\b"},
                            {u"a", u"\\b", "a\\\\b"}, {u"C:\\a\\", u"\\\\s\\b", "\\\\s\\b"},
                            {u"a", u"C:b", "a\\C:b"}, {u"a/", u"b", "a/\\b"}};
    for (const Row& row : rows) {
        String path(row.base);
        AppendPathPart(path, row.part);
        EXPECT_EQ(ExactText(path), row.joined);
        EXPECT_EQ(ExactText(JoinPath(row.base, row.part)), row.joined);
    }
}

TEST(AppendPathPart, ManyPartsTakeTimeInProportionToTheirText) {
    String path;
    std::string expected;
    for (int i = 0; i < 1000000; ++i) {
        AppendPathPart(path, u"ab");
        expected += i == 0 ? "ab" : "\\ab";
    }
    EXPECT_TRUE(ExactText(path) == expected);
}

TEST(JoinPath, ASlashIsNoSeparator) {
    EXPECT_EQ(ExactText(JoinPath(u"a/", u"b")), "a/\\b");
}

TEST(JoinPath, KeepsEveryUnit) {
    const String base(u"a\0b", 3);
    EXPECT_EQ(ExactText(JoinPath(base, u"\x00E9\xD800")), "a{0000}b\\{00E9}{D800}");
}

TEST(GetFileName, IsWhatStandsBehindTheLastBackslash) {
    EXPECT_EQ(ExactText(GetFileName(u"C:\\a\\b.xml")), "b.xml");
    EXPECT_EQ(ExactText(GetFileName(u"a")), "a");
    EXPECT_EQ(ExactText(GetFileName(u"\\\\server")), "server");
    EXPECT_EQ(ExactText(GetFileName(u"a/b")), "a/b");
}

TEST(GetFileName, IsEmptyForAPathThatEndsInABackslash) {
    EXPECT_EQ(ExactText(GetFileName(u"C:\\a\\")), "");
    EXPECT_EQ(ExactText(GetFileName(u"C:\\")), "");
    EXPECT_EQ(ExactText(GetFileName(u"\\")), "");
    EXPECT_EQ(ExactText(GetFileName(u"")), "");
}

TEST(GetFileName, IsEmptyForABareDrive) {
    EXPECT_EQ(ExactText(GetFileName(u"C:")), "");
    EXPECT_EQ(ExactText(GetFileName(u"AB:")), "");
}

TEST(GetFileName, WhatOnlyLooksLikeADriveIsAName) {
    EXPECT_EQ(ExactText(GetFileName(u"C:a")), "C:a");
    EXPECT_EQ(ExactText(GetFileName(u"ABC:")), "ABC:");
    EXPECT_EQ(ExactText(GetFileName(u"1:")), "1:");
    EXPECT_EQ(ExactText(GetFileName(u":")), ":");
    EXPECT_EQ(ExactText(GetFileName(u"a\\C:")), "C:");
}

TEST(GetDirectoryName, DropsTheLastPartAndItsBackslash) {
    EXPECT_EQ(ExactText(GetDirectoryName(u"C:\\a\\b")), "C:\\a");
    EXPECT_EQ(ExactText(GetDirectoryName(u"a\\b")), "a");
    EXPECT_EQ(ExactText(GetDirectoryName(u"\\a\\b")), "\\a");
    EXPECT_EQ(ExactText(GetDirectoryName(u"AB:\\a\\b")), "AB:\\a");
}

TEST(GetDirectoryName, KeepsTheRootOfAFirstLevelPath) {
    EXPECT_EQ(ExactText(GetDirectoryName(u"C:\\a")), "C:\\");
    EXPECT_EQ(ExactText(GetDirectoryName(u"\\a")), "\\");
    EXPECT_EQ(ExactText(GetDirectoryName(u"C:\\\\a")), "C:\\\\");
    EXPECT_EQ(ExactText(GetDirectoryName(u"C:a")), "C:");
}

TEST(GetDirectoryName, ABackslashAtTheEndSeparatesAnEmptyPart) {
    EXPECT_EQ(ExactText(GetDirectoryName(u"C:\\a\\b\\")), "C:\\a\\b");
    EXPECT_EQ(ExactText(GetDirectoryName(u"C:\\a\\")), "C:\\a");
    EXPECT_EQ(ExactText(GetDirectoryName(u"a\\")), "a");
}

TEST(GetDirectoryName, DropsAllBackslashesBeforeTheLastPart) {
    EXPECT_EQ(ExactText(GetDirectoryName(u"C:\\a\\\\\\b")), "C:\\a");
    EXPECT_EQ(ExactText(GetDirectoryName(u"C:\\a\\b\\\\")), "C:\\a\\b");
    EXPECT_EQ(ExactText(GetDirectoryName(u"C:\\a\\\\b\\c")), "C:\\a\\\\b");
}

TEST(GetDirectoryName, RootsAndBareDrivesAreTheirOwn) {
    for (const char16_t* path : {u"", u"C:", u"AB:", u"C:\\", u"C:\\\\", u"\\", u"\\\\", u"\\\\\\"}) {
        EXPECT_EQ(ExactText(GetDirectoryName(path)), ExactText(String(path)));
    }
}

TEST(GetDirectoryName, ASingleNameHasNone) {
    EXPECT_EQ(ExactText(GetDirectoryName(u"a")), "");
    EXPECT_EQ(ExactText(GetDirectoryName(u"a/b")), "");
    EXPECT_EQ(ExactText(GetDirectoryName(u"ABC:")), "");
}

TEST(GetDirectoryName, ANetworkPathKeepsItsTwoBackslashes) {
    EXPECT_EQ(ExactText(GetDirectoryName(u"\\\\server")), "\\\\");
    EXPECT_EQ(ExactText(GetDirectoryName(u"\\\\server\\")), "\\\\server");
    EXPECT_EQ(ExactText(GetDirectoryName(u"\\\\server\\share")), "\\\\server");
}

TEST(GetDirectoryName, RepeatedStepsEndAtTheRoot) {
    String path = u"C:\\a\\b\\";
    std::string steps;
    for (int i = 0; i < 5; ++i) {
        path = GetDirectoryName(path);
        steps += ExactText(path) + ";";
    }
    EXPECT_EQ(steps, "C:\\a\\b;C:\\a;C:\\;C:\\;C:\\;");
}

TEST(AppendSeparator, AppendsABackslashUnlessOneIsThere) {
    String path = u"a";
    AppendSeparator(path);
    EXPECT_EQ(ExactText(path), "a\\");
    AppendSeparator(path);
    EXPECT_EQ(ExactText(path), "a\\");
}

TEST(AppendSeparator, ASlashAtTheEndIsNoSeparator) {
    String path = u"a/";
    AppendSeparator(path);
    EXPECT_EQ(ExactText(path), "a/\\");
}

TEST(AppendSeparator, AnEmptyPathIsAnInvalidArgument) {
    String path;
    EXPECT_THROW(AppendSeparator(path), exception::InvalidArgument);
    EXPECT_EQ(ExactText(path), "");
}

TEST(AppendSeparator, TheThrowTellsItsPlace) {
    String path;
    try {
        AppendSeparator(path);
        FAIL();
    } catch (const exception::InvalidArgument& failure) {
        EXPECT_STREQ(failure.GetFile(), "qn/dsc/osdep/path");
        EXPECT_GT(failure.GetLine(), 0);
    }
}

struct FoldedPath {
    const char16_t* path;
    const char* folded;
};

void ExpectFolded(std::initializer_list<FoldedPath> rows) {
    for (const FoldedPath& row : rows) {
        EXPECT_EQ(ExactText(NormalizePath(row.path)), row.folded) << ExactText(String(row.path));
    }
}

TEST(NormalizePath, FoldsTwoDotsWithTheFolderBefore) {
    ExpectFolded({{u"C:\\a\\b\\..\\c", "C:\\a\\c"},
                  {u"C:\\a\\..\\", "C:\\"},
                  {u"C:\\a\\..", "C:\\"},
                  {u"C:\\a\\b\\c\\..\\..\\d", "C:\\a\\d"},
                  {u"C:\\a\\b\\..\\..\\c\\", "C:\\c\\"},
                  {u"C:\\a\\b\\..\\c\\..\\d", "C:\\a\\d"}});
}

TEST(NormalizePath, DropsSingleDots) {
    ExpectFolded({{u"C:\\.", "C:\\"},
                  {u"C:\\.\\", "C:\\"},
                  {u"C:\\a\\.\\b", "C:\\a\\b"},
                  {u"C:\\a\\.", "C:\\a"},
                  {u"C:\\a\\.\\", "C:\\a\\"},
                  {u"C:\\a\\.\\..\\b", "C:\\b"}});
}

TEST(NormalizePath, ThreeDotsGiveNothing) {
    ExpectFolded({{u"C:\\a\\...\\b", ""}, {u"C:\\...", ""}, {u"C:\\a\\...\\..", ""}});
}

TEST(NormalizePath, FourDotsAreAName) {
    ExpectFolded({{u"C:\\....\\a", "C:\\....\\a"}, {u"C:\\....\\..\\a", "C:\\a"}});
}

TEST(NormalizePath, ClimbingPastTheDriveGivesNothing) {
    ExpectFolded({{u"C:\\..\\a", ""}, {u"C:\\..", ""}, {u"C:\\a\\..\\..\\b", ""}, {u"AB:\\..\\", ""}});
}

TEST(NormalizePath, WhatIsNotAbsoluteGivesNothing) {
    ExpectFolded({{u"a\\..\\b", ""}, {u"", ""}, {u"a", ""}, {u"\\a\\.\\b", ""}, {u"C:", ""}, {u"C:a.b", ""}});
}

TEST(NormalizePath, APathWithoutDotsStaysAsItIs) {
    ExpectFolded({{u"C:\\a\\b", "C:\\a\\b"},
                  {u"C:\\a\\b\\", "C:\\a\\b\\"},
                  {u"C:\\\\a\\\\b\\\\", "C:\\\\a\\\\b\\\\"},
                  {u"\\\\server\\share", "\\\\server\\share"},
                  {u"C:\\a/b", "C:\\a/b"}});
}

TEST(NormalizePath, DotsInNamesAreNotFolded) {
    ExpectFolded({{u"C:\\a.b\\c.d", "C:\\a.b\\c.d"},
                  {u"C:\\.a\\b.\\..c", "C:\\.a\\b.\\..c"},
                  {u"C:\\a.b\\c.d\\", "C:\\a.b\\c.d\\"},
                  {u"C:\\a\\..\\x_resource.xml", "C:\\x_resource.xml"}});
}

TEST(NormalizePath, DoubledSeparatorsAreEmptyPieces) {
    ExpectFolded({{u"C:\\a.b\\\\c", "C:\\a.b\\\\c"},
                  // The empty piece is what ".." takes away.
                  {u"C:\\a\\\\..\\b", "C:\\a\\b"},
                  {u"C:\\a\\\\..\\..\\b", "C:\\b"},
                  // Both backslashes at the end go with the last step.
                  {u"C:\\a.b\\\\", "C:\\a.b\\\\"}});
}

TEST(NormalizePath, ANetworkPathFoldsLikeADrive) {
    ExpectFolded({{u"\\\\server\\share\\..\\x", "\\\\server\\x"},
                  {u"\\\\server\\share\\.\\x\\", "\\\\server\\share\\x\\"},
                  {u"\\\\server\\..", "\\\\"},
                  {u"\\\\server\\..\\a", "\\\\a"},
                  {u"\\\\server\\..\\..\\a", ""}});
}

TEST(NormalizePath, IsLinearInThePath) {
    String path = u"C:";
    for (int i = 0; i < 100000; ++i) {
        path.Append(u"\\a.b\\..");
    }
    EXPECT_EQ(ExactText(NormalizePath(path)), "C:\\");
}

TEST(MakeAbsolutePath, PutsTheWorkingFolderBefore) {
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.SetWorkingFolder(u"C:\\work");
    EXPECT_EQ(ExactText(MakeAbsolutePath(u"a\\b")), "C:\\work\\a\\b");
    EXPECT_EQ(ExactText(MakeAbsolutePath(u"..")), "C:\\work\\..");
    EXPECT_EQ(ExactText(MakeAbsolutePath(u"\\a")), "C:\\work\\\\a");
}

TEST(MakeAbsolutePath, AnEmptyPathIsTheWorkingFolder) {
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.SetWorkingFolder(u"C:\\work");
    EXPECT_EQ(ExactText(MakeAbsolutePath(u"")), "C:\\work");
}

TEST(MakeAbsolutePath, AnAbsolutePathStays) {
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.SetWorkingFolder(u"C:\\work");
    EXPECT_EQ(ExactText(MakeAbsolutePath(u"D:\\a\\..")), "D:\\a\\..");
    EXPECT_EQ(ExactText(MakeAbsolutePath(u"\\\\server")), "\\\\server");
}

TEST(MakeAbsolutePath, WithoutAWorkingFolderThePathStays) {
    FaultyFileSystem files;
    const FileSystemScope scope(files);
    files.FailFromThenOn(FileCall::ReadWorkingFolder, 1, ENOENT);
    EXPECT_EQ(ExactText(GetCurrentDirectoryPath()), "");
    EXPECT_EQ(ExactText(MakeAbsolutePath(u"a")), "a");
}

}  // namespace

}  // namespace qn::dsc::osdep
