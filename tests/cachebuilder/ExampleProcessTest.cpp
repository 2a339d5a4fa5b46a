// The tool as a user runs it on copies of the example installation.

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "support/ProcessEnd.h"
#include "support/RunProgram.h"
#include "support/TemporaryFolder.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::ProgramResult;
using qn::dsc::osdep::RunProgram;
using qn::dsc::osdep::TemporaryFolder;

const std::string working = "Targets/QN/FPGA";
const std::string cacheFile = working + "/resource_cache.xml";

std::string ReviewedCache() {
    std::ostringstream bytes;
    bytes << std::ifstream(ZKFPGA_SOURCE_DIR "/tests/data/example_resource_cache.xml", std::ios::binary).rdbuf();
    return bytes.str();
}

std::filesystem::path PathOf(const std::string& utf8) {
    return std::u8string(utf8.begin(), utf8.end());
}

// A copy of the example, with the tool in its usual place: a folder of its own in the working directory.
class ExampleCopy {
  public:
    explicit ExampleCopy(const std::string& below = "installation") : below(below) {
        folder.MakeFolder(below);
        std::filesystem::copy(ZKFPGA_SOURCE_DIR "/examples/installation", PathOf(Root()),
                              std::filesystem::copy_options::recursive);
        std::filesystem::create_directories(PathOf(ToolFolder()));
        std::filesystem::copy_file(ZKFPGA_TOOL, PathOf(ToolFolder() + "/zkfpga_make_resource_cache"));
    }

    std::string Root() const { return folder.Native(below); }
    // The path of what is below the root, in the system's form.
    std::string SystemPath(const std::string& path) const {
        std::string system = "\\" + below + "\\" + path;
        std::replace(system.begin(), system.end(), '/', '\\');
        return qn::dsc::NarrowString(folder.System()).CStr() + system;
    }
    std::string ToolFolder() const { return Root() + "/" + working + "/Utilities"; }

    ProgramResult Run(const std::vector<std::string>& arguments, const std::string& workingFolder) const {
        return RunProgram(ToolFolder() + "/zkfpga_make_resource_cache", arguments, workingFolder);
    }

    std::string Read(const std::string& path) const { return folder.ReadText(below + "/" + path); }
    std::vector<std::string> Tree() const { return folder.Tree(); }

  private:
    TemporaryFolder folder;
    std::string below;
};

void ExpectSuccess(const ProgramResult& result) {
    EXPECT_EQ(result.end, "exit 0");
    EXPECT_EQ(result.output, "");
    EXPECT_EQ(result.errors, "");
}

TEST(ExampleProcess, SucceedsAndLeavesTheReviewedCache) {
    const ExampleCopy copy;
    ExpectSuccess(copy.Run({}, "/"));
    EXPECT_EQ(copy.Read(cacheFile), ReviewedCache());
}

TEST(ExampleProcess, CopiesTheMenusOfTheFamilyIntoABoardsFolder) {
    const ExampleCopy copy;
    ExpectSuccess(copy.Run({}, "/"));
    const std::string menus = working + "/Menus/Virtex6/";
    for (const char* file : {"Blocks.menu", "Memory/Memory.menu", "Transceivers/Transceivers.menu"}) {
        EXPECT_EQ(copy.Read(working + "/ML605/" + file), copy.Read(menus + file)) << file;
    }
    for (const std::string& path : copy.Tree()) {
        // The family of this board has no menus.
        EXPECT_EQ(path.find("KC705/Blocks.menu"), std::string::npos) << path;
    }
}

TEST(ExampleProcess, SecondRunGivesTheSame) {
    const ExampleCopy copy;
    ExpectSuccess(copy.Run({}, "/"));
    const std::vector<std::string> tree = copy.Tree();
    ExpectSuccess(copy.Run({}, "/"));
    EXPECT_EQ(copy.Tree(), tree);
    EXPECT_EQ(copy.Read(cacheFile), ReviewedCache());
}

TEST(ExampleProcess, RunsInDifferentFoldersGiveTheSameCache) {
    const ExampleCopy one("one");
    const ExampleCopy other("an other place/of-longer-name/with \xC3\xA4");
    ExpectSuccess(one.Run({}, "/"));
    ExpectSuccess(other.Run({}, "/"));
    EXPECT_EQ(one.Read(cacheFile), ReviewedCache());
    EXPECT_EQ(other.Read(cacheFile), one.Read(cacheFile));
}

void ExpectTheCacheForEach(const ExampleCopy& copy, const std::vector<std::string>& arguments) {
    for (const std::string& argument : arguments) {
        std::filesystem::remove(PathOf(copy.Root() + "/" + cacheFile));
        ExpectSuccess(copy.Run({argument}, copy.Root()));
        EXPECT_EQ(copy.Read(cacheFile), ReviewedCache()) << argument;
    }
}

TEST(ExampleProcess, ArgumentMayBeAbsoluteOrRelativeInTheSystemsForm) {
    const ExampleCopy copy;
    ExpectTheCacheForEach(copy, {"Targets\\QN\\FPGA", copy.SystemPath(working), copy.SystemPath(working) + "\\"});
}

// On Windows paths are in the system's form from the outset.
TEST(ExampleProcess, ArgumentMayBeANativePathAsOnlyLinuxHasNativePaths) {
    const ExampleCopy copy;
    ExpectTheCacheForEach(copy, {copy.Root() + "/" + working, working});
}

TEST(ExampleProcess, FolderThatIsNotThereFailsAndLeavesNothing) {
    const ExampleCopy copy;
    const std::vector<std::string> before = copy.Tree();
    EXPECT_EQ(copy.Run({copy.Root() + "/missing"}, "/").end, qn::dsc::osdep::EndWithResult(0x80004005));
    EXPECT_EQ(copy.Tree(), before);
}

}  // namespace
}  // namespace zkhw
