// What an installation consists of.

#include <algorithm>
#include <filesystem>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "install/ExampleHost.h"

namespace zkhw {
namespace {

TEST(InstalledFiles, AreTheToolTheLibraryItsHeadersItsPackagesAndTheGuide) {
    const std::string library = INSTALL_LIBDIR;
    std::vector<std::string> expected = {
        "bin/zkfpga_make_resource_cache",
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
        library + "/libzkfpgarestree.so",
        library + "/libzkfpgarestree.so.1",
        library + "/libzkfpgarestree.so.1.0.0",
        library + "/pkgconfig/zkfpga.pc",
        "share/doc/zkfpga/examples/browse/CMakeLists.txt",
        "share/doc/zkfpga/examples/browse/browse.c",
        "share/doc/zkfpga/examples/browse/runtime.c",
        "share/doc/zkfpga/examples/browse/runtime.h",
        "share/doc/zkfpga/examples/reserve/CMakeLists.txt",
        "share/doc/zkfpga/examples/reserve/reserve.cpp",
        "share/doc/zkfpga/host-guide.md",
        "share/man/man1/zkfpga_make_resource_cache.1",
    };
    std::sort(expected.begin(), expected.end());

    std::vector<std::string> found;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(INSTALL_PREFIX)) {
        if (!entry.is_directory()) {
            found.push_back(entry.path().lexically_relative(INSTALL_PREFIX).string());
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

}  // namespace
}  // namespace zkhw
