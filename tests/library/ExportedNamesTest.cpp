#include <fstream>
#include <iterator>
#include <string>

#include <gtest/gtest.h>

#include "support/PrintedLines.h"

namespace {

using qn::dsc::osdep::PrintedLines;

std::string ExportsOf(const char* file) {
    std::string names;
    for (const std::string& name : PrintedLines(ZKFPGA_NM, {"-D", "--defined-only", "--format=just-symbols", file})) {
        names += name + "\n";
    }
    return names;
}

std::string ExportList() {
    std::ifstream file(EXPORT_LIST);
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

// The names, each on a line, in the order of their bytes. Nothing else may be there: a host lives with other libraries
// in one process, where a second symbol of the same name would take the place of ours, or ours of theirs.
TEST(ExportedNames, LibraryExportsTheListAndNothingElse) {
    EXPECT_EQ(ExportsOf(ZKFPGA_LIBRARY), ExportList());
}

TEST(ExportedNames, ToolExportsTheListAndNothingElse) {
    EXPECT_EQ(ExportsOf(ZKFPGA_TOOL), ExportList());
}

TEST(ExportedNames, ListHoldsEveryFunctionOfTheBoundary) {
    EXPECT_EQ(ExportList(),
              "CoTaskMemAlloc\nCoTaskMemFree\nCoTaskMemRealloc\nFPGAResTree_Dump\nFPGAResTree_GetDescendantNames\n"
              "FPGAResTree_GetMultipleProperties\nFPGAResTree_GetProperty\nFPGA_MbsToUtf8\nFPGA_Utf8ToMbs\n"
              "FPGA_mbstowcs\nFPGA_wcstombs\nQueryResourceTreeInterface\nSetZKRTModule\nSetZKRTModuleHook\n"
              "SetZKRTTLSIndex\nSetZKRTTLSIndexHook\nSysAllocString\nSysAllocStringLen\nSysFreeString\nSysStringLen\n"
              "ZkhwResTree_GetNode\ngFPGAResTree\n");
}

TEST(ExportedNames, LibraryIsKnownByItsMajorVersion) {
    std::string soname = "none";
    for (const std::string& line : PrintedLines(ZKFPGA_READELF, {"--dynamic", ZKFPGA_LIBRARY})) {
        if (line.find("(SONAME)") != std::string::npos) {
            soname = line.substr(line.find('['));
        }
    }
    EXPECT_EQ(soname, "[libzkfpgarestree.so.1]");
}

}  // namespace
