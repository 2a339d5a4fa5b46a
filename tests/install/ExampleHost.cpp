#include "install/ExampleHost.h"

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string_view>

#include <gtest/gtest.h>

namespace zkhw {

using qn::dsc::osdep::ProgramResult;
using qn::dsc::osdep::RunProgram;

namespace {

constexpr int64_t longPast = 946684800;  // The first second of 2000.

void ReplaceAll(std::string& text, const std::string& from, const std::string& to) {
    for (size_t at = text.find(from); at != std::string::npos; at = text.find(from, at + to.size())) {
        text.replace(at, from.size(), to);
    }
}

std::string SystemForm(const qn::dsc::osdep::TemporaryFolder& folder) {
    return qn::dsc::NarrowString(folder.System()).CStr();
}

}  // namespace

std::string ReadText(const std::string& path) {
    std::ifstream stream(path, std::ios::binary);
    EXPECT_TRUE(stream.is_open()) << path;
    return {std::istreambuf_iterator<char>(stream), std::istreambuf_iterator<char>()};
}

std::string ExpectedText(const std::string& name) {
    return ReadText(ZKFPGA_SOURCE_DIR "/tests/data/host/" + name);
}

ExampleHost::ExampleHost(const std::string& program) {
    std::filesystem::copy(ZKFPGA_SOURCE_DIR "/examples/installation", folder.Native(),
                          std::filesystem::copy_options::recursive);
    const std::string name = std::filesystem::path(program).filename().string();
    std::filesystem::copy_file(program, folder.Native(name));
    host = Root() + HOST_SEPARATOR + name;
    const std::filesystem::path library = LIBRARY_BESIDE_HOST;
    if (!library.empty()) {
        std::filesystem::copy_file(library, folder.Native(library.filename().string()));
    }
}

std::string ExampleHost::Root() const {
    return std::string(HOST_SEPARATOR) == "/" ? folder.Native() : SystemForm(folder);
}

ProgramResult ExampleHost::Run(const std::vector<std::string>& arguments) const {
    return RunHere(host, arguments);
}

ProgramResult ExampleHost::RunForLeaks(const std::vector<std::string>& arguments) const {
    const std::string checker = HOST_LEAK_CHECKER;
    if (checker.empty()) {
        return Run(arguments);
    }
    std::vector<std::string> all = {"--quiet", "--leak-check=full", "--error-exitcode=99", host};
    all.insert(all.end(), arguments.begin(), arguments.end());
    return RunHere(checker, all);
}

ProgramResult ExampleHost::RunHere(const std::string& program, const std::vector<std::string>& arguments) const {
    ProgramResult result = RunProgram(program, arguments, "/");
    for (std::string* text : {&result.output, &result.errors}) {
        ReplaceAll(*text, SystemForm(folder), "{root}");
        ReplaceAll(*text, folder.Native(), "{root}");
    }
    return result;
}

void ExampleHost::ReplaceAllDescriptions(const std::string& content) const {
    constexpr std::string_view ending = "resource.xml";
    for (const std::string& path : folder.Tree()) {
        if (path.ends_with(ending)) {
            ReplaceDescription(path, content);
        }
    }
}

void ExampleHost::ReplaceDescription(const std::string& below, const std::string& content) const {
    folder.WriteFile(below, content);
    folder.SetFileTime(below, longPast, 0);
}

void ExpectSuccess(const ProgramResult& result, const std::string& output) {
    EXPECT_EQ(result.end, "exit 0");
    EXPECT_EQ(result.errors, "");
    EXPECT_EQ(result.output, output);
}

}  // namespace zkhw
