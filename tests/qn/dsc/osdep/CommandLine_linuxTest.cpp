// Native paths, which only Linux has beside those in the system's form.

#include "qn/dsc/osdep/CommandLine.h"

#include <gtest/gtest.h>

#include "qn/dsc/osdep/path.h"
#include "support/ExactText.h"
#include "support/TemporaryFolder.h"

namespace qn::dsc::osdep {

namespace {

std::string Taken(const char* argument) {
    return ExactText(PathFromArgument(argument));
}

TEST(PathFromArgument, ANativePathIsTakenAsOne) {
    EXPECT_EQ(Taken("/opt/host"), "C:\\opt\\host");
    EXPECT_EQ(Taken("/opt/host/"), "C:\\opt\\host\\");
    EXPECT_EQ(Taken("/"), "C:\\");
    EXPECT_EQ(Taken("//opt//host"), "C:\\opt\\host");
}

TEST(PathFromArgument, ARelativeNativePathIsTakenAsOne) {
    EXPECT_EQ(Taken("Targets/QN"), "Targets\\QN");
    EXPECT_EQ(Taken("Targets/QN/"), "Targets\\QN\\");
    EXPECT_EQ(Taken("./a/../b"), ".\\a\\..\\b");
    EXPECT_EQ(Taken("Targets"), "Targets");
}

TEST(PathFromArgument, TheSystemsFormStaysAsItIs) {
    EXPECT_EQ(Taken("C:\\opt\\host"), "C:\\opt\\host");
    EXPECT_EQ(Taken("c:\\opt\\\\host\\"), "c:\\opt\\\\host\\");
    EXPECT_EQ(Taken("Targets\\QN"), "Targets\\QN");
    EXPECT_EQ(Taken("D:\\x"), "D:\\x");
    EXPECT_EQ(Taken("\\\\server\\share"), "\\\\server\\share");
    EXPECT_EQ(Taken("..\\x"), "..\\x");
    EXPECT_EQ(Taken("\\"), "\\");
}

TEST(PathFromArgument, ABackslashAnywhereMakesARelativePathTheSystemsForm) {
    EXPECT_EQ(Taken("Targets\\QN/FPGA"), "Targets\\QN/FPGA");
    EXPECT_EQ(Taken("C:\\opt/host"), "C:\\opt/host");
}

TEST(PathFromArgument, ABackslashBehindALeadingSlashIsPartOfAName) {
    EXPECT_EQ(Taken("/opt/a\\b"), "C:\\opt\\a{F05C}b");
}

TEST(PathFromArgument, NothingStaysNothing) {
    EXPECT_EQ(Taken(""), "");
    EXPECT_EQ(Taken(nullptr), "");
}

TEST(PathFromArgument, DotsAreThemselves) {
    EXPECT_EQ(Taken("."), ".");
    EXPECT_EQ(Taken(".."), "..");
    EXPECT_EQ(Taken("../.."), "..\\..");
}

TEST(PathFromArgument, ABareDriveStaysOne) {
    EXPECT_EQ(Taken("C:"), "C:");
}

TEST(PathFromArgument, AFolderNamedLikeADriveIsKeptApartFromOne) {
    EXPECT_EQ(Taken("C:/opt"), ".\\C:\\opt");
}

TEST(PathFromArgument, BytesAreReadAsThoseOfNames) {
    EXPECT_EQ(Taken("/\xC3\xA9\xFF"), "C:\\{00E9}{DCFF}");
    EXPECT_EQ(Taken("a\\\xC3\xA9\xFF\xF0\x9F\x98\x80"), "a\\{00E9}{DCFF}{D83D}{DE00}");
}

TEST(PathFromArgument, LeadsToTheFolderThatWasMeant) {
    const TemporaryFolder folder;
    folder.MakeFolder("a\\\xFF/C:/x");
    EXPECT_TRUE(IsDirectory(PathFromArgument(folder.Native("a\\\xFF/C:/x").c_str())));
    const WorkingFolderScope scope(folder.Native("a\\\xFF"));
    EXPECT_TRUE(IsDirectory(MakeAbsolutePath(PathFromArgument("C:/x"))));
    EXPECT_TRUE(IsDirectory(MakeAbsolutePath(PathFromArgument(".."))));
    EXPECT_TRUE(IsDirectory(MakeAbsolutePath(PathFromArgument(""))));
}

}  // namespace

}  // namespace qn::dsc::osdep
