// What ships is hard to exploit: the tool and the library, as the linker made them.

#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "support/PrintedLines.h"

namespace {

std::vector<std::string> ReadElf(const std::string& option, const std::string& file) {
    return qn::dsc::osdep::PrintedLines(ZKFPGA_READELF, {"--wide", option, file});
}

// The first line that holds `text`; empty if there is none.
std::string LineWith(const std::string& text, const std::vector<std::string>& lines) {
    for (const std::string& line : lines) {
        if (line.find(text) != std::string::npos) {
            return line;
        }
    }
    return {};
}

bool Holds(const std::string& line, const std::string& text) {
    return line.find(text) != std::string::npos;
}

// The parameter is the path of the file.
class ShippedFile : public testing::TestWithParam<const char*> {};

INSTANTIATE_TEST_SUITE_P(Files, ShippedFile, testing::Values(ZKFPGA_TOOL, SHIPPED_LIBRARY),
                         [](const auto& file) { return std::string(file.param) == ZKFPGA_TOOL ? "Tool" : "Library"; });

TEST_P(ShippedFile, IsLoadedAtAnyAddress) {
    EXPECT_TRUE(Holds(LineWith("Type:", ReadElf("--file-header", GetParam())), "DYN"));
}

TEST_P(ShippedFile, FindsAllAddressesAtItsStart) {
    EXPECT_TRUE(Holds(LineWith("(FLAGS_1)", ReadElf("--dynamic", GetParam())), "NOW"));
}

TEST_P(ShippedFile, KeepsTheAddressesThatItFound) {
    EXPECT_NE(LineWith("GNU_RELRO", ReadElf("--program-headers", GetParam())), "");
}

TEST_P(ShippedFile, HasNoCodeOnTheStack) {
    const std::string stack = LineWith("GNU_STACK", ReadElf("--program-headers", GetParam()));
    EXPECT_TRUE(Holds(stack, " RW ")) << stack;
}

TEST_P(ShippedFile, HasNoCodeThatCanBeWritten) {
    for (const std::string& line : ReadElf("--program-headers", GetParam())) {
        EXPECT_FALSE(Holds(line, "LOAD") && Holds(line, "RWE")) << line;
    }
}

TEST_P(ShippedFile, NoticesOverrunsOfTheStack) {
    EXPECT_NE(LineWith("UND __stack_chk_fail@", ReadElf("--dyn-syms", GetParam())), "");
}

TEST_P(ShippedFile, CallsTheCheckedFormsOfLibraryFunctions) {
    EXPECT_NE(LineWith("_chk@", ReadElf("--dyn-syms", GetParam())), "");
}

TEST_P(ShippedFile, LooksForLibrariesWhereTheSystemDoes) {
    const std::vector<std::string> dynamic = ReadElf("--dynamic", GetParam());
    EXPECT_EQ(LineWith("(RPATH)", dynamic), "");
    EXPECT_EQ(LineWith("(RUNPATH)", dynamic), "");
}

TEST(ShippedTool, IsAPositionIndependentExecutable) {
    EXPECT_TRUE(Holds(LineWith("(FLAGS_1)", ReadElf("--dynamic", ZKFPGA_TOOL)), "PIE"));
}

}  // namespace
