#include <algorithm>
#include <cerrno>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "qn/dsc/osdep/BinaryFile.h"
#include "qn/dsc/osdep/FileFinder.h"
#include "qn/dsc/osdep/FileSystem.h"
#include "qn/dsc/osdep/OSException.h"
#include "qn/dsc/osdep/path.h"
#include "support/ExactText.h"
#include "support/SmallStack.h"
#include "support/TemporaryFolder.h"

// Paths of the system's form on a disk whose names are bytes and know letter case.

namespace qn::dsc::osdep {

namespace {

using Names = std::vector<std::string>;

std::string ContentOf(const String& path) {
    BinaryFile file(path, BinaryMode::Read);
    char block[100];
    const int32_t got = file.Read(block, sizeof block);
    return std::string(block, static_cast<size_t>(got < 0 ? 0 : got));
}

void WriteThrough(const String& path, const char* text) {
    BinaryFile file(path, BinaryMode::Create | BinaryMode::Truncate | BinaryMode::Write);
    EXPECT_EQ(file.Write(text, 1), 1);
}

TEST(LinuxPaths, ANameMatchesInAnyLetterCase) {
    const TemporaryFolder folder;
    folder.WriteFile("Targets/QN/Board_Resource.xml", "x");
    EXPECT_TRUE(IsExistingFile(folder.System(u"Targets\\QN\\Board_Resource.xml")));
    EXPECT_TRUE(IsExistingFile(folder.System(u"TARGETS\\qn\\board_resource.XML")));
    EXPECT_TRUE(IsDirectory(folder.System(u"targets\\Qn\\")));
    EXPECT_EQ(ContentOf(folder.System(u"tARGETS\\qN\\bOARD_rESOURCE.xml")), "x");
    EXPECT_FALSE(IsExistingFile(folder.System(u"Targets\\QN\\Board_Resource.xm")));
    EXPECT_FALSE(IsExistingFile(folder.System(u"Target\\QN\\Board_Resource.xml")));
}

TEST(LinuxPaths, ANameBelowTheRootMatchesInAnyLetterCase) {
    EXPECT_TRUE(IsDirectory(u"C:\\TMP"));
    EXPECT_TRUE(IsDirectory(u"C:\\uSR\\BIN"));
    EXPECT_FALSE(IsDirectory(u"C:\\No such folder"));
}

// A path of more than 4,095 bytes is opened in steps. What is left behind a step that fails must not be looked for in
// the working folder.
TEST(LinuxPaths, TheRestOfALongPathIsNotTakenForARelativeOne) {
    const TemporaryFolder folder;
    const std::string name(100, 'x');
    std::string rest = name;
    for (int i = 1; i < 5; ++i) {
        rest += "/" + name;
    }
    folder.WriteFile(rest, "x");
    const WorkingFolderScope scope(folder.Native(""));
    std::u16string path = u"C:";
    for (int i = 0; i < 45; ++i) {
        path += u"\\" + std::u16string(100, u'x');
    }
    EXPECT_FALSE(IsExistingFile(String(std::u16string_view(path))));
    EXPECT_THROW(ContentOf(String(std::u16string_view(path))), PosixError);
}

TEST(LinuxPaths, TheNameAsItStandsWins) {
    const TemporaryFolder folder;
    folder.WriteFile("FILE", "1");
    folder.WriteFile("File", "2");
    folder.WriteFile("file", "3");
    EXPECT_EQ(ContentOf(folder.System(u"FILE")), "1");
    EXPECT_EQ(ContentOf(folder.System(u"File")), "2");
    EXPECT_EQ(ContentOf(folder.System(u"file")), "3");
}

TEST(LinuxPaths, OnAMissTheFirstInListingOrderIsTaken) {
    const TemporaryFolder folder;
    for (const char* name : {"file", "fILE", "File", "fIle"}) {
        folder.WriteFile(name, name);
    }
    EXPECT_EQ(ContentOf(folder.System(u"FILE")), "File");
    EXPECT_EQ(ContentOf(folder.System(u"FiLe")), "File");
    folder.Remove("File");
    EXPECT_EQ(ContentOf(folder.System(u"FILE")), "fILE");
}

TEST(LinuxPaths, EveryComponentIsDecidedForItself) {
    const TemporaryFolder folder;
    folder.WriteFile("sub/file", "lower");
    folder.WriteFile("SUB/other", "upper");
    // The folder that is written exactly so is taken, although the file is in the other one.
    EXPECT_FALSE(IsExistingFile(folder.System(u"SUB\\file")));
    EXPECT_TRUE(IsExistingFile(folder.System(u"sub\\FILE")));
    // Neither is written so: the first in listing order.
    EXPECT_FALSE(IsExistingFile(folder.System(u"Sub\\file")));
    EXPECT_TRUE(IsExistingFile(folder.System(u"Sub\\Other")));
}

TEST(LinuxPaths, OtherAlphabetsHaveLetterCaseToo) {
    const TemporaryFolder folder;
    folder.WriteFile("\xC3\x89t\xC3\xA9_\xD0\x96", "x");
    EXPECT_EQ(ContentOf(folder.System(u"\x00E9T\x00C9_\x0436")), "x");
    EXPECT_FALSE(IsExistingFile(folder.System(u"ete_\x0436")));
}

TEST(LinuxPaths, LettersThatOnlyUnicodeTakesForAsciiOnesDoNot) {
    const TemporaryFolder folder;
    // Dotless i and long s; the Kelvin sign, whose lower case is k.
    folder.WriteFile("\xC4\xB1\xC5\xBF\xE2\x84\xAA", "x");
    EXPECT_FALSE(IsExistingFile(folder.System(u"isk")));
    EXPECT_FALSE(IsExistingFile(folder.System(u"ISK")));
    EXPECT_TRUE(IsExistingFile(folder.System(u"\x0131\x017F\x212A")));
}

TEST(LinuxPaths, ACreatedFileTakesAnExistingNameOfOtherCase) {
    const TemporaryFolder folder;
    folder.WriteFile("Sub/File", "old");
    WriteThrough(folder.System(u"SUB\\FILE"), "n");
    WriteThrough(folder.System(u"sub\\New"), "n");
    EXPECT_EQ(folder.Tree(), (Names{"Sub/", "Sub/File", "Sub/New"}));
    EXPECT_EQ(folder.ReadFile("Sub/File"), "n");
}

TEST(LinuxPaths, ACreatedFolderTakesExistingNamesOfOtherCase) {
    const TemporaryFolder folder;
    folder.MakeFolder("Sub");
    EXPECT_THROW(CreateOneDirectory(folder.System(u"SUB")), std::exception);
    CreateOneDirectory(folder.System(u"SUB\\New"));
    EXPECT_EQ(folder.Tree(), (Names{"Sub/", "Sub/New/"}));
}

TEST(LinuxPaths, TheFirstCreatedNameStaysAsItWasWritten) {
    const TemporaryFolder folder;
    WriteThrough(folder.System(u"MixedCase"), "a");
    WriteThrough(folder.System(u"mixedcase"), "b");
    EXPECT_EQ(folder.Tree(), (Names{"MixedCase"}));
    EXPECT_EQ(folder.ReadFile("MixedCase"), "b");
}

TEST(LinuxPaths, TheDriveIsTheRootInAnyCase) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "x");
    String path = folder.System(u"file");
    EXPECT_TRUE(IsExistingFile(path));
    EXPECT_TRUE(IsExistingFile(u"c" + path.Substring(1)));
    EXPECT_TRUE(IsDirectory(u"c:\\"));
}

TEST(LinuxPaths, OtherDrivesAndNetworkPathsNameNothing) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "x");
    const String below = folder.System(u"file").Substring(2);
    for (const char16_t* drive : {u"D:", u"a:", u"CC:", u"\\\\server", u"\\\\?\\C:", u"\\"}) {
        const String path = drive + below;
        EXPECT_FALSE(IsDirectory(GetDirectoryName(path))) << ExactText(path);
        FileAttributes attributes;
        EXPECT_EQ(GetFileSystem().ReadAttributes(path, attributes), ENOENT) << ExactText(path);
        EXPECT_TRUE(FileFinder().ListFiles(path).empty()) << ExactText(path);
        FileHandle file = noFile;
        EXPECT_EQ(GetFileSystem().OpenBinary(path, BinaryMode::Read, file), ENOENT) << ExactText(path);
        EXPECT_EQ(GetFileSystem().OpenText(path, TextMode::Writing, file), ENOENT) << ExactText(path);
        EXPECT_EQ(file, noFile);
    }
}

TEST(LinuxPaths, DotsAreFoldedBeforeTheDiskIsAsked) {
    const TemporaryFolder folder;
    folder.WriteFile("y", "x");
    folder.MakeFolder("real/sub");
    folder.MakeLink("real/sub", "link");
    EXPECT_TRUE(IsExistingFile(folder.System(u"nope\\..\\y")));
    EXPECT_TRUE(IsExistingFile(folder.System(u"y\\..\\y")));
    // Not the folder above the one that the link leads to.
    EXPECT_TRUE(IsExistingFile(folder.System(u"link\\..\\y")));
    EXPECT_TRUE(IsExistingFile(folder.System(u".\\y")));
    EXPECT_TRUE(IsExistingFile(folder.System(u"y\\.")));
}

TEST(LinuxPaths, ASlashIsASeparator) {
    const TemporaryFolder folder;
    folder.WriteFile("sub/file", "x");
    EXPECT_TRUE(IsExistingFile(folder.System(u"SUB/file")));
    EXPECT_TRUE(IsExistingFile(folder.System(u"nope/../sub\\file")));
    EXPECT_FALSE(IsExistingFile(folder.System(u"sub\\file/")));
}

TEST(LinuxPaths, AFileWithABackslashBehindNamesNothing) {
    const TemporaryFolder folder;
    folder.WriteFile("file", "x");
    FileHandle file = noFile;
    FileIdentity identity;
    EXPECT_FALSE(IsExistingFile(folder.System(u"file\\")));
    EXPECT_FALSE(IsDirectory(folder.System(u"file\\")));
    EXPECT_NE(GetFileSystem().OpenBinary(folder.System(u"file\\"), BinaryMode::Read, file), 0);
    EXPECT_NE(GetFileSystem().OpenText(folder.System(u"file\\"), TextMode::Reading, file), 0);
    EXPECT_NE(GetFileSystem().OpenText(folder.System(u"file\\"), TextMode::Writing, file), 0);
    EXPECT_NE(GetFileSystem().ReadIdentity(folder.System(u"FILE\\"), identity), 0);
    EXPECT_EQ(GetFileModificationTime(folder.System(u"file\\")), TimeStamp());
    EXPECT_EQ(folder.ReadFile("file"), "x");
}

TEST(LinuxPaths, NoFileIsCreatedWithABackslashBehind) {
    const TemporaryFolder folder;
    FileHandle file = noFile;
    EXPECT_NE(GetFileSystem().OpenText(folder.System(u"new\\"), TextMode::Writing, file), 0);
    EXPECT_EQ(folder.Tree(), Names{});
}

TEST(LinuxPaths, EveryNativeNameIsReachedByWhatAListingGives) {
    const TemporaryFolder folder;
    for (unsigned byte = 1; byte < 256; ++byte) {
        if (byte != '/' && byte != '.') {
            const std::string name(1, static_cast<char>(byte));
            folder.WriteFile(name, name);
        }
    }
    FileFinder finder;
    size_t files = 0;
    std::string contents;
    for (const String& path : finder.ListFiles(folder.System(u"*"))) {
        if (IsExistingFile(path)) {
            ++files;
            contents += ContentOf(path);
        }
    }
    EXPECT_EQ(files, 253u);
    std::sort(contents.begin(), contents.end());
    EXPECT_EQ(std::unique(contents.begin(), contents.end()), contents.end());
    EXPECT_EQ(contents.size(), 253u);
}

TEST(LinuxPaths, ANativeBackslashIsNoSeparator) {
    const TemporaryFolder folder;
    folder.WriteFile("a\\b", "name");
    folder.WriteFile("a/b", "path");
    EXPECT_EQ(ContentOf(folder.System(u"a\xF05C"
                                      u"b")),
              "name");
    EXPECT_EQ(ContentOf(folder.System(u"a\\b")), "path");
    EXPECT_EQ(ContentOf(folder.System(u"A\xF05C"
                                      u"B")),
              "name");
}

TEST(LinuxPaths, ANameWithTheUnitForABackslashIsFoundToo) {
    const TemporaryFolder folder;
    folder.WriteFile(
        "a\xEF\x81\x9C"
        "b",
        "x");
    EXPECT_EQ(ContentOf(folder.System(u"a\xF05C"
                                      u"b")),
              "x");
}

TEST(LinuxPaths, WhatIsCreatedWithTheUnitForABackslashHasABackslash) {
    const TemporaryFolder folder;
    WriteThrough(folder.System(u"a\xF05C"
                               u"b"),
                 "x");
    EXPECT_EQ(folder.Tree(), (Names{"a\\b"}));
}

TEST(LinuxPaths, PathsMayBeLongerThan260Units) {
    const TemporaryFolder folder;
    const String deep = folder.System(String(200, u'a').CStr()) + u"\\" + String(200, u'b');
    CreateDirectoryPath(deep + u"\\");
    WriteThrough(deep + u"\\file", "x");
    EXPECT_EQ(ContentOf(deep + u"\\FILE"), "x");
    EXPECT_EQ(FileFinder().ListFiles(deep + u"\\f*").size(), 1u);
}

TEST(LinuxPaths, PathsMayBeLongerThanASystemCallTakes) {
    const TemporaryFolder folder;
    String deep = folder.System();
    for (int i = 0; i < 100; ++i) {
        deep.Append(u"\\");
        deep.Append(200, u'd');
    }
    ASSERT_GT(deep.Length(), 20000u);
    CreateDirectoryPath(deep + u"\\");
    EXPECT_TRUE(IsDirectory(deep));
    WriteThrough(deep + u"\\File", "x");
    EXPECT_EQ(ContentOf(deep + u"\\File"), "x");
    EXPECT_EQ(ContentOf(deep + u"\\FILE"), "x");
    EXPECT_EQ(FileFinder().ListFiles(deep + u"\\*").size(), 3u);
    EXPECT_NE(GetFileModificationTime(deep), TimeStamp());
    EXPECT_FALSE(IsDirectory(deep + u"\\nope\\" + String(5000, u'e')));
}

TEST(LinuxPaths, ANameTooLongForTheDiskNamesNothing) {
    const TemporaryFolder folder;
    const String name(256, u'a');
    EXPECT_FALSE(IsDirectory(folder.System(name.CStr())));
    EXPECT_TRUE(FileFinder().ListFiles(folder.System((name + u"\\*").CStr())).empty());
    const String longer(5000, u'a');
    EXPECT_FALSE(IsDirectory(folder.System(longer.CStr())));
}

TEST(LinuxPaths, APathLongerThan32767UnitsNamesNothing) {
    String path = u"C:\\";
    for (int i = 0; i < 10000; ++i) {
        path.Append(u"..\\.\\");
    }
    EXPECT_FALSE(IsDirectory(path));
}

TEST(LinuxPaths, ACaseSearchWalksDeepPathsWithoutRecursion) {
    const TemporaryFolder folder;
    folder.MakeNestedFolders("d", 2200);
    String path = folder.System();
    for (int i = 0; i < 2200; ++i) {
        path.Append(i % 100 == 0 ? u"\\D" : u"\\d");
    }
    RunOnSmallStack([&path] { EXPECT_TRUE(IsDirectory(path)); });
}

TEST(LinuxPaths, ADanglingLinkStandsAsItIsWritten) {
    const TemporaryFolder folder;
    folder.MakeLink("nowhere", "link");
    folder.WriteFile("LINK", "x");
    EXPECT_FALSE(IsExistingFile(folder.System(u"link")));
    EXPECT_TRUE(IsExistingFile(folder.System(u"Link")));
}

TEST(LinuxPaths, ALinkRoundInACircleNamesNothing) {
    const TemporaryFolder folder;
    folder.MakeLink("b", "a");
    folder.MakeLink("a", "b");
    EXPECT_FALSE(IsDirectory(folder.System(u"a")));
    EXPECT_FALSE(IsExistingFile(folder.System(u"A")));
}

TEST(LinuxPaths, IdentityIsThatOfWhatAPathLeadsTo) {
    const TemporaryFolder folder;
    folder.MakeFolder("a/sub");
    folder.MakeFolder("b");
    folder.MakeLink("a", "link");
    FileSystem& files = GetFileSystem();
    FileIdentity direct;
    FileIdentity linked;
    FileIdentity folded;
    FileIdentity other;
    EXPECT_EQ(files.ReadIdentity(folder.System(u"a"), direct), 0);
    EXPECT_EQ(files.ReadIdentity(folder.System(u"LINK\\"), linked), 0);
    EXPECT_EQ(files.ReadIdentity(folder.System(u"a\\sub\\.."), folded), 0);
    EXPECT_EQ(files.ReadIdentity(folder.System(u"b"), other), 0);
    EXPECT_EQ(direct, linked);
    EXPECT_EQ(direct, folded);
    EXPECT_FALSE(direct == other);
    EXPECT_EQ(files.ReadIdentity(folder.System(u"nope"), other), ENOENT);
}

TEST(HoldFolder, AHeldFolderKnowsWhatIsMadeInIt) {
    const TemporaryFolder folder;
    folder.WriteFile("sub/Before", "x");
    const auto hold = GetFileSystem().HoldFolder(folder.System(u"SUB"));
    ASSERT_NE(hold, nullptr);
    WriteThrough(folder.System(u"sub\\BEFORE"), "1");
    WriteThrough(folder.System(u"sub\\New"), "2");
    WriteThrough(folder.System(u"sub\\NEW"), "3");
    CreateOneDirectory(folder.System(u"sub\\Folder"));
    EXPECT_THROW(CreateOneDirectory(folder.System(u"sub\\FOLDER")), std::exception);
    EXPECT_EQ(folder.Tree(), (Names{"sub/", "sub/Before", "sub/Folder/", "sub/New"}));
    EXPECT_EQ(folder.ReadFile("sub/New"), "3");
}

TEST(HoldFolder, WhatIsMadeByAnotherPathToTheFolderIsKnownToo) {
    const TemporaryFolder folder;
    folder.MakeFolder("sub");
    folder.MakeLink("sub", "link");
    const auto hold = GetFileSystem().HoldFolder(folder.System(u"sub"));
    EXPECT_FALSE(IsExistingFile(folder.System(u"sub\\File")));
    WriteThrough(folder.System(u"link\\File"), "1");
    WriteThrough(folder.System(u"sub\\FILE"), "2");
    EXPECT_EQ(folder.Tree(), (Names{"link", "sub/", "sub/File"}));
}

TEST(HoldFolder, TheFirstInListingOrderIsTakenThereAsWell) {
    const TemporaryFolder folder;
    for (const char* name : {"file", "fILE", "File"}) {
        folder.WriteFile(name, name);
    }
    const auto hold = GetFileSystem().HoldFolder(folder.System());
    EXPECT_EQ(ContentOf(folder.System(u"FILE")), "File");
    EXPECT_EQ(ContentOf(folder.System(u"fILE")), "fILE");
}

TEST(HoldFolder, NothingIsHeldBehindItsEnd) {
    const TemporaryFolder folder;
    {
        const auto hold = GetFileSystem().HoldFolder(folder.System());
        EXPECT_FALSE(IsExistingFile(folder.System(u"FILE")));
    }
    folder.WriteFile("file", "x");
    EXPECT_TRUE(IsExistingFile(folder.System(u"FILE")));
}

TEST(HoldFolder, HoldsAreOfOneThread) {
    const TemporaryFolder folder;
    const auto hold = GetFileSystem().HoldFolder(folder.System());
    EXPECT_FALSE(IsExistingFile(folder.System(u"FILE")));
    folder.WriteFile("file", "x");
    bool isSeen = false;
    std::thread([&] { isSeen = IsExistingFile(folder.System(u"FILE")); }).join();
    EXPECT_TRUE(isSeen);
}

TEST(HoldFolder, AFolderThatIsNotThereCantBeHeld) {
    const TemporaryFolder folder;
    EXPECT_EQ(GetFileSystem().HoldFolder(folder.System(u"nope")), nullptr);
    EXPECT_EQ(GetFileSystem().HoldFolder(u"D:\\"), nullptr);
}

TEST(SetFileSystem, GivesTheOneBeforeAndNullIsTheNativeOne) {
    EXPECT_EQ(&GetFileSystem(), &GetNativeFileSystem());
    FileSystem& native = GetNativeFileSystem();
    EXPECT_EQ(SetFileSystem(&native), nullptr);
    EXPECT_EQ(SetFileSystem(nullptr), &native);
    EXPECT_EQ(&GetFileSystem(), &native);
}

}  // namespace

}  // namespace qn::dsc::osdep
