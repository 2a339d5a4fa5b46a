// The blocks of docs/host-guide.md. The word behind a fence's language says what a block is:
//
//   program=NAME      a whole program: built against the installation with warnings as errors, and run in the example
//                     installation. With "unlinked" it is built without the library and gets its path as argument.
//   output=NAME       what that program prints
//   excerpt=FILE      stands letter by letter in that file of the sources

#include <map>
#include <ostream>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "install/ExampleHost.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::ProgramResult;
using qn::dsc::osdep::RunProgram;
using qn::dsc::osdep::TemporaryFolder;

constexpr const char* library = INSTALL_PREFIX "/" INSTALL_LIBDIR "/libzkfpgarestree.so.1";

std::vector<std::string> Words(const std::string& text) {
    std::istringstream stream(text);
    std::vector<std::string> words;
    for (std::string word; stream >> word;) {
        words.push_back(word);
    }
    return words;
}

struct Block {
    size_t line = 0;  // Of its opening fence in the page.
    std::string language;
    std::string kind;  // "program", "output" or "excerpt"; otherwise what stands there.
    std::string name;
    bool isLinked = true;
    std::string content;
};

void PrintTo(const Block& block, std::ostream* stream) {
    *stream << block.name << ", line " << block.line;
}

Block OpenBlock(const std::string& fence, size_t line) {
    Block block;
    block.line = line;
    const std::vector<std::string> words = Words(fence.substr(3));
    if (words.size() >= 2) {
        const size_t equals = words[1].find('=');
        block.language = words[0];
        block.kind = words[1].substr(0, equals);
        block.name = equals == std::string::npos ? "" : words[1].substr(equals + 1);
        block.isLinked = words.size() < 3 || words[2] != "unlinked";
    }
    return block;
}

std::vector<Block> ReadPage() {
    std::istringstream page(ReadText(ZKFPGA_SOURCE_DIR "/docs/host-guide.md"));
    std::vector<Block> blocks;
    bool isInside = false;
    size_t number = 0;
    for (std::string line; std::getline(page, line);) {
        ++number;
        if (line.rfind("```", 0) == 0) {
            isInside = !isInside;
            if (isInside) {
                blocks.push_back(OpenBlock(line, number));
            }
        } else if (isInside) {
            blocks.back().content += line + "\n";
        }
    }
    return blocks;
}

std::vector<Block> BlocksOfKind(const std::string& kind) {
    std::vector<Block> chosen;
    for (const Block& block : ReadPage()) {
        if (block.kind == kind) {
            chosen.push_back(block);
        }
    }
    return chosen;
}

// The program at `program`, built from the block; the result is that of the compiler.
ProgramResult Build(const Block& block, const TemporaryFolder& folder, const std::string& program) {
    const bool isC = block.language == "c";
    const std::string source = block.name + (isC ? ".c" : ".cpp");
    folder.WriteFile(source, block.content);
    std::vector<std::string> arguments = Words(isC ? "-std=c99 " HOST_C_OPTIONS : "-std=c++20 " HOST_CXX_OPTIONS);
    arguments.insert(arguments.end(), {"-I" INSTALL_PREFIX "/include", source, "-o", program});
    if (block.isLinked) {
        arguments.insert(arguments.end(), {library, "-Wl,-rpath," INSTALL_PREFIX "/" INSTALL_LIBDIR});
    }
    return RunProgram(isC ? HOST_C_COMPILER : HOST_CXX_COMPILER, arguments, folder.Native());
}

class HostGuideProgram : public testing::TestWithParam<Block> {};

// Compiler and leak checker are programs of Linux.
TEST_P(HostGuideProgram, PrintsWhatThePageShowsWithoutALeakAsOnlyLinuxRunsThem) {
    const Block& block = GetParam();
    const TemporaryFolder folder;
    const std::string program = folder.Native(block.name);
    const ProgramResult built = Build(block, folder, program);
    ASSERT_EQ(built.end + built.errors, "exit 0");

    std::map<std::string, std::string> outputs;
    for (const Block& output : BlocksOfKind("output")) {
        outputs[output.name] = output.content;
    }
    const ExampleHost host(program);
    const std::vector<std::string> arguments =
        block.isLinked ? std::vector<std::string>() : std::vector{std::string(library)};
    ExpectSuccess(host.Run(arguments), outputs[block.name]);
    ExpectSuccess(host.RunForLeaks(arguments), outputs[block.name]);
}

INSTANTIATE_TEST_SUITE_P(Page, HostGuideProgram, testing::ValuesIn(BlocksOfKind("program")),
                         [](const auto& block) { return block.param.name; });

TEST(HostGuide, HasOnlyBlocksThatAreChecked) {
    std::map<std::string, size_t> counts;
    for (const Block& block : ReadPage()) {
        ++counts[block.kind];
        EXPECT_TRUE(block.kind == "program" || block.kind == "output" || block.kind == "excerpt")
            << "line " << block.line;
    }
    EXPECT_EQ(counts["program"], counts["output"]);
    EXPECT_GE(counts["program"], 3U);
}

TEST(HostGuide, QuotesItsFilesLetterByLetter) {
    for (const Block& block : BlocksOfKind("excerpt")) {
        const std::string file = ReadText(ZKFPGA_SOURCE_DIR "/" + block.name);
        EXPECT_NE(file.find(block.content), std::string::npos) << "line " << block.line << " and " << block.name;
    }
}

}  // namespace
}  // namespace zkhw
