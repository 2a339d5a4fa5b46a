#include "qn/dsc/osdep/NativePath.h"

#include <cerrno>
#include <string>

#include <gtest/gtest.h>

#include "support/ExactText.h"
#include "support/TemporaryFolder.h"

namespace qn::dsc::osdep {

namespace {

// The native form, with the separator at its end that the path was written with; or "errno " and the number.
std::string Native(const String& path) {
    NativePath native;
    const int error = MakeNativePath(path, native);
    if (error != 0) {
        return "errno " + std::to_string(error);
    }
    return native.text + (native.endsInSeparator ? "/" : "");
}

const std::string namesNothing = "errno " + std::to_string(ENOENT);

TEST(NativePath, DriveCIsTheRoot) {
    EXPECT_EQ(Native(u"C:\\"), "/");
    EXPECT_EQ(Native(u"C:\\opt\\host\\Targets"), "/opt/host/Targets");
    EXPECT_EQ(Native(u"C:\\opt\\host\\"), "/opt/host/");
}

TEST(NativePath, TheLetterOfTheDriveHasNoCase) {
    EXPECT_EQ(Native(u"c:\\opt"), "/opt");
}

TEST(NativePath, OtherDrivesNameNothing) {
    EXPECT_EQ(Native(u"D:\\"), namesNothing);
    EXPECT_EQ(Native(u"d:\\opt"), namesNothing);
    EXPECT_EQ(Native(u"AB:\\opt"), namesNothing);
    EXPECT_EQ(Native(u"CC:\\opt"), namesNothing);
    EXPECT_EQ(Native(u"D:opt"), namesNothing);
}

TEST(NativePath, TheRootOfADriveOfTwoLettersNamesNothing) {
    EXPECT_EQ(Native(u"AB:\\"), namesNothing);
    EXPECT_EQ(Native(u"ab:/"), namesNothing);
}

TEST(NativePath, NetworkPathsNameNothing) {
    EXPECT_EQ(Native(u"\\\\server\\share"), namesNothing);
    EXPECT_EQ(Native(u"\\\\"), namesNothing);
    EXPECT_EQ(Native(u"//server/share"), namesNothing);
    EXPECT_EQ(Native(u"/\\server"), namesNothing);
    EXPECT_EQ(Native(u"\\\\?\\C:\\opt"), namesNothing);
}

TEST(NativePath, TheEmptyPathNamesNothing) {
    EXPECT_EQ(Native(u""), namesNothing);
    EXPECT_EQ(Native(String(u"\0C:\\", 4)), namesNothing);
}

TEST(NativePath, EndsAtItsFirstNul) {
    EXPECT_EQ(Native(String(u"C:\\a\0\\b", 7)), "/a");
}

TEST(NativePath, ASlashIsASeparator) {
    EXPECT_EQ(Native(u"C:/opt\\host/x"), "/opt/host/x");
    EXPECT_EQ(Native(u"C:\\opt/host/"), "/opt/host/");
}

TEST(NativePath, DotsAreFoldedAsText) {
    EXPECT_EQ(Native(u"C:\\x\\..\\y"), "/y");
    EXPECT_EQ(Native(u"C:\\a\\.\\b\\..\\..\\c"), "/c");
    EXPECT_EQ(Native(u"C:\\a\\."), "/a");
    EXPECT_EQ(Native(u"C:\\a\\b\\.."), "/a");
    EXPECT_EQ(Native(u"C:\\a\\b\\..\\"), "/a/");
    EXPECT_EQ(Native(u"C:\\a/../b"), "/b");
}

TEST(NativePath, TheRootIsItsOwnParent) {
    EXPECT_EQ(Native(u"C:\\.."), "/");
    EXPECT_EQ(Native(u"C:\\..\\..\\a"), "/a");
    EXPECT_EQ(Native(u"C:\\a\\..\\..\\..\\"), "/");
}

TEST(NativePath, NamesOfMoreDotsAreNames) {
    EXPECT_EQ(Native(u"C:\\...\\a"), "/.../a");
    EXPECT_EQ(Native(u"C:\\a.\\.b"), "/a./.b");
}

// By Compare these are "." and "..", since the other units count for nothing there.
TEST(NativePath, NamesThatOnlyCompareAsDotsAreNames) {
    EXPECT_EQ(Native(u"C:\\a\\.\x01\\b"), "/a/.\x01/b");
    EXPECT_EQ(Native(u"C:\\a\\.\x02."), "/a/.\x02.");
    EXPECT_EQ(Native(u"C:\\a\\..\u200B\\b"), "/a/..\xE2\x80\x8B/b");
}

TEST(NativePath, DoubledSeparatorsCountAsOne) {
    EXPECT_EQ(Native(u"C:\\\\a\\\\\\b\\\\"), "/a/b/");
}

TEST(NativePath, WithoutADriveTheCurrentOneIsMeant) {
    EXPECT_EQ(Native(u"\\opt\\host"), "/opt/host");
    EXPECT_EQ(Native(u"/opt/host"), "/opt/host");
    EXPECT_EQ(Native(u"\\"), "/");
}

TEST(NativePath, RelativePathsStartAtTheWorkingFolder) {
    const TemporaryFolder folder;
    folder.MakeFolder("a\\b");
    const WorkingFolderScope scope(folder.Native("a\\b"));
    EXPECT_EQ(Native(u"x\\y"), folder.Native("a\\b/x/y"));
    EXPECT_EQ(Native(u"..\\x"), folder.Native("x"));
    EXPECT_EQ(Native(u"."), folder.Native("a\\b"));
    EXPECT_EQ(Native(u"C:x"), folder.Native("a\\b/x"));
    EXPECT_EQ(Native(u"C:"), folder.Native("a\\b"));
}

TEST(NativePath, RelativePathsStartAtTheRootIfThatIsTheWorkingFolder) {
    const WorkingFolderScope scope("/");
    EXPECT_EQ(Native(u"x\\y"), "/x/y");
    EXPECT_EQ(Native(u".."), "/");
    EXPECT_EQ(Native(u"."), "/");
}

TEST(NativePath, AColonBehindTheDriveIsPartOfAName) {
    EXPECT_EQ(Native(u"C:\\a:b\\C:\\x"), "/a:b/C:/x");
}

TEST(NativePath, AColonBehindOtherSignsThanLettersIsPartOfAName) {
    const WorkingFolderScope scope("/");
    EXPECT_EQ(Native(u"a1:\\x"), "/a1:/x");
    EXPECT_EQ(Native(u"1a:\\x"), "/1a:/x");
    EXPECT_EQ(Native(u"1:\\x"), "/1:/x");
    EXPECT_EQ(Native(u"abc:\\x"), "/abc:/x");
    EXPECT_EQ(Native(u"ab:x"), "/ab:x");
    EXPECT_EQ(Native(u"ab-\\x"), "/ab-/x");
}

TEST(NativePath, NamesAreEncodedByTheRuleForNativeText) {
    EXPECT_EQ(Native(u"C:\\\x00E9\\\xD83D\xDE00\\\xDCFF.x\\\xD800"), "/\xC3\xA9/\xF0\x9F\x98\x80/\xFF.x/?");
}

TEST(NativePath, TheUnitForABackslashGivesOneBack) {
    EXPECT_EQ(Native(u"C:\\a\xF05C"
                     u"b\\c"),
              "/a\\b/c");
}

TEST(NativePath, IsAtMost32767UnitsLong) {
    String path = u"C:";
    for (int i = 0; i < 32764 / 2; ++i) {
        path.Append(u"\\a");
    }
    path.Append(u"\\");
    ASSERT_EQ(path.Length(), 32767u);
    EXPECT_EQ(Native(path).size(), 32765u);
    path.Append(u"a");
    EXPECT_EQ(Native(path), "errno " + std::to_string(ENAMETOOLONG));
}

TEST(NativePath, KeepsTheUnitsOfTheLastName) {
    NativePath native;
    ASSERT_EQ(MakeNativePath(u"C:\\a\\*\xF05C?.xml", native), 0);
    EXPECT_EQ(ExactText(native.lastName), "*{F05C}?.xml");
    ASSERT_EQ(MakeNativePath(u"C:\\a\\b\\.", native), 0);
    EXPECT_EQ(ExactText(native.lastName), "b");
    ASSERT_EQ(MakeNativePath(u"C:\\a\xF05C\\b\\..", native), 0);
    EXPECT_EQ(ExactText(native.lastName), "a{F05C}");
    ASSERT_EQ(MakeNativePath(u"C:\\", native), 0);
    EXPECT_EQ(ExactText(native.lastName), "");
}

TEST(SystemPathFromNative, PutsTheDriveBeforeAnAbsolutePath) {
    EXPECT_EQ(ExactText(SystemPathFromNative("/")), "C:\\");
    EXPECT_EQ(ExactText(SystemPathFromNative("/opt/host/Targets")), "C:\\opt\\host\\Targets");
}

TEST(SystemPathFromNative, KeepsASlashAtTheEnd) {
    EXPECT_EQ(ExactText(SystemPathFromNative("/opt/")), "C:\\opt\\");
    EXPECT_EQ(ExactText(SystemPathFromNative("opt/")), "opt\\");
}

TEST(SystemPathFromNative, RepeatedSlashesCountAsOne) {
    EXPECT_EQ(ExactText(SystemPathFromNative("//opt///host//")), "C:\\opt\\host\\");
    EXPECT_EQ(ExactText(SystemPathFromNative("///")), "C:\\");
}

TEST(SystemPathFromNative, RelativePathsStayRelative) {
    EXPECT_EQ(ExactText(SystemPathFromNative("Targets/QN")), "Targets\\QN");
    EXPECT_EQ(ExactText(SystemPathFromNative("../x")), "..\\x");
    EXPECT_EQ(ExactText(SystemPathFromNative(".")), ".");
    EXPECT_EQ(ExactText(SystemPathFromNative("")), "");
}

TEST(SystemPathFromNative, AFolderNamedLikeADriveIsKeptApartFromOne) {
    EXPECT_EQ(ExactText(SystemPathFromNative("C:/x")), ".\\C:\\x");
    EXPECT_EQ(ExactText(SystemPathFromNative("ab:/x")), ".\\ab:\\x");
    EXPECT_EQ(ExactText(SystemPathFromNative("/C:/x")), "C:\\C:\\x");
}

TEST(SystemPathFromNative, ABackslashInANameBecomesAUnitOfItsOwn) {
    EXPECT_EQ(ExactText(SystemPathFromNative("/a\\b/\\")), "C:\\a{F05C}b\\{F05C}");
}

TEST(SystemPathFromNative, BytesOutsideUtf8BecomeUnitsOfTheirOwn) {
    EXPECT_EQ(ExactText(SystemPathFromNative("/\xC3\xA9\xFF/\xF0\x9F\x98\x80")), "C:\\{00E9}{DCFF}\\{D83D}{DE00}");
}

TEST(SystemPathFromNative, ComesBackAsItWas) {
    for (const char* path : {"/", "/a\\b/c:d/\xFF\xC3\xA9/ .x", "/\xED\xA0\x80", "/*?<>|\"'/\x01"}) {
        EXPECT_EQ(Native(SystemPathFromNative(path)), path);
    }
}

}  // namespace

}  // namespace qn::dsc::osdep
