// examples/host/browse, built against an installation in both ways: a host's run-time and the exported functions.

#include <string>

#include <gtest/gtest.h>

#include "install/ExampleHost.h"
#include "support/EnvironmentScope.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::EnvironmentScope;
using qn::dsc::osdep::ProgramResult;

constexpr const char* cache = "Targets/QN/FPGA/resource_cache.xml";
constexpr const char* mojo = "Targets/QN/FPGA/MojoV3/MojoV3_resource.xml";
constexpr const char* brokenDescription = "<Target name=\"Mojo V3\"><DeviceCategory>Broken";

// The parameter is the way in which the program was built.
class BuiltBrowseExample : public testing::TestWithParam<const char*> {
  protected:
    BuiltBrowseExample() : host(std::string(HOST_PROGRAMS "/") + GetParam() + "/browse/browse" PROGRAM_SUFFIX) {}

    ExampleHost host;
};

INSTANTIATE_TEST_SUITE_P(Examples, BuiltBrowseExample, testing::Values("cmake", "pkg-config"),
                         [](const auto& way) { return std::string(way.param) == "cmake" ? "ByCMake" : "ByPkgConfig"; });

TEST_P(BuiltBrowseExample, ListsTheTargetsAndWritesTheCacheAtTheFirstRun) {
    ASSERT_FALSE(host.Folder().Exists(cache));
    ExpectSuccess(host.Run({"-"}), ExpectedText("browse_targets.txt"));
    EXPECT_TRUE(host.Folder().Exists(cache));
}

TEST_P(BuiltBrowseExample, ListsTheSameTargetsFromTheCacheAndLeavesItAsItIs) {
    host.Run({"-"});
    const std::string written = host.Folder().ReadFile(cache);
    host.Folder().SetFileTime(cache, 4102444800, 0);
    ExpectSuccess(host.Run({"-"}), ExpectedText("browse_targets.txt"));
    EXPECT_EQ(host.Folder().ReadFile(cache), written);
}

TEST_P(BuiltBrowseExample, AnswersFromAFreshCacheWithoutADescription) {
    host.Run({"-"});
    host.ReplaceAllDescriptions(brokenDescription);
    ExpectSuccess(host.Run({"-"}), ExpectedText("browse_targets.txt"));
    ExpectSuccess(host.Run({"-", "Mojo V3", "DeviceCategory"}),
                  "DeviceCategory = Spartan-6 Boards\n"
                  "  16 bytes, 16 units of UTF-16, the same on the way back\n");
}

TEST_P(BuiltBrowseExample, ReadsADescriptionAtTheFirstLookThatTheCacheCannotAnswer) {
    host.Run({"-"});
    host.ReplaceAllDescriptions(brokenDescription);
    host.ReplaceDescription(mojo,
                            "<Target name=\"Mojo V3\"><DeviceCategory>Other</DeviceCategory>"
                            "<Bench><Place>Room 5</Place></Bench></Target>");
    ExpectSuccess(host.Run({"-", "Mojo V3", "Bench/Place"}),
                  "Bench/Place = Room 5\n"
                  "  6 bytes, 6 units of UTF-16, the same on the way back\n"
                  "Bench:\n"
                  "<Bench>\n"
                  "   <Place>Room 5</Place>\n"
                  "</Bench>\n");
    // The cache goes on answering what it holds.
    ExpectSuccess(host.Run({"-", "Mojo V3", "DeviceCategory"}),
                  "DeviceCategory = Spartan-6 Boards\n"
                  "  16 bytes, 16 units of UTF-16, the same on the way back\n");
}

TEST_P(BuiltBrowseExample, ReadsAllAnewWhereADescriptionIsNewerThanTheCache) {
    host.Run({"-"});
    host.Folder().SetFileTime(cache, 946684800, 0);
    host.Folder().WriteFile(mojo, "<Target name=\"Mojo V3\"><DeviceCategory>Other</DeviceCategory></Target>");
    const ProgramResult result = host.Run({"-"});
    EXPECT_EQ(result.end, "exit 0");
    EXPECT_NE(result.output.find("  Mojo V3          Other\n"), std::string::npos) << result.output;
    EXPECT_NE(host.Folder().ReadFile(cache).find("<DeviceCategory>Other</DeviceCategory>"), std::string::npos);
}

TEST_P(BuiltBrowseExample, ShowsATargetThatWasScanned) {
    ExpectSuccess(host.Run({"-", "Mojo V3"}), ExpectedText("browse_target_scanned.txt"));
}

TEST_P(BuiltBrowseExample, ShowsATargetThatGrewFromTheCache) {
    host.Run({"-"});
    ExpectSuccess(host.Run({"-", "Mojo V3"}), ExpectedText("browse_target_cached.txt"));
}

TEST_P(BuiltBrowseExample, ShowsAPropertyAndItsNode) {
    const std::string expected = ExpectedText("browse_property.txt");
    ExpectSuccess(host.Run({"-", "Mojo V3", "IO/clk50/DisplayName"}), expected);
    ExpectSuccess(host.Run({"-", "Mojo V3", "IO/clk50/DisplayName"}), expected);
}

TEST_P(BuiltBrowseExample, SpeaksTheLanguageOfItsRunTime) {
    const EnvironmentScope language("BROWSE_LANGUAGE", "japanese");
    const ProgramResult result = host.Run({"-", "Mojo V3", "IO/clk50/DisplayName"});
    ExpectSuccess(result, ExpectedText("browse_property_japanese.txt"));
}

TEST_P(BuiltBrowseExample, FindsTheTargetsOfTheFolderThatItIsGiven) {
    ExpectSuccess(host.Run({host.Root()}), ExpectedText("browse_targets.txt"));
}

TEST_P(BuiltBrowseExample, ReportsWhatItCannotDo) {
    const ProgramResult noTree = host.Run({host.Root() + "/Nowhere"});
    EXPECT_EQ(noTree.end, "exit 1");
    EXPECT_EQ(noTree.errors, "browse: the tree can't be built: 0x80004005\n");
    const ProgramResult noTarget = host.Run({"-", "No Board"});
    EXPECT_EQ(noTarget.end, "exit 1");
    EXPECT_EQ(noTarget.errors, "browse: there is no target No Board\n");
    const ProgramResult noProperty = host.Run({"-", "Mojo V3", "IO/Colour"});
    EXPECT_EQ(noProperty.end, "exit 1");
    EXPECT_EQ(noProperty.errors, "browse: Mojo V3 has no property IO/Colour\n");
    const ProgramResult noArgument = host.Run({});
    EXPECT_EQ(noArgument.end, "exit 2");
    EXPECT_EQ(noArgument.errors, "usage: browse FOLDER [TARGET [PROPERTY]]\n");
    for (const ProgramResult* result : {&noTree, &noTarget, &noProperty, &noArgument}) {
        EXPECT_EQ(result->output, "");
    }
}

// The checker is one of Linux.
TEST(BrowseExample, LeaksNothingAsOnlyLinuxHasTheChecker) {
    const ExampleHost host(HOST_PROGRAMS "/cmake/browse/browse");
    host.Run({"-"});
    ExpectSuccess(host.RunForLeaks({"-"}), ExpectedText("browse_targets.txt"));
    ExpectSuccess(host.RunForLeaks({"-", "Mojo V3"}), ExpectedText("browse_target_cached.txt"));
    ExpectSuccess(host.RunForLeaks({"-", "Mojo V3", "IO/clk50/DisplayName"}), ExpectedText("browse_property.txt"));
}

}  // namespace
}  // namespace zkhw
