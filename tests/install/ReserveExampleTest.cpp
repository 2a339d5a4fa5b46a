// examples/host/reserve, built against an installation in both ways: the interfaces, without a host's run-time.

#include <filesystem>
#include <string>

#include <gtest/gtest.h>

#include "install/ExampleHost.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::ProgramResult;

// The parameter is the way in which the program was built.
class BuiltReserveExample : public testing::TestWithParam<const char*> {
  protected:
    BuiltReserveExample() : host(std::string(HOST_PROGRAMS "/") + GetParam() + "/reserve/reserve" PROGRAM_SUFFIX) {}

    ExampleHost host;
};

INSTANTIATE_TEST_SUITE_P(Examples, BuiltReserveExample, testing::Values("cmake", "pkg-config"),
                         [](const auto& way) { return std::string(way.param) == "cmake" ? "ByCMake" : "ByPkgConfig"; });

TEST_P(BuiltReserveExample, PrintsTheReviewedTextWhereItHasToScan) {
    ExpectSuccess(host.Run({}), ExpectedText("reserve_scanned.txt"));
}

TEST_P(BuiltReserveExample, PrintsTheReviewedTextWhereTheCacheIsFresh) {
    host.Run({});
    ExpectSuccess(host.Run({}), ExpectedText("reserve_cached.txt"));
}

TEST_P(BuiltReserveExample, ReadsNoOtherBoard) {
    host.Run({});
    const std::string board = "Targets/QN/FPGA/LX9MicroBoard/LX9MicroBoard_resource.xml";
    const std::string parts = "Targets/QN/FPGA/BoardParts_resource.xml";
    const std::string families = "Targets/QN/FPGA/FpgaDeviceSpecs_resource.xml";
    const std::string boardText = host.Folder().ReadFile(board);
    const std::string partsText = host.Folder().ReadFile(parts);
    const std::string familiesText = host.Folder().ReadFile(families);
    host.ReplaceAllDescriptions("<Broken");
    // The board takes prototypes from the other two.
    host.ReplaceDescription(board, boardText);
    host.ReplaceDescription(parts, partsText);
    host.ReplaceDescription(families, familiesText);
    ExpectSuccess(host.Run({}), ExpectedText("reserve_cached.txt"));
}

TEST_P(BuiltReserveExample, ReportsThatThereIsNoTree) {
    std::filesystem::remove_all(host.Folder().Native("Targets"));
    const ProgramResult result = host.Run({});
    EXPECT_EQ(result.end, "exit 1");
    EXPECT_EQ(result.errors, "reserve: no tree: 0x80004005\n");
    EXPECT_EQ(result.output, "");
}

// The checker is one of Linux.
TEST(ReserveExample, LeaksNothingAsOnlyLinuxHasTheChecker) {
    const ExampleHost host(HOST_PROGRAMS "/cmake/reserve/reserve");
    ExpectSuccess(host.RunForLeaks({}), ExpectedText("reserve_scanned.txt"));
    ExpectSuccess(host.RunForLeaks({}), ExpectedText("reserve_cached.txt"));
}

}  // namespace
}  // namespace zkhw
