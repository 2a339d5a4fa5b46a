#include <windows.h>

#include <algorithm>
#include <cstddef>
#include <iterator>
#include <memory>
#include <utility>

#include <gtest/gtest.h>

#include "support/NativeProgram_windows.h"
#include "support/TemporaryFolder.h"

namespace qn::dsc::osdep {

namespace {

// As the system takes paths without a limit to their length; `path` is absolute, with slashes.
std::u16string CallPath(const std::string& path) {
    std::u16string text = u"\\\\?\\" + Widened(path);
    std::replace(text.begin(), text.end(), u'/', u'\\');
    return text;
}

class OpenHandle {
  public:
    OpenHandle(const std::string& path, DWORD access, DWORD disposition)
        : handle(CreateFileW(CallPath(path).c_str(), access, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                             nullptr, disposition, FILE_FLAG_BACKUP_SEMANTICS, nullptr)) {
        EXPECT_NE(handle, INVALID_HANDLE_VALUE) << path << ": " << GetLastError();
    }
    ~OpenHandle() { CloseHandle(handle); }
    OpenHandle(const OpenHandle&) = delete;
    OpenHandle& operator=(const OpenHandle&) = delete;

    HANDLE Get() const { return handle; }

  private:
    HANDLE handle;
};

struct Found {
    std::string name;
    DWORD attributes;
};

std::vector<Found> ListFolder(const std::string& path) {
    std::vector<Found> names;
    WIN32_FIND_DATAW data;
    const HANDLE search = FindFirstFileW((CallPath(path) + u"\\*").c_str(), &data);
    if (search == INVALID_HANDLE_VALUE) {
        return names;
    }
    do {
        const std::u16string name = data.cFileName;
        if (name != u"." && name != u"..") {
            names.push_back({Narrowed(name), data.dwFileAttributes});
        }
    } while (FindNextFileW(search, &data) != 0);
    FindClose(search);
    return names;
}

bool IsThere(const std::string& path) {
    // The name in its folder, so that a link that leads nowhere is there too.
    WIN32_FIND_DATAW data;
    const HANDLE search = FindFirstFileW(CallPath(path).c_str(), &data);
    FindClose(search);
    return search != INVALID_HANDLE_VALUE;
}

// Whether, before long, `path` is there or isn't.
bool Becomes(const std::string& path, bool there) {
    for (int i = 0; i < 100; ++i) {
        if (IsThere(path) == there) {
            return true;
        }
        Sleep(5);
    }
    return false;
}

bool IsRealFolder(const Found& found) {
    return (found.attributes & FILE_ATTRIBUTE_DIRECTORY) != 0 && (found.attributes & FILE_ATTRIBUTE_REPARSE_POINT) == 0;
}

bool IsLink(const Found& found) {
    return (found.attributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0;
}

// What Wine can't remove: links and pipes, and folders that hold such.
void RemoveOutsideWine(const std::string& path) {
    EXPECT_TRUE(StartOutsideWine("/bin/rm", {"-rf", PathOutsideWine(path)}));
    EXPECT_TRUE(Becomes(path, false)) << path;
}

void RemoveFile(const std::string& path) {
    SetFileAttributesW(CallPath(path).c_str(), FILE_ATTRIBUTE_NORMAL);
    if (DeleteFileW(CallPath(path).c_str()) == 0) {
        RemoveOutsideWine(path);
    }
}

// Without recursion: `folders` are still to be removed, each behind those that hold it.
void RemoveTree(const std::string& path) {
    std::vector<std::pair<std::string, bool>> folders{{path, false}};
    while (!folders.empty()) {
        const std::string folder = folders.back().first;
        if (std::exchange(folders.back().second, true)) {
            // What is left in it then are links that Wine doesn't show.
            if (RemoveDirectoryW(CallPath(folder).c_str()) == 0) {
                RemoveOutsideWine(folder);
            }
            folders.pop_back();
            continue;
        }
        for (const Found& found : ListFolder(folder)) {
            const std::string below = folder + "/" + found.name;
            if (IsRealFolder(found)) {
                folders.emplace_back(below, false);
            } else if (IsLink(found)) {
                RemoveOutsideWine(below);
            } else {
                RemoveFile(below);
            }
        }
    }
}

}  // namespace

TemporaryFolder::TemporaryFolder() {
    char16_t temporary[MAX_PATH + 1];
    GetTempPathW(MAX_PATH + 1, temporary);
    std::string base = Narrowed(temporary);
    std::replace(base.begin(), base.end(), '\\', '/');
    static unsigned int made = 0;
    do {
        native = base + "qn-test-" + std::to_string(GetCurrentProcessId()) + "-" + std::to_string(made++);
    } while (CreateDirectoryW(CallPath(native).c_str(), nullptr) == 0 && GetLastError() == ERROR_ALREADY_EXISTS);
    EXPECT_TRUE(IsThere(native)) << native << ": " << GetLastError();
}

TemporaryFolder::~TemporaryFolder() {
    RemoveTree(native);
}

String TemporaryFolder::System() const {
    std::u16string path = Widened(native);
    std::replace(path.begin(), path.end(), u'/', u'\\');
    return String(std::u16string_view(path));
}

String TemporaryFolder::System(const char16_t* below) const {
    return String::Concat({System().View(), u"\\", below});
}

void TemporaryFolder::MakeFolder(const std::string& below) const {
    const std::string path = Native(below);
    for (size_t end = native.size(); end != std::string::npos;) {
        end = path.find('/', end + 1);
        const std::string folder = path.substr(0, end);
        if (folder.back() != '/' && CreateDirectoryW(CallPath(folder).c_str(), nullptr) == 0) {
            EXPECT_EQ(GetLastError(), DWORD{ERROR_ALREADY_EXISTS}) << folder;
        }
    }
}

void TemporaryFolder::MakeNestedFolders(const std::string& name, uint32_t depth) const {
    std::string path = native;
    for (uint32_t i = 0; i < depth; ++i) {
        path += "/" + name;
        ASSERT_NE(CreateDirectoryW(CallPath(path).c_str(), nullptr), 0) << i << ": " << GetLastError();
    }
}

void TemporaryFolder::WriteFile(const std::string& below, const std::string& bytes) const {
    const size_t end = below.rfind('/');
    if (end != std::string::npos) {
        MakeFolder(below.substr(0, end));
    }
    const OpenHandle file(Native(below), GENERIC_WRITE, CREATE_ALWAYS);
    DWORD written = 0;
    ::WriteFile(file.Get(), bytes.data(), static_cast<DWORD>(bytes.size()), &written, nullptr);
    EXPECT_EQ(written, bytes.size()) << below;
}

std::string TemporaryFolder::ReadFile(const std::string& below) const {
    const OpenHandle file(Native(below), GENERIC_READ, OPEN_EXISTING);
    std::string bytes;
    char buffer[65536];
    DWORD got = 0;
    while (::ReadFile(file.Get(), buffer, sizeof buffer, &got, nullptr) != 0 && got != 0) {
        bytes.append(buffer, got);
    }
    return bytes;
}

std::string TemporaryFolder::ReadText(const std::string& below) const {
    const std::string bytes = ReadFile(below);
    std::string text;
    for (size_t i = 0; i < bytes.size(); ++i) {
        if (bytes[i] != '\r' || i + 1 == bytes.size() || bytes[i + 1] != '\n') {
            text += bytes[i];
        }
    }
    return text;
}

void TemporaryFolder::MakeLink(const std::string& target, const std::string& below) const {
    const bool isAbsolute = target.size() >= 2 && target[1] == ':';
    const std::string end = isAbsolute ? PathOutsideWine(target) : target;
    EXPECT_TRUE(StartOutsideWine("/bin/ln", {"-s", "--", end, PathOutsideWine(Native(below))})) << below;
    EXPECT_TRUE(Becomes(Native(below), true)) << below;
}

void TemporaryFolder::MakePipe(const std::string& below) const {
    EXPECT_TRUE(StartOutsideWine("/usr/bin/mkfifo", {"--", PathOutsideWine(Native(below))})) << below;
    EXPECT_TRUE(Becomes(Native(below), true)) << below;
}

// No link: as long as a program runs, nothing that leads to its file can be removed, and tests run side by side.
void TemporaryFolder::PlaceProgram(const std::string& program, const std::string& below) const {
    EXPECT_NE(CopyFileW(CallPath(program).c_str(), CallPath(Native(below)).c_str(), FALSE), 0)
        << below << ": " << GetLastError();
}

void TemporaryFolder::Remove(const std::string& below) const {
    const std::string path = Native(below);
    WIN32_FIND_DATAW data;
    const HANDLE search = FindFirstFileW(CallPath(path).c_str(), &data);
    FindClose(search);
    ASSERT_NE(search, INVALID_HANDLE_VALUE) << below;
    const Found found{below, data.dwFileAttributes};
    if (IsRealFolder(found)) {
        RemoveTree(path);
    } else if (IsLink(found)) {
        RemoveOutsideWine(path);
    } else {
        RemoveFile(path);
    }
}

void TemporaryFolder::SetFileTime(const std::string& below, int64_t seconds, int64_t nanoseconds) const {
    constexpr int64_t secondsTo1970 = 11644473600;
    const auto ticks = static_cast<uint64_t>((seconds + secondsTo1970) * 10000000 + nanoseconds / 100);
    const FILETIME time{static_cast<DWORD>(ticks), static_cast<DWORD>(ticks >> 32)};
    const OpenHandle file(Native(below), FILE_WRITE_ATTRIBUTES, OPEN_EXISTING);
    EXPECT_NE(::SetFileTime(file.Get(), nullptr, nullptr, &time), 0) << below << ": " << GetLastError();
}

bool TemporaryFolder::Exists(const std::string& below) const {
    return IsThere(Native(below));
}

uint32_t TemporaryFolder::Permissions(const std::string& below) const {
    ADD_FAILURE() << below << ": there are no permission bits here";
    return 0;
}

std::vector<std::string> TemporaryFolder::Tree() const {
    std::vector<std::string> paths;
    std::vector<std::string> folders{std::string()};
    while (!folders.empty()) {
        const std::string folder = std::move(folders.back());
        folders.pop_back();
        for (const Found& found : ListFolder(folder.empty() ? native : Native(folder.substr(0, folder.size() - 1)))) {
            if (IsRealFolder(found)) {
                folders.push_back(folder + found.name + "/");
            }
            paths.push_back(folder + found.name + (IsRealFolder(found) ? "/" : ""));
        }
    }
    std::sort(paths.begin(), paths.end());
    return paths;
}

WorkingFolderScope::WorkingFolderScope(const std::string& native) {
    char16_t folder[32768];
    GetCurrentDirectoryW(32768, folder);
    before = Narrowed(folder);
    EXPECT_NE(SetCurrentDirectoryW(Widened(native).c_str()), 0) << native << ": " << GetLastError();
}

WorkingFolderScope::~WorkingFolderScope() {
    EXPECT_NE(SetCurrentDirectoryW(Widened(before).c_str()), 0) << before << ": " << GetLastError();
}

}  // namespace qn::dsc::osdep
