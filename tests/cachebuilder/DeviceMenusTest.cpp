#include "cachebuilder/DeviceMenus.h"

#include <memory>

#include <gtest/gtest.h>

#include "cachebuilder/Installation.h"
#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/OSException.h"
#include "restree/ResTreeNode.h"
#include "support/ExactText.h"
#include "support/ProcessEnd.h"

namespace zkhw {
namespace {

using qn::dsc::ExactText;
using qn::dsc::osdep::FileCall;
using qn::dsc::osdep::TemporaryFolder;
using Names = std::vector<std::string>;

constexpr int32_t failure = static_cast<int32_t>(0x80004005);

class DeviceMenus : public testing::Test {
  protected:
    DeviceMenus() { installation.WriteDeviceSpecs(); }

    void Load(const std::string& text) { ASSERT_EQ(root->LoadResourceText(String(text.c_str()), true, nullptr), 0); }

    // A target in a folder of its own in the working directory.
    void AddTarget(const std::string& name, const std::string& family) {
        Load(TargetOfFamily(name, family));
        SetTargetDir(name, installation.System(String(name.c_str()).CStr()));
        installation.Root().MakeFolder(Installation::Below(name));
    }
    void SetTargetDir(const std::string& name, const String& directory) {
        root->Find(String(name.c_str()).View())->Child()->SetProperty(u"TargetDir", directory.View());
    }

    int32_t Install() {
        ExecutableScope scope(installation, toolPath);
        return InstallDeviceMenus(*root);
    }

    // What stands in the folder of a target.
    Names In(const std::string& target) {
        Names names;
        const std::string head = Installation::Below(target + "/");
        for (const std::string& path : installation.Root().Tree()) {
            if (path.starts_with(head) && path.size() > head.size()) {
                names.push_back(path.substr(head.size()));
            }
        }
        return names;
    }

    Installation installation;
    std::unique_ptr<ResTreeNode> root = std::make_unique<ResTreeNode>(u"", u"ProviderResourceTreeRoot", false);
};

TEST_F(DeviceMenus, EachTargetGetsTheMenusOfItsFamily) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    AddTarget("B", "virtex6");
    AddTarget("C", "spartan6");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Read("A/menu.txt"), "v5");
    EXPECT_EQ(installation.Read("B/menu.txt"), "v6");
    EXPECT_EQ(installation.Read("C/menu.txt"), "s6");
}

TEST_F(DeviceMenus, FamilyMayHaveAnyLetterCase) {
    Load(deviceSpecs);
    AddTarget("A", "VIRTEX5");
    AddTarget("B", "Spartan6");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Read("A/menu.txt"), "v5");
    EXPECT_EQ(installation.Read("B/menu.txt"), "s6");
}

TEST_F(DeviceMenus, NamesOfTheSpecificationsMayHaveAnyLetterCase) {
    Load(
        "<fpgadevicespecs><VIRTEX5><xipinmenuspath>menus/v5</xipinmenuspath></VIRTEX5>"
        "<virtex6><K>v</K></virtex6><SPARTAN6><K>v</K></SPARTAN6></fpgadevicespecs>");
    AddTarget("A", "virtex5");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Read("A/menu.txt"), "v5");
}

TEST_F(DeviceMenus, TargetOfAnotherFamilyIsPassedOver) {
    Load(deviceSpecs);
    AddTarget("A", "kintex7");
    AddTarget("B", "");
    AddTarget("C", "virtex55");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(In("A"), Names{});
    EXPECT_EQ(In("B"), Names{});
    EXPECT_EQ(In("C"), Names{});
}

TEST_F(DeviceMenus, NodeThatIsNoTargetIsPassedOver) {
    Load(deviceSpecs);
    Load("<Board name=\"A\"><FPGACompilation><DeviceFamily>virtex5</DeviceFamily></FPGACompilation></Board>");
    SetTargetDir("A", installation.System(u"A"));
    EXPECT_EQ(Install(), 0);
    EXPECT_FALSE(installation.Has("A"));
}

TEST_F(DeviceMenus, TargetWithoutCompilationSettingsIsPassedOver) {
    Load(deviceSpecs);
    Load("<Target name=\"A\"><DeviceFamily>virtex5</DeviceFamily></Target>");
    SetTargetDir("A", installation.System(u"A"));
    EXPECT_EQ(Install(), 0);
    EXPECT_FALSE(installation.Has("A"));
}

TEST_F(DeviceMenus, TargetWhoseFamilyIsMissingOrANodeIsPassedOver) {
    Load(deviceSpecs);
    Load("<Target name=\"A\"><FPGACompilation><Other>virtex5</Other></FPGACompilation></Target>");
    Load("<Target name=\"B\"><FPGACompilation><DeviceFamily name=\"DeviceFamily\"/></FPGACompilation></Target>");
    SetTargetDir("A", installation.System(u"A"));
    SetTargetDir("B", installation.System(u"B"));
    EXPECT_EQ(Install(), 0);
    EXPECT_FALSE(installation.Has("A"));
    EXPECT_FALSE(installation.Has("B"));
}

TEST_F(DeviceMenus, TargetWithoutAFolderIsPassedOver) {
    Load(deviceSpecs);
    Load(TargetOfFamily("A", "virtex5"));
    AddTarget("B", "virtex5");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Read("B/menu.txt"), "v5");
}

TEST_F(DeviceMenus, FamilyWhoseMenuFolderIsMissingIsPassedOver) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    AddTarget("B", "virtex6");
    installation.Root().Remove("menus/v5/menu.txt");
    installation.Root().Remove("menus/v5");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(In("A"), Names{});
    EXPECT_EQ(installation.Read("B/menu.txt"), "v6");
}

TEST_F(DeviceMenus, FoldersOfTheMenusAreCopiedWithAllThatIsInThem) {
    Load(deviceSpecs);
    installation.Root().WriteFile("menus/v5/sub/deep/x.mnu", "x");
    installation.Root().MakeFolder("menus/v5/empty");
    AddTarget("A", "virtex5");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(In("A"), (Names{"empty/", "menu.txt", "sub/", "sub/deep/", "sub/deep/x.mnu"}));
}

TEST_F(DeviceMenus, FilesThatStandAreOverwrittenAndOthersLeftAlone) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    installation.Write("A/menu.txt", "something longer");
    installation.Write("A/own.txt", "own");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Read("A/menu.txt"), "v5");
    EXPECT_EQ(installation.Read("A/own.txt"), "own");
}

TEST_F(DeviceMenus, SecondRunGivesTheSame) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    EXPECT_EQ(Install(), 0);
    const Names first = installation.Root().Tree();
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Root().Tree(), first);
    EXPECT_EQ(installation.Read("A/menu.txt"), "v5");
}

TEST_F(DeviceMenus, FolderOfATargetIsMadeIfItIsMissing) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    SetTargetDir("A", installation.System(u"new\\folder"));
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Read("new/folder/menu.txt"), "v5");
}

TEST_F(DeviceMenus, AbsoluteMenuPathWins) {
    const TemporaryFolder elsewhere;
    elsewhere.WriteFile("m.txt", "absolute");
    Load(deviceSpecs);
    root->Lookup(u"FpgaDeviceSpecs/Virtex5", nullptr)->SetProperty(u"XIPINMenusPath", elsewhere.System().View());
    AddTarget("A", "virtex5");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(In("A"), Names{"m.txt"});
}

TEST_F(DeviceMenus, MenuPathMayHoldDots) {
    Load(deviceSpecs);
    root->Lookup(u"FpgaDeviceSpecs/Virtex5", nullptr)->SetProperty(u"XIPINMenusPath", u"menus\\.\\v6\\..\\v5\\");
    AddTarget("A", "virtex5");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Read("A/menu.txt"), "v5");
}

TEST_F(DeviceMenus, TargetInsideTheMenuFolderIsNotCopiedOnto) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    SetTargetDir("A", installation.Root().System(u"MENUS\\v5\\inner"));
    const Names before = installation.Root().Tree();
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Root().Tree(), before);
}

TEST_F(DeviceMenus, TargetInTheMenuFolderItselfIsNotCopiedOnto) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    SetTargetDir("A", installation.Root().System(u"menus\\v5"));
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Root().ReadFile("menus/v5/menu.txt"), "v5");
}

TEST_F(DeviceMenus, TargetInAFolderWhoseNameBeginsAlikeIsCopiedTo) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    SetTargetDir("A", installation.Root().System(u"menus\\v5x"));
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Root().ReadFile("menus/v5x/menu.txt"), "v5");
}

TEST_F(DeviceMenus, MissingMenuPathMeansTheWholeInstallationAndCopiesNothingIntoIt) {
    Load(
        "<FpgaDeviceSpecs><Virtex5><K>v</K></Virtex5><Virtex6><K>v</K></Virtex6><spartan6><K>v</K></spartan6>"
        "</FpgaDeviceSpecs>");
    AddTarget("A", "virtex5");
    const Names before = installation.Root().Tree();
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(installation.Root().Tree(), before);
}

TEST_F(DeviceMenus, MissingMenuPathCopiesTheWholeInstallationToATargetOutsideIt) {
    const TemporaryFolder elsewhere;
    Load(
        "<FpgaDeviceSpecs><Virtex5><K>v</K></Virtex5><Virtex6><K>v</K></Virtex6><spartan6><K>v</K></spartan6>"
        "</FpgaDeviceSpecs>");
    AddTarget("A", "virtex5");
    SetTargetDir("A", elsewhere.System());
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(elsewhere.Tree(), installation.Root().Tree());
}

TEST_F(DeviceMenus, TreeWithoutATargetIsFine) {
    Load(deviceSpecs);
    EXPECT_EQ(Install(), 0);
}

TEST_F(DeviceMenus, MissingSpecificationsAreAFailure) {
    AddTarget("A", "virtex5");
    EXPECT_EQ(Install(), failure);
    EXPECT_EQ(In("A"), Names{});
}

TEST_F(DeviceMenus, SpecificationsThatAreNoNodeAreAFailure) {
    root->SetProperty(u"FpgaDeviceSpecs", u"text");
    EXPECT_EQ(Install(), failure);
}

TEST_F(DeviceMenus, EveryFamilyMustBeThereBeforeAnythingIsCopied) {
    for (const char16_t* family : {u"Virtex5", u"Virtex6", u"spartan6"}) {
        root = std::make_unique<ResTreeNode>(u"", u"ProviderResourceTreeRoot", false);
        Load(deviceSpecs);
        root->Find(u"FpgaDeviceSpecs")->Child()->RemoveEntryByName(family);
        AddTarget("A", "virtex5");
        AddTarget("B", "spartan6");
        EXPECT_EQ(Install(), failure) << ExactText(String(family));
        EXPECT_EQ(In("A"), Names{});
        EXPECT_EQ(In("B"), Names{});
    }
}

TEST_F(DeviceMenus, FamilyThatIsATextIsAFailure) {
    for (const char16_t* family : {u"Virtex5", u"Virtex6", u"spartan6"}) {
        root = std::make_unique<ResTreeNode>(u"", u"ProviderResourceTreeRoot", false);
        Load(deviceSpecs);
        ResTreeNode& specs = *root->Find(u"FpgaDeviceSpecs")->Child();
        specs.RemoveEntryByName(family);
        specs.SetProperty(family, u"text");
        EXPECT_EQ(Install(), failure) << ExactText(String(family));
    }
}

TEST_F(DeviceMenus, MenuPathThatIsNoTextCountsAsEmpty) {
    Load(
        "<FpgaDeviceSpecs><Virtex5><XIPINMenusPath name=\"XIPINMenusPath\"/></Virtex5><Virtex6><K>v</K></Virtex6>"
        "<spartan6><K>v</K></spartan6></FpgaDeviceSpecs>");
    AddTarget("A", "virtex5");
    EXPECT_EQ(Install(), 0);
    EXPECT_EQ(In("A"), Names{});
}

using DeviceMenusDeathTest = DeviceMenus;

TEST_F(DeviceMenusDeathTest, EntryOfTheRootThatIsNoNodeIsATrap) {
    Load(deviceSpecs);
    root->SetProperty(u"XMLParseErrors", u"Error on line 1");
    EXPECT_EXIT(Install(), qn::dsc::osdep::EndsByTrap, "");
}

TEST_F(DeviceMenusDeathTest, LinkOfTheRootIsATrap) {
    Load(deviceSpecs);
    root->AddLinkEntry(u"L", u"FpgaDeviceSpecs");
    EXPECT_EXIT(Install(), qn::dsc::osdep::EndsByTrap, "");
}

// On Windows the child begins anew, with a folder of its own that is gone when it ends.
TEST_F(DeviceMenusDeathTest, TargetsBeforeTheTrapAreServedAndThoseBehindItAreNotAsOnlyLinuxForks) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    AddTarget("Z", "virtex5");
    root->SetProperty(u"XMLParseErrors", u"Error on line 1");
    EXPECT_EXIT(Install(), qn::dsc::osdep::EndsByTrap, "");
    EXPECT_EQ(In("A"), Names{"menu.txt"});
    EXPECT_EQ(In("Z"), Names{});
}

TEST_F(DeviceMenusDeathTest, MissingSpecificationsComeBeforeTheTrap) {
    root->SetProperty(u"XMLParseErrors", u"Error on line 1");
    EXPECT_EQ(Install(), failure);
}

TEST_F(DeviceMenusDeathTest, CompilationSettingsThatAreNoNodeAreATrap) {
    Load(deviceSpecs);
    Load("<Target name=\"A\"><FPGACompilation>text</FPGACompilation></Target>");
    EXPECT_EXIT(Install(), qn::dsc::osdep::EndsByTrap, "");
}

TEST_F(DeviceMenus, RelativeFolderOfATargetThrows) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    SetTargetDir("A", u"relative\\folder");
    EXPECT_THROW(Install(), qn::dsc::exception::InvalidArgument);
}

TEST_F(DeviceMenus, FolderOfATargetThatIsNoTextThrows) {
    Load(deviceSpecs);
    Load(
        "<Target name=\"A\"><FPGACompilation><DeviceFamily>virtex5</DeviceFamily></FPGACompilation>"
        "<TargetDir name=\"TargetDir\"/></Target>");
    EXPECT_THROW(Install(), qn::dsc::exception::InvalidArgument);
}

TEST_F(DeviceMenus, MenuPathThatCannotBeFoldedThrows) {
    Load(deviceSpecs);
    root->Lookup(u"FpgaDeviceSpecs/Virtex5", nullptr)->SetProperty(u"XIPINMenusPath", u"menus\\...\\v5");
    AddTarget("A", "virtex5");
    EXPECT_THROW(Install(), qn::dsc::exception::InvalidArgument);
}

TEST_F(DeviceMenus, FailedCopyThrowsAndKeepsTheCopiesMadeSoFar) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    AddTarget("B", "virtex5");
    installation.Root().MakeFolder(Installation::Below("B/menu.txt"));
    EXPECT_THROW(Install(), qn::dsc::osdep::PosixError);
    EXPECT_EQ(In("A"), Names{"menu.txt"});
}

TEST_F(DeviceMenus, FullDiskThrows) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    ExecutableScope scope(installation, toolPath);
    scope.Files().Fail(FileCall::WriteBytes, 1, ENOSPC);
    EXPECT_THROW(InstallDeviceMenus(*root), qn::dsc::exception::FileWriteFailed);
    EXPECT_EQ(scope.Files().OpenFiles(), 0);
}

TEST_F(DeviceMenus, OldMenuThatCannotBeOverwrittenThrows) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    installation.Root().WriteFile(Installation::Below("A/menu.txt"), "an old menu");
    ExecutableScope scope(installation, toolPath);
    scope.Files().Fail(FileCall::CutFile, 1, EIO);
    EXPECT_THROW(InstallDeviceMenus(*root), qn::dsc::exception::FileWriteFailed);
    EXPECT_EQ(scope.Files().OpenFiles(), 0);
}

TEST_F(DeviceMenus, UnreadableMenuThrows) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    ExecutableScope scope(installation, toolPath);
    scope.Files().Fail(FileCall::ReadBytes, 1, EIO);
    EXPECT_THROW(InstallDeviceMenus(*root), qn::dsc::exception::FileReadFailed);
}

TEST_F(DeviceMenus, FolderThatCannotBeMadeThrows) {
    Load(deviceSpecs);
    AddTarget("A", "virtex5");
    SetTargetDir("A", installation.System(u"new"));
    ExecutableScope scope(installation, toolPath);
    scope.Files().Fail(FileCall::MakeFolder, 1, EACCES);
    EXPECT_THROW(InstallDeviceMenus(*root), qn::dsc::exception::AccessDenied);
}

}  // namespace
}  // namespace zkhw
