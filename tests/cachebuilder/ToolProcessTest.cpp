// The tool as a user runs it: a process, its end, and the files that it leaves.

#include <algorithm>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "cachebuilder/Installation.h"
#include "support/ExactText.h"
#include "support/PrintedLines.h"
#include "support/ProcessEnd.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using Names = std::vector<std::string>;

class Tool : public testing::Test {
  protected:
    std::string Working() const { return installation.Root().Native("Targets/QN/FPGA"); }
    std::string WorkingInSystemForm() const { return ExactText(installation.System()); }

    // An installation in which all goes well.
    void WriteSoundInstallation() const {
        installation.WriteDeviceSpecs();
        installation.Write("a/a_resource.xml", TargetOfFamily("A", "virtex5"));
    }
    std::string SoundCache() const {
        return CacheOf(PlainTargetInCache("A", "Targets\\QN\\FPGA\\a\\a_resource.xml") + deviceSpecsInCache);
    }
    void ExpectSoundRun(const std::vector<std::string>& arguments, const std::string& workingFolder) const {
        EXPECT_EQ(installation.Run(arguments, workingFolder), "exit 0");
        ASSERT_TRUE(installation.HasCache());
        EXPECT_EQ(installation.Cache(), SoundCache());
        EXPECT_EQ(installation.Read("a/menu.txt"), "v5");
    }

    Installation installation;
};

TEST_F(Tool, RunsOnTheParentOfItsFolderWithoutAnArgument) {
    WriteSoundInstallation();
    ExpectSoundRun({}, "/");
}

TEST_F(Tool, WorkingFolderDoesNotMatterWithoutAnArgument) {
    WriteSoundInstallation();
    installation.Root().WriteFile("elsewhere/b_resource.xml", "<Target name=\"B\"/>");
    ExpectSoundRun({}, installation.Root().Native("elsewhere"));
    EXPECT_FALSE(installation.Root().Exists("elsewhere/resource_cache.xml"));
}

// On Windows paths are in the system's form from the outset.
TEST_F(Tool, TakesANativeAbsoluteArgumentAsOnlyLinuxHasNativePaths) {
    WriteSoundInstallation();
    ExpectSoundRun({Working()}, "/");
}

TEST_F(Tool, TakesAnAbsoluteArgumentInTheSystemsForm) {
    WriteSoundInstallation();
    ExpectSoundRun({WorkingInSystemForm()}, "/");
}

TEST_F(Tool, TakesANativeRelativeArgumentAsOnlyLinuxHasNativePaths) {
    WriteSoundInstallation();
    ExpectSoundRun({"Targets/QN/FPGA"}, installation.Root().Native());
}

TEST_F(Tool, TakesARelativeArgumentInTheSystemsForm) {
    WriteSoundInstallation();
    ExpectSoundRun({"QN\\FPGA"}, installation.Root().Native("Targets"));
}

TEST_F(Tool, LetterCaseOfTheArgumentDoesNotMatter) {
    installation.Write("x_resource.xml", "<FPGAHostSet><HostA>1</HostA></FPGAHostSet>");
    EXPECT_EQ(installation.Run({"targets/qn/fpga"}, installation.Root().Native()),
              qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(installation.Cache(), CacheOf("\n   <FPGAHostSet>\n      <HostA>1</HostA>\n   </FPGAHostSet>"));
}

TEST_F(Tool, TakesTheWorkingFolderAsADot) {
    installation.Write("hosts_resource.xml", "<FPGAHostSet><HostA>1</HostA></FPGAHostSet>");
    EXPECT_EQ(installation.Run({"."}, Working()), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(installation.Cache(), CacheOf("\n   <FPGAHostSet>\n      <HostA>1</HostA>\n   </FPGAHostSet>"));
}

TEST_F(Tool, EmptyArgumentIsTheWorkingFolder) {
    installation.Write("hosts_resource.xml", "<FPGAHostSet><HostA>1</HostA></FPGAHostSet>");
    EXPECT_EQ(installation.Run({""}, Working()), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(installation.Cache(), CacheOf("\n   <FPGAHostSet>\n      <HostA>1</HostA>\n   </FPGAHostSet>"));
}

TEST_F(Tool, ArgumentMayEndInASeparator) {
    WriteSoundInstallation();
    ExpectSoundRun({WorkingInSystemForm() + "\\"}, "/");
}

TEST_F(Tool, FurtherArgumentsAreIgnored) {
    WriteSoundInstallation();
    ExpectSoundRun({WorkingInSystemForm(), "--help", "/missing"}, "/");
}

TEST_F(Tool, OptionsAreFolders) {
    WriteSoundInstallation();
    EXPECT_EQ(installation.Run({"--help"}, Working()), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_FALSE(installation.HasCache());
}

TEST_F(Tool, MissingFolderIsAFailureThatLeavesNothing) {
    WriteSoundInstallation();
    const Names before = installation.Root().Tree();
    EXPECT_EQ(installation.Run({Working() + "/missing"}), qn::dsc::osdep::EndWithResult(0x80004005));
    // But for the tool itself, which was put there for the run.
    Names after = installation.Root().Tree();
    std::erase(after, Installation::Below("tool/zkfpga_make_resource_cache"));
    EXPECT_EQ(after, before);
}

TEST_F(Tool, FileAsArgumentIsAFailure) {
    WriteSoundInstallation();
    EXPECT_EQ(installation.Run({Working() + "/specs_resource.xml"}), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_FALSE(installation.HasCache());
    EXPECT_FALSE(installation.Has("a/menu.txt"));
}

TEST_F(Tool, OtherDriveIsAFailure) {
    WriteSoundInstallation();
    EXPECT_EQ(installation.Run({"D:\\" + WorkingInSystemForm().substr(3)}), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(installation.Run({"\\\\server\\share"}), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_FALSE(installation.HasCache());
}

TEST_F(Tool, FolderWithoutResourceFilesGivesAnEmptyCacheAndAFailure) {
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(installation.Cache(), CacheOf(""));
}

TEST_F(Tool, NewerCacheIsIgnoredAndOverwritten) {
    WriteSoundInstallation();
    installation.Write("resource_cache.xml", CacheOf(PlainTargetInCache("Old", "old_resource.xml")));
    installation.Root().SetFileTime(Installation::Below("resource_cache.xml"), 4000000000, 0);
    ExpectSoundRun({}, "/");
}

TEST_F(Tool, SecondRunLeavesTheSame) {
    WriteSoundInstallation();
    ExpectSoundRun({}, "/");
    const Names first = installation.Root().Tree();
    ExpectSoundRun({}, "/");
    EXPECT_EQ(installation.Root().Tree(), first);
}

TEST_F(Tool, WritesTheCacheByteForByte) {
    installation.Write("hosts_resource.xml", "<FPGAHostSet><HostA>1</HostA></FPGAHostSet>");
    installation.Write("a_resource.xml", "<SomeNode><A>a</A></SomeNode>");
    installation.Write("b_resource.xml", "<SomeNode><B>b</B></SomeNode>");
    installation.Write("BoardOne/BoardOne_resource.xml", "<Target name=\"BoardOne\"><Speed>40</Speed></Target>");
    // There are no device specifications.
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(
        installation.Cache(),
        "<?xml version=\"1.0\"?>\n"
        "<ProviderResourceTreeRoot name=\"\">\n"
        "   <Target name=\"BoardOne\" ordered=\"true\">\n"
        "      <DeviceCategory></DeviceCategory>\n"
        "      <EIOItemIconName>fpga\\IO.png</EIOItemIconName>\n"
        "      <EIOItemTypeName>FPGA I/O</EIOItemTypeName>\n"
        "      <FPGAItemSubType></FPGAItemSubType>\n"
        "      <SupportedFPGAHostList></SupportedFPGAHostList>\n"
        "      <TargetClass>COM.QN.FPGA.BoardOne</TargetClass>\n"
        "      <TargetXMLPath>Targets\\QN\\FPGA\\BoardOne\\BoardOne_resource.xml</TargetXMLPath>\n"
        "      <LocalizedInformationToDisplayWhenAddingNewTarget></LocalizedInformationToDisplayWhenAddingNewTarget>\n"
        "      <FindTargetVIPath></FindTargetVIPath>\n"
        "      <DeviceIDs></DeviceIDs>\n"
        "      <CustomFPGAMethodList></CustomFPGAMethodList>\n"
        "   </Target>\n"
        "   <FPGAHostSet>\n"
        "      <HostA>1</HostA>\n"
        "   </FPGAHostSet>\n"
        "   <SomeNode>\n"
        "      <Protocols></Protocols>\n"
        "      <FPGA_XMLSource>Targets\\QN\\FPGA\\a_resource.xml,Targets\\QN\\FPGA\\b_resource.xml</FPGA_XMLSource>\n"
        "   </SomeNode>\n"
        "</ProviderResourceTreeRoot>");
}

TEST_F(Tool, UnorderedTargetOpensWithoutItsOrder) {
    installation.Write("BoardOne_resource.xml",
                       "<Target name=\"BoardOne\" ordered=\"false\"><Speed>40</Speed></Target>");
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_NE(installation.Cache().find("\n   <Target name=\"BoardOne\">\n      <DeviceCategory></DeviceCategory>\n"),
              std::string::npos);
}

TEST_F(Tool, BrokenResourceFileLeavesTheCacheAndEndsInATrap) {
    WriteSoundInstallation();
    installation.Write("broken_resource.xml", "<Target name=\"B\"><K>v</K>");
    installation.Write("y/y_resource.xml", TargetOfFamily("Y", "virtex5"));
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::endByTrap);
    ASSERT_TRUE(installation.HasCache());
    EXPECT_NE(installation.Cache().find("<Target name=\"A\""), std::string::npos);
    EXPECT_EQ(installation.Cache().find("XMLParseErrors"), std::string::npos);
    // "A" stands before "XMLParseErrors", "Y" behind it.
    EXPECT_TRUE(installation.Has("a/menu.txt"));
    EXPECT_FALSE(installation.Has("y/menu.txt"));
}

TEST_F(Tool, EmptyResourceFileIsABrokenOne) {
    WriteSoundInstallation();
    installation.Write("empty_resource.xml", "");
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::endByTrap);
    EXPECT_EQ(installation.Cache(), SoundCache());
}

TEST_F(Tool, BrokenResourceFileWithoutSpecificationsIsAPlainFailure) {
    installation.Write("broken_resource.xml", "<Target");
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(installation.Cache(), CacheOf(""));
}

TEST_F(Tool, ResourceFileThatCannotBeOpenedIsPassedOver) {
    WriteSoundInstallation();
    installation.Root().MakeFolder(Installation::Below("folder_resource.xml"));
    ExpectSoundRun({}, "/");
}

// Windows has no pipes in folders, and Wine doesn't show links that lead nowhere.
TEST_F(Tool, PipeOrDanglingLinkIsPassedOverAsOnlyLinuxHasThem) {
    WriteSoundInstallation();
    installation.Root().MakeLink("nowhere", Installation::Below("link_resource.xml"));
    installation.Root().MakePipe(Installation::Below("pipe_resource.xml"));
    ExpectSoundRun({}, "/");
}

TEST_F(Tool, CompilationSettingsThatAreATextEndInATrap) {
    WriteSoundInstallation();
    installation.Write("b/b_resource.xml", "<Target name=\"B\"><FPGACompilation>x</FPGACompilation></Target>");
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::endByTrap);
    EXPECT_TRUE(installation.HasCache());
    EXPECT_TRUE(installation.Has("a/menu.txt"));
}

TEST_F(Tool, CacheThatCannotBeOpenedIsAFailureBeforeTheMenus) {
    WriteSoundInstallation();
    installation.Root().MakeFolder(Installation::Below("resource_cache.xml"));
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_FALSE(installation.Has("a/menu.txt"));
}

TEST_F(Tool, FullDiskIsAFailureBeforeTheMenus) {
    WriteSoundInstallation();
    installation.Root().MakeLink("/dev/full", Installation::Below("resource_cache.xml"));
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_FALSE(installation.Has("a/menu.txt"));
}

TEST_F(Tool, MissingFamilyIsAFailureBehindTheCache) {
    installation.Write("specs_resource.xml",
                       "<FpgaDeviceSpecs><Virtex5><XIPINMenusPath>menus/v5</XIPINMenusPath></Virtex5>"
                       "<Virtex6><XIPINMenusPath>menus/v6</XIPINMenusPath></Virtex6></FpgaDeviceSpecs>");
    installation.Root().WriteFile("menus/v5/menu.txt", "v5");
    installation.Write("a/a_resource.xml", TargetOfFamily("A", "virtex5"));
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(installation.Cache(), SoundCache());
    EXPECT_FALSE(installation.Has("a/menu.txt"));
}

TEST_F(Tool, FailedCopyEndsTheProcessAndKeepsWhatWasCopied) {
    WriteSoundInstallation();
    installation.Write("b/b_resource.xml", TargetOfFamily("B", "virtex5"));
    installation.Root().MakeFolder(Installation::Below("b/menu.txt"));
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::endByAbort);
    EXPECT_TRUE(installation.HasCache());
    EXPECT_EQ(installation.Read("a/menu.txt"), "v5");
}

TEST_F(Tool, MenuPathThatCannotBeFoldedEndsTheProcess) {
    WriteSoundInstallation();
    installation.Write("specs_resource.xml",
                       "<FpgaDeviceSpecs><Virtex5><XIPINMenusPath>menus/.../v5</XIPINMenusPath></Virtex5>"
                       "<Virtex6><K>v</K></Virtex6><spartan6><K>v</K></spartan6></FpgaDeviceSpecs>");
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::endByAbort);
    EXPECT_EQ(installation.Cache(), SoundCache());
}

TEST_F(Tool, TargetOfAnotherFamilyIsNoFailure) {
    installation.WriteDeviceSpecs();
    installation.Write("a/a_resource.xml", TargetOfFamily("A", "kintex7"));
    EXPECT_EQ(installation.Run(), "exit 0");
    EXPECT_EQ(installation.Cache(), SoundCache());
    EXPECT_FALSE(installation.Has("a/menu.txt"));
}

TEST_F(Tool, TargetsWithoutMenusAreNoFailure) {
    installation.Write("specs_resource.xml", deviceSpecs);
    installation.Write("a/a_resource.xml", TargetOfFamily("A", "virtex5"));
    EXPECT_EQ(installation.Run(), "exit 0");
    EXPECT_EQ(installation.Cache(), SoundCache());
}

TEST_F(Tool, PathsAreWholeWhereTheHostStandsBesideTheTool) {
    WriteSoundInstallation();
    installation.Write("tool/zkde.exe", "");
    EXPECT_EQ(installation.Run(), "exit 0");
    EXPECT_NE(
        installation.Cache().find("<TargetXMLPath>" + WorkingInSystemForm() + "\\a\\a_resource.xml</TargetXMLPath>"),
        std::string::npos);
}

TEST_F(Tool, IncludesStartAtTheFolderOfTheHost) {
    installation.Root().WriteFile("shared/part.xml", "<DeviceIDs><A>1</A></DeviceIDs>");
    installation.Write("a_resource.xml", "<Target name=\"A\"><:Include>shared/part.xml</:Include></Target>");
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_NE(installation.Cache().find("\n      <DeviceIDs>\n         <A>1</A>\n      </DeviceIDs>\n"),
              std::string::npos);
}

TEST_F(Tool, NamesBeyondAsciiComeThrough) {
    installation.Write("\xC3\xA9/\xE2\x82\xAC_resource.xml", "<Target name=\"\xC3\xA9\"/>");
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(installation.Cache(),
              CacheOf(PlainTargetInCache("\xC3\xA9", "Targets\\QN\\FPGA\\\xC3\xA9\\\xE2\x82\xAC_resource.xml")));
}

TEST_F(Tool, DocumentOf100000LevelsIsReadAndLeftBehind) {
    std::string text = "<Target name=\"Deep\">";
    for (int i = 0; i < 100000; ++i) {
        text += "<N>";
    }
    text += "<K>v</K>";
    for (int i = 0; i < 100000; ++i) {
        text += "</N>";
    }
    installation.Write("deep_resource.xml", text + "</Target>");
    EXPECT_EQ(installation.Run(), qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(installation.Cache(), CacheOf(PlainTargetInCache("Deep", "Targets\\QN\\FPGA\\deep_resource.xml")));
}

// By a tool for the files of Linux; tests/layout has the exports on Windows.
TEST_F(Tool, ExportsOneFunctionAsOnlyLinuxListsSymbols) {
    Names exported;
    for (const std::string& line :
         qn::dsc::osdep::PrintedLines(ZKFPGA_NM, {"-D", "--defined-only", "--format=just-symbols", ZKFPGA_TOOL})) {
        exported.push_back(line.substr(0, line.find('@')));
    }
    EXPECT_EQ(std::count(exported.begin(), exported.end(), "gFPGAResTree"), 1);
    // What the compiler's own libraries and a sanitizer bring along doesn't count.
    for (const std::string& name : exported) {
        EXPECT_EQ(name.find("zkhw"), std::string::npos) << name;
        EXPECT_EQ(name.find("qn3dsc"), std::string::npos) << name;
    }
}

}  // namespace
}  // namespace zkhw
