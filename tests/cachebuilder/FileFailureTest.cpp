// The whole tool with file operations failing. The outcomes stand in the table below; it was worked out from what each
// operation is for.

#include <gtest/gtest.h>

#include <cerrno>
#include <new>
#include <string>

#include "cachebuilder/SmallInstallation.h"
#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/OSException.h"
#include "support/ProcessEnd.h"

namespace zkhw {
namespace {

using qn::dsc::String;
using qn::dsc::osdep::FaultyFileSystem;
using qn::dsc::osdep::FileCall;

std::string OutcomeOf(SmallInstallation& installation, const char* argument = nullptr) {
    try {
        switch (const uint32_t result = installation.Run(argument)) {
            case 0:
                return "0";
            case 0x80004005:
                return "failure";
            default:
                return "result " + std::to_string(result);
        }
    } catch (const qn::dsc::osdep::WinError&) {
        return "WinError";
    } catch (const qn::dsc::osdep::PosixError&) {
        return "PosixError";
    } catch (const qn::dsc::exception::Exception& exception) {
        return exception.what();
    }
}

enum class CacheAfter { Unchanged, Empty, Whole, WithoutOne, WithoutMore, WithoutTargets, WithoutChildren, OtherPaths };

struct Row {
    const char* name;
    FileCall call;
    const char16_t* path;  // Below the root of the installation.
    std::string outcome;
    CacheAfter cache;
    bool menusCopied;
};

class ToolFileFailure : public testing::TestWithParam<Row> {};

bool HasTarget(const std::string& cache, const std::string& name) {
    return cache.find("<Target name=\"" + name + "\"") != std::string::npos;
}

TEST_P(ToolFileFailure, EndsAsTheTableSays) {
    const Row& row = GetParam();
    SmallInstallation installation;
    ASSERT_EQ(OutcomeOf(installation), "0");
    const std::string whole = installation.Cache();
    installation.RemoveOutput();
    installation.folder.WriteFile("Targets/QN/FPGA/resource_cache.xml", "old");

    installation.files.FailOnPath(row.call, installation.folder.System(row.path), EACCES);
    std::string outcome = OutcomeOf(installation);
    // The texts of some failures end in the path.
    if (outcome.rfind("Access denied: ", 0) == 0) {
        outcome = "Access denied";
    }
    EXPECT_EQ(outcome, row.outcome);
    const std::string cache = installation.Cache();
    switch (row.cache) {
        case CacheAfter::Unchanged:
            EXPECT_EQ(cache, "old");
            break;
        case CacheAfter::Empty:
            EXPECT_EQ(cache, "");
            break;
        case CacheAfter::Whole:
            EXPECT_EQ(cache, whole);
            break;
        case CacheAfter::WithoutOne:
            EXPECT_FALSE(HasTarget(cache, "One"));
            EXPECT_TRUE(HasTarget(cache, "Two"));
            break;
        case CacheAfter::WithoutMore:
            EXPECT_TRUE(HasTarget(cache, "One"));
            EXPECT_EQ(cache.find("more_resource.xml"), std::string::npos);
            break;
        case CacheAfter::WithoutTargets:
            EXPECT_EQ(cache.find("<Target"), std::string::npos);
            EXPECT_NE(cache.find("<FPGAHostSet>"), std::string::npos);
            break;
        case CacheAfter::WithoutChildren:
            EXPECT_EQ(cache,
                      "<?xml version=\"1.0\"?>\n<ProviderResourceTreeRoot name=\"\">\n</ProviderResourceTreeRoot>");
            break;
        case CacheAfter::OtherPaths:
            EXPECT_TRUE(HasTarget(cache, "One"));
            EXPECT_NE(cache, whole);
            break;
    }
    EXPECT_EQ(installation.folder.Exists("Targets/QN/FPGA/one/a.menu"), row.menusCopied);
    EXPECT_EQ(installation.files.OpenFiles(), 0);
    EXPECT_EQ(installation.files.OpenSearches(), 0);
    EXPECT_EQ(installation.files.OpenWalks(), 0);
}

const Row table[] = {
    // The directory isn't one, as it stands or below the working directory.
    {"AttributesOfTheDirectory", FileCall::ReadAttributes, u"Targets\\QN\\FPGA", "failure", CacheAfter::Unchanged,
     false},
    // The host isn't found beside the tool: the way up ends at the drive, and paths are told from there. Includes are
    // looked for there as well, and the missing one is reported on its target.
    {"AttributesOfTheHost", FileCall::ReadAttributes, u"Zarvik.exe", "0", CacheAfter::OtherPaths, true},
    // A folder that can't be looked at counts as a file.
    {"EntryOfATargetsFolder", FileCall::EnterFolder, u"Targets\\QN\\FPGA\\two", "0", CacheAfter::OtherPaths, true},
    // The guard against loops stands back; nothing else asks who a folder is.
    {"IdentityOfAFolder", FileCall::ReadIdentity, u"Targets\\QN\\FPGA\\one", "0", CacheAfter::Whole, true},
    // A listing that fails is empty.
    {"ListingOfMatches", FileCall::ListFolder, u"Targets\\QN\\FPGA\\more", "failure", CacheAfter::WithoutMore, false},
    {"ListingOfEverything", FileCall::ListFolder, u"Targets\\QN\\FPGA", "failure", CacheAfter::WithoutChildren, false},
    {"BeginningOfTheWalk", FileCall::BeginWalk, u"Targets\\QN\\FPGA", "failure", CacheAfter::WithoutChildren, false},
    // The files of the directory itself are found without its folders.
    {"EntryOfAllFolders", FileCall::EnterFolder, u"Targets\\QN\\FPGA\\*", "failure", CacheAfter::WithoutTargets, false},
    // A resource file that can't be opened is passed over without a trace.
    {"OpenOfATarget", FileCall::OpenText, u"Targets\\QN\\FPGA\\one\\one_resource.xml", "0", CacheAfter::WithoutOne,
     false},
    {"OpenOfAnInclude", FileCall::OpenText, u"Targets\\QN\\FPGA\\shared.xml", "0", CacheAfter::Whole, true},
    // The device pass wants all three families.
    {"OpenOfAFamily", FileCall::OpenText, u"Targets\\QN\\FPGA\\more\\more_resource.xml", "failure",
     CacheAfter::WithoutMore, false},
    // The cache can't be opened: the old one stays.
    {"OpenOfTheCache", FileCall::OpenText, u"Targets\\QN\\FPGA\\resource_cache.xml", "failure", CacheAfter::Unchanged,
     false},
    // The device pass: a menu folder that isn't there to be seen is no failure, anything later is one.
    {"AttributesOfTheMenus", FileCall::ReadAttributes, u"Menus\\V5\\", "0", CacheAfter::Whole, false},
    {"ListingOfTheMenus", FileCall::BeginSearch, u"Menus\\V5\\*", "0", CacheAfter::Whole, false},
    {"OpenOfAMenu", FileCall::OpenBinary, u"Menus\\V5\\a.menu", "PosixError", CacheAfter::Whole, false},
    {"OpenOfACopy", FileCall::OpenBinary, u"Targets\\QN\\FPGA\\one\\a.menu", "PosixError", CacheAfter::Whole, false},
    {"FolderOfACopy", FileCall::MakeFolder, u"Targets\\QN\\FPGA\\one\\deep", "Access denied", CacheAfter::Whole, true},
};

INSTANTIATE_TEST_SUITE_P(Table, ToolFileFailure, testing::ValuesIn(table),
                         [](const testing::TestParamInfo<Row>& row) { return row.param.name; });

TEST(ToolFileFailures, AFailedWriteLeavesAnEmptyCache) {
    SmallInstallation installation;
    installation.folder.WriteFile("Targets/QN/FPGA/resource_cache.xml", "old");
    installation.files.Fail(FileCall::WriteBytes, 1, ENOSPC);
    EXPECT_EQ(OutcomeOf(installation), "failure");
    EXPECT_EQ(installation.Cache(), "");
}

TEST(ToolFileFailures, ADiskThatFillsUpLeavesTheBeginningOfTheCache) {
    SmallInstallation installation;
    ASSERT_EQ(OutcomeOf(installation), "0");
    const std::string whole = installation.Cache();
    installation.files.LimitTransfer(100);
    installation.files.Fail(FileCall::WriteBytes, 3, ENOSPC);
    EXPECT_EQ(OutcomeOf(installation), "failure");
    EXPECT_EQ(installation.Cache(), whole.substr(0, 200));
}

TEST(ToolFileFailures, AFailureToCloseTheCacheIsIgnored) {
    SmallInstallation installation;
    ASSERT_EQ(OutcomeOf(installation), "0");
    const std::string whole = installation.Cache();
    const uint64_t closes = installation.files.Count(FileCall::CloseFile);
    for (uint64_t nth = 1; nth <= closes; ++nth) {
        installation.files.Fail(FileCall::CloseFile, nth, EIO);
        EXPECT_EQ(OutcomeOf(installation), "0") << "close " << nth;
        EXPECT_EQ(installation.Cache(), whole) << "close " << nth;
        installation.files.Clear();
        installation.files.SetExecutablePath(
            installation.folder.System(u"Targets\\QN\\FPGA\\Utilities\\zkfpga_make_resource_cache"));
    }
}

TEST(ToolFileFailures, AnUnknownExecutableIsASystemError) {
    SmallInstallation installation;
    installation.files.Fail(FileCall::ReadExecutablePath, 1, EACCES);
    EXPECT_EQ(OutcomeOf(installation), "WinError");
}

TEST(ToolFileFailures, AnUnreadableResourceFileLeavesTheTraceThatEndsTheDevicePass) {
    // The file ends early, so it isn't well formed, and the report about it on the root is no node.
    SmallInstallation installation;
    installation.files.Fail(FileCall::ReadBytes, 1, EIO);
    EXPECT_EXIT(OutcomeOf(installation), qn::dsc::osdep::EndsByTrap, "");
}

TEST(ToolFileFailures, NoSingleFailureEndsInAnythingElse) {
    SmallInstallation installation;
    ASSERT_EQ(OutcomeOf(installation), "0");
    const uint64_t total = installation.files.Count(FileCall::Any);
    const uint64_t readsBefore = installation.files.Count(FileCall::ReadBytes);
    ASSERT_GT(readsBefore, 0U);
    for (const FileCall call :
         {FileCall::ReadAttributes, FileCall::ReadIdentity, FileCall::BeginSearch, FileCall::NextName,
          FileCall::BeginWalk, FileCall::ListFolder, FileCall::EnterFolder, FileCall::MakeFolder, FileCall::OpenBinary,
          FileCall::OpenText, FileCall::WriteBytes, FileCall::CutFile, FileCall::CloseFile, FileCall::ReadWorkingFolder,
          FileCall::ReadExecutablePath}) {
        for (const int error : {EACCES, EIO, EMFILE, ENOENT, ENOMEM}) {
            for (uint64_t nth = 1; nth <= total; ++nth) {
                installation.RemoveOutput();
                const uint64_t before = installation.files.Count(call);
                installation.files.Fail(call, nth, error);
                const std::string outcome = OutcomeOf(installation);
                const bool wasReached = installation.files.Count(call) >= before + nth;
                installation.files.Clear();
                installation.files.SetExecutablePath(
                    installation.folder.System(u"Targets\\QN\\FPGA\\Utilities\\zkfpga_make_resource_cache"));
                if (!wasReached) {
                    EXPECT_EQ(outcome, "0");
                    break;
                }
                EXPECT_TRUE(outcome == "0" || outcome == "failure" || outcome == "WinError" ||
                            outcome == "PosixError" || outcome == "Write file operation failed" ||
                            outcome == "The object does not exist" || outcome.rfind("Access denied: ", 0) == 0 ||
                            outcome == "Object already exists")
                    << outcome;
                EXPECT_EQ(installation.files.OpenFiles(), 0);
                EXPECT_EQ(installation.files.OpenSearches(), 0);
                EXPECT_EQ(installation.files.OpenWalks(), 0);
            }
        }
    }
}

}  // namespace
}  // namespace zkhw
