#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <climits>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>

#include <gtest/gtest.h>

#include "qn/dsc/osdep/NativePath.h"
#include "support/TemporaryFolder.h"

namespace qn::dsc::osdep {

namespace {

namespace fs = std::filesystem;

// Removes the names in the folder `parent` that can be removed at once. The name of a folder that must be emptied
// first, or the empty text if there is none left.
std::string RemoveUpToFolder(int parent) {
    const std::unique_ptr<DIR, int (*)(DIR*)> names(fdopendir(openat(parent, ".", O_RDONLY | O_DIRECTORY | O_CLOEXEC)),
                                                    &closedir);
    while (const dirent* entry = names == nullptr ? nullptr : readdir(names.get())) {
        const std::string name = entry->d_name;
        const bool isOther = name != "." && name != "..";
        if (isOther && unlinkat(parent, name.c_str(), 0) != 0 && unlinkat(parent, name.c_str(), AT_REMOVEDIR) != 0) {
            return name;
        }
    }
    return std::string();
}

// Empties a folder and takes it away. Goes down and up by single names: the paths may be longer than a call takes.
void RemoveTree(const std::string& path) {
    int folder = open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    ASSERT_GE(folder, 0) << path << ": " << std::strerror(errno);
    size_t depth = 0;
    bool isDone = false;
    while (!isDone) {
        const std::string name = RemoveUpToFolder(folder);
        isDone = name.empty() && depth == 0;
        if (!isDone) {
            const int next = openat(folder, name.empty() ? ".." : name.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
            ASSERT_GE(next, 0) << name << ": " << std::strerror(errno);
            close(folder);
            folder = next;
            depth = name.empty() ? depth - 1 : depth + 1;
        }
    }
    close(folder);
    EXPECT_EQ(rmdir(path.c_str()), 0) << path << ": " << std::strerror(errno);
}

}  // namespace

TemporaryFolder::TemporaryFolder() {
    std::string pattern = fs::canonical(fs::temp_directory_path()).string() + "/qn-test-XXXXXX";
    const char* made = mkdtemp(pattern.data());
    EXPECT_NE(made, nullptr) << pattern << ": " << std::strerror(errno);
    native = pattern;
}

TemporaryFolder::~TemporaryFolder() {
    RemoveTree(native);
}

String TemporaryFolder::System() const {
    return SystemPathFromNative(native);
}

String TemporaryFolder::System(const char16_t* below) const {
    return String::Concat({System().View(), u"\\", below});
}

void TemporaryFolder::MakeFolder(const std::string& below) const {
    std::error_code error;
    fs::create_directories(Native(below), error);
    EXPECT_FALSE(error) << below << ": " << error.message();
}

void TemporaryFolder::MakeNestedFolders(const std::string& name, uint32_t depth) const {
    int folder = open(native.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    for (uint32_t i = 0; i < depth; ++i) {
        ASSERT_EQ(mkdirat(folder, name.c_str(), 0777), 0) << i << ": " << std::strerror(errno);
        const int next = openat(folder, name.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
        close(folder);
        folder = next;
    }
    close(folder);
}

void TemporaryFolder::WriteFile(const std::string& below, const std::string& bytes) const {
    std::error_code error;
    fs::create_directories(fs::path(Native(below)).parent_path(), error);
    std::ofstream file(Native(below), std::ios::binary);
    file << bytes;
    file.close();
    EXPECT_TRUE(file.good()) << below;
}

std::string TemporaryFolder::ReadFile(const std::string& below) const {
    std::ifstream file(Native(below), std::ios::binary);
    EXPECT_TRUE(file.is_open()) << below;
    return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

std::string TemporaryFolder::ReadText(const std::string& below) const {
    return ReadFile(below);
}

void TemporaryFolder::MakeLink(const std::string& target, const std::string& below) const {
    EXPECT_EQ(symlink(target.c_str(), Native(below).c_str()), 0) << below << ": " << std::strerror(errno);
}

void TemporaryFolder::MakePipe(const std::string& below) const {
    EXPECT_EQ(mkfifo(Native(below).c_str(), 0600), 0) << below << ": " << std::strerror(errno);
}

// A link is enough: a program asks for the name under which it was started.
void TemporaryFolder::PlaceProgram(const std::string& program, const std::string& below) const {
    std::error_code error;
    fs::remove(Native(below), error);
    fs::create_hard_link(program, Native(below), error);
    EXPECT_TRUE(!error || fs::copy_file(program, Native(below), error)) << below << ": " << error.message();
}

void TemporaryFolder::Remove(const std::string& below) const {
    EXPECT_GT(fs::remove_all(Native(below)), 0u) << below;
}

void TemporaryFolder::SetFileTime(const std::string& below, int64_t seconds, int64_t nanoseconds) const {
    const timespec times[2] = {{seconds, nanoseconds}, {seconds, nanoseconds}};
    EXPECT_EQ(utimensat(AT_FDCWD, Native(below).c_str(), times, 0), 0) << below << ": " << std::strerror(errno);
}

bool TemporaryFolder::Exists(const std::string& below) const {
    struct stat status;
    return lstat(Native(below).c_str(), &status) == 0;
}

uint32_t TemporaryFolder::Permissions(const std::string& below) const {
    struct stat status {};
    EXPECT_EQ(stat(Native(below).c_str(), &status), 0) << below << ": " << std::strerror(errno);
    return status.st_mode & 07777;
}

std::vector<std::string> TemporaryFolder::Tree() const {
    std::vector<std::string> paths;
    for (const fs::directory_entry& entry : fs::recursive_directory_iterator(native)) {
        const std::string below = entry.path().string().substr(native.size() + 1);
        paths.push_back(entry.is_directory() && !entry.is_symlink() ? below + "/" : below);
    }
    std::sort(paths.begin(), paths.end());
    return paths;
}

WorkingFolderScope::WorkingFolderScope(const std::string& native)
    : before("/proc/self/fd/" + std::to_string(open(".", O_RDONLY | O_DIRECTORY | O_CLOEXEC))) {
    EXPECT_EQ(chdir(native.c_str()), 0) << native << ": " << std::strerror(errno);
}

WorkingFolderScope::~WorkingFolderScope() {
    EXPECT_EQ(chdir(before.c_str()), 0) << std::strerror(errno);
    close(std::stoi(before.substr(before.rfind('/') + 1)));
}

}  // namespace qn::dsc::osdep
