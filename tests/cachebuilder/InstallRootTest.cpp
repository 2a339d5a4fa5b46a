#include "restree/InstallRoot.h"

#include <gtest/gtest.h>

#include "cachebuilder/Installation.h"
#include "qn/dsc/osdep/_GetExeFullPath.h"
#include "support/ExactText.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::String;
using qn::dsc::osdep::FileCall;
using qn::dsc::osdep::FileSystem;

std::string RootFor(const Installation& installation, const char16_t* executable) {
    ExecutableScope scope(installation, executable);
    return ExactText(GetInstallRoot());
}

// Everything is there but files with the names of the host's executables, unless they are below a path.
class NoHostAbove : public qn::dsc::osdep::FaultyFileSystem {
  public:
    int ReadAttributes(const String& path, qn::dsc::osdep::FileAttributes& attributes) override {
        return ExactText(path).ends_with(".exe") ? ENOENT : FaultyFileSystem::ReadAttributes(path, attributes);
    }
};

TEST(InstallRoot, IsTheFolderAboveTheToolThatHoldsTheHost) {
    const Installation installation;
    EXPECT_EQ(RootFor(installation, toolPath), ExactText(installation.Root().System()));
}

TEST(InstallRoot, AnyOfTheThreeExecutablesWillDo) {
    for (const char* name : {"Zarvik.exe", "zkre.exe", "zkde.exe"}) {
        const Installation installation;
        installation.Root().WriteFile("Targets/" + std::string(name), "");
        EXPECT_EQ(RootFor(installation, toolPath), ExactText(installation.Root().System(u"Targets"))) << name;
    }
}

TEST(InstallRoot, NameOfTheHostMayHaveAnyLetterCase) {
    const Installation installation;
    installation.Root().WriteFile("Targets/ZARVIK.EXE", "");
    EXPECT_EQ(RootFor(installation, toolPath), ExactText(installation.Root().System(u"Targets")));
}

TEST(InstallRoot, FolderWithTheNameOfTheHostDoesNotCount) {
    const Installation installation;
    installation.Root().MakeFolder("Targets/Zarvik.exe");
    EXPECT_EQ(RootFor(installation, toolPath), ExactText(installation.Root().System()));
}

TEST(InstallRoot, NearestFolderWins) {
    const Installation installation;
    installation.Write("zkde.exe", "");
    EXPECT_EQ(RootFor(installation, toolPath), ExactText(installation.System()));
}

TEST(InstallRoot, HostBesideTheToolGivesItsFolderWithABackslash) {
    const Installation installation;
    installation.Write("tool/zkre.exe", "");
    EXPECT_EQ(RootFor(installation, toolPath), ExactText(installation.System(u"tool\\")));
}

TEST(InstallRoot, ToolMayHaveAnyLetterCaseAndEnding) {
    const Installation installation;
    EXPECT_EQ(RootFor(installation, u"Targets\\QN\\FPGA\\tool\\ZKFPGA_make_resource_CACHE.exe"),
              ExactText(installation.Root().System()));
}

TEST(InstallRoot, IsTheFolderOfAnyOtherExecutableWithABackslash) {
    const Installation installation;
    EXPECT_EQ(RootFor(installation, u"Zarvik.exe"), ExactText(installation.Root().System()) + "\\");
    EXPECT_EQ(RootFor(installation, u"Targets\\QN\\other"), ExactText(installation.Root().System(u"Targets\\QN\\")));
    EXPECT_EQ(RootFor(installation, u"Targets\\zkfpga_make_resource_cache2.exe"),
              ExactText(installation.Root().System(u"Targets\\")));
}

TEST(InstallRoot, OtherExecutableTestsNothing) {
    const Installation installation;
    ExecutableScope scope(installation, u"Targets\\host");
    GetInstallRoot();
    EXPECT_EQ(scope.Files().Count(FileCall::ReadAttributes), 0u);
}

TEST(InstallRoot, IsTheDriveWhereThereIsNoHost) {
    const Installation installation;
    NoHostAbove files;
    files.SetExecutablePath(installation.Root().System(toolPath));
    const qn::dsc::osdep::FileSystemScope scope(files);
    EXPECT_EQ(ExactText(GetInstallRoot()), "C:\\");
}

TEST(InstallRoot, IsLookedForAnewWhenFilesAreSubstituted) {
    const Installation first;
    const Installation second;
    EXPECT_EQ(RootFor(first, toolPath), ExactText(first.Root().System()));
    EXPECT_EQ(RootFor(second, toolPath), ExactText(second.Root().System()));
    EXPECT_EQ(ExactText(GetInstallRoot()), ExactText(qn::dsc::osdep::GetExecutableDir()));
}

}  // namespace
}  // namespace zkhw
