// What an installation consists of.

#include <algorithm>
#include <filesystem>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "install/ExampleHost.h"
#include "support/EnvironmentScope.h"
#include "support/RunProgram.h"
#include "support/TemporaryFolder.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::EnvironmentScope;
using qn::dsc::osdep::ProgramResult;
using qn::dsc::osdep::RunProgram;
using qn::dsc::osdep::TemporaryFolder;

TEST(InstalledFiles, AreTheToolTheLibraryItsHeadersItsPackagesAndTheGuide) {
    const std::string library = INSTALL_LIBDIR;
    std::vector<std::string> expected = {
        "bin/zkfpga_make_resource_cache" PROGRAM_SUFFIX,
        "include/zkfpga/exports.h",
        "include/zkfpga/host_data.h",
        "include/zkfpga/host_interfaces.h",
        "include/zkfpga/host_runtime.h",
        "include/zkfpga/ids.h",
        "include/zkfpga/memory.h",
        "include/zkfpga/tree_constants.h",
        "include/zkfpga/tree_node.h",
        "include/zkfpga/tree_owner.h",
        "include/zkfpga/tree_root.h",
        "include/zkfpga/types.h",
        "include/zkfpga/zkfpga.h",
        library + "/cmake/zkfpga/zkfpgaConfig.cmake",
        library + "/cmake/zkfpga/zkfpgaConfigVersion.cmake",
        library + "/cmake/zkfpga/zkfpgaTargets-" INSTALL_CONFIGURATION ".cmake",
        library + "/cmake/zkfpga/zkfpgaTargets.cmake",
        library + "/pkgconfig/zkfpga.pc",
        "share/doc/zkfpga/examples/browse/CMakeLists.txt",
        "share/doc/zkfpga/examples/browse/browse.c",
        "share/doc/zkfpga/examples/browse/browse.manifest",
        "share/doc/zkfpga/examples/browse/browse.rc",
        "share/doc/zkfpga/examples/browse/runtime.c",
        "share/doc/zkfpga/examples/browse/runtime.h",
        "share/doc/zkfpga/examples/reserve/CMakeLists.txt",
        "share/doc/zkfpga/examples/reserve/reserve.cpp",
        "share/doc/zkfpga/host-guide.md",
        "share/doc/zkfpga/platforms.md",
        "share/man/man1/zkfpga_make_resource_cache.1",
    };
    for (std::string_view files = LIBRARY_FILES; !files.empty();) {
        const size_t end = std::min(files.find(' '), files.size());
        expected.emplace_back(files.substr(0, end));
        files.remove_prefix(std::min(end + 1, files.size()));
    }
    std::sort(expected.begin(), expected.end());

    std::vector<std::string> found;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(INSTALL_PREFIX)) {
        if (!entry.is_directory()) {
            found.push_back(entry.path().lexically_relative(INSTALL_PREFIX).generic_string());
        }
    }
    std::sort(found.begin(), found.end());
    EXPECT_EQ(found, expected);
}

TEST(InstalledFiles, NameNoFolderOfTheBuild) {
    for (const char* package :
         {"/cmake/zkfpga/zkfpgaConfig.cmake", "/cmake/zkfpga/zkfpgaTargets.cmake",
          "/cmake/zkfpga/zkfpgaTargets-" INSTALL_CONFIGURATION ".cmake", "/pkgconfig/zkfpga.pc"}) {
        const std::string path = INSTALL_PREFIX "/" INSTALL_LIBDIR + std::string(package);
        EXPECT_EQ(ReadText(path).find(ZKFPGA_SOURCE_DIR), std::string::npos) << path;
        EXPECT_GT(ReadText(path).size(), 0U) << path;
    }
}

// The tool is a program of Linux; on Windows the examples are built by what it says.
TEST(InstalledFiles, AreFoundByPkgConfigWhereTheyWereMovedAsOnlyLinuxRunsIt) {
    const TemporaryFolder folder;
    std::filesystem::copy(INSTALL_PREFIX, folder.Native(), std::filesystem::copy_options::recursive);
    const EnvironmentScope place("PKG_CONFIG_PATH", folder.Native(INSTALL_LIBDIR "/pkgconfig"));
    for (const auto& [variable, file] :
         {std::pair("includedir", "zkfpga/zkfpga.h"), std::pair("libdir", "libzkfpgarestree.so"),
          std::pair("prefix", "bin/zkfpga_make_resource_cache")}) {
        ProgramResult result = RunProgram(HOST_PKG_CONFIG, {std::string("--variable=") + variable, "zkfpga"}, "/");
        ASSERT_EQ(result.end + result.errors, "exit 0");
        result.output.erase(result.output.find('\n'));
        EXPECT_EQ(result.output.find(folder.Native()), 0U) << result.output;
        EXPECT_TRUE(std::filesystem::exists(result.output + "/" + file)) << result.output;
    }
}

}  // namespace
}  // namespace zkhw
