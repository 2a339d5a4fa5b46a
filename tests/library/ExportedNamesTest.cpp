#include <array>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <sstream>
#include <string>

#include <gtest/gtest.h>

namespace {

std::string OutputOf(const std::string& command) {
    std::FILE* const stream = popen(command.c_str(), "r");
    std::string output;
    std::array<char, 4096> block{};
    for (size_t got = 0; stream != nullptr && (got = std::fread(block.data(), 1, block.size(), stream)) > 0;) {
        output.append(block.data(), got);
    }
    EXPECT_TRUE(stream != nullptr && pclose(stream) == 0) << command;
    return output;
}

std::string ExportsOf(const char* file) {
    return OutputOf(std::string("LC_ALL=C '" ZKFPGA_NM "' -D --defined-only --format=just-symbols '") + file + "'");
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
    std::istringstream dynamic(OutputOf("LC_ALL=C '" ZKFPGA_READELF "' --dynamic '" ZKFPGA_LIBRARY "'"));
    std::string soname = "none";
    for (std::string line; std::getline(dynamic, line);) {
        if (line.find("(SONAME)") != std::string::npos) {
            soname = line.substr(line.find('['));
        }
    }
    EXPECT_EQ(soname, "[libzkfpgarestree.so.1]");
}

}  // namespace
