#pragma once

// A disk that exists in memory only, so that an input can be a file, and files can include each other. Flat: every file
// stands in the root, and folders are there by being the root or the prefix of a file's path. Read-only but for text
// files, which are taken and kept.

#include <algorithm>
#include <cerrno>
#include <cstdint>
#include <cstring>
#include <map>
#include <string>
#include <utility>
#include <vector>

#include "SearchingFolderWalk.h"
#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/FileSystem.h"

namespace fuzz {

class MemoryFileSystem : public qn::dsc::osdep::FileSystem {
  public:
    using String = qn::dsc::String;

    // `executable` is the path that the running program is said to have.
    explicit MemoryFileSystem(std::u16string executable) : executable(std::move(executable)) {
        qn::dsc::osdep::SetFileSystem(this);
    }
    ~MemoryFileSystem() override { qn::dsc::osdep::SetFileSystem(nullptr); }
    MemoryFileSystem(const MemoryFileSystem&) = delete;
    MemoryFileSystem& operator=(const MemoryFileSystem&) = delete;

    struct File {
        std::string bytes;
        uint64_t lastWriteTime = 1;
    };
    std::map<std::u16string, File> files;

    int ReadAttributes(const String& path, qn::dsc::osdep::FileAttributes& attributes) override {
        if (const File* file = Find(path)) {
            attributes = {false, file->lastWriteTime};
            return 0;
        }
        if (!IsFolder(path)) {
            return ENOENT;
        }
        attributes = {true, 1};
        return 0;
    }

    int ReadIdentity(const String& path, qn::dsc::osdep::FileIdentity& identity) override {
        if (Find(path) == nullptr && !IsFolder(path)) {
            return ENOENT;
        }
        identity = {1, std::hash<std::u16string_view>()(Trimmed(path))};
        return 0;
    }

    int BeginSearch(const String& pattern, qn::dsc::osdep::SearchHandle& search, String& firstName) override {
        const std::u16string_view text = pattern.View();
        const size_t slash = text.rfind(u'\\');
        const std::u16string folder(text.substr(0, slash + 1));
        const std::u16string_view wanted = text.substr(slash + 1);
        std::vector<std::u16string> names;
        if (wanted == u"*") {
            names = {u".", u".."};
        }
        for (const auto& [path, file] : files) {
            if (path.size() <= folder.size() || path.compare(0, folder.size(), folder) != 0) {
                continue;
            }
            const std::u16string rest = path.substr(folder.size());
            const std::u16string name = rest.substr(0, rest.find(u'\\'));
            const std::u16string_view suffix = wanted.empty() ? wanted : wanted.substr(1);
            if (name.size() >= suffix.size() && name.compare(name.size() - suffix.size(), suffix.size(), suffix) == 0 &&
                (names.empty() || names.back() != name)) {
                names.push_back(name);
            }
        }
        if (names.empty()) {
            return ENOENT;
        }
        std::reverse(names.begin(), names.end());
        firstName = String(names.back());
        names.pop_back();
        search = static_cast<qn::dsc::osdep::SearchHandle>(searches.size());
        searches.push_back(std::move(names));
        return 0;
    }

    int NextName(qn::dsc::osdep::SearchHandle search, String& name) override {
        std::vector<std::u16string>& names = searches[static_cast<size_t>(search)];
        if (names.empty()) {
            return ENOENT;
        }
        name = String(names.back());
        names.pop_back();
        return 0;
    }

    void EndSearch(qn::dsc::osdep::SearchHandle) override {}

    int BeginWalk(const String& folder, const String& pattern,
                  std::unique_ptr<qn::dsc::osdep::FolderWalk>& walk) override {
        walk = std::make_unique<SearchingFolderWalk>(*this, Trimmed(folder), pattern.View());
        return 0;
    }

    int MakeFolder(const String&) override { return EACCES; }

    int OpenBinary(const String& path, uint32_t mode, qn::dsc::osdep::FileHandle& handle) override {
        return mode == qn::dsc::osdep::BinaryMode::Read ? Open(path, handle) : EACCES;
    }

    int OpenText(const String& path, qn::dsc::osdep::TextMode mode, qn::dsc::osdep::FileHandle& handle) override {
        if (mode == qn::dsc::osdep::TextMode::Writing) {
            files[std::u16string(Trimmed(path))].bytes.clear();
        }
        return Open(path, handle);
    }

    int ReadBytes(qn::dsc::osdep::FileHandle handle, void* buffer, size_t count, size_t& got) override {
        OpenFile& open = opens[static_cast<size_t>(handle)];
        got = std::min(count, open.file->bytes.size() - open.offset);
        std::memcpy(buffer, open.file->bytes.data() + open.offset, got);
        open.offset += got;
        return 0;
    }

    int WriteBytes(qn::dsc::osdep::FileHandle handle, const void* buffer, size_t count, size_t& put) override {
        opens[static_cast<size_t>(handle)].file->bytes.append(static_cast<const char*>(buffer), count);
        put = count;
        return 0;
    }

    int CutFile(qn::dsc::osdep::FileHandle, uint64_t) override { return EACCES; }

    int CloseFile(qn::dsc::osdep::FileHandle) override { return 0; }

    int ReadWorkingFolder(String& path) override {
        path = String(u"C:\\");
        return 0;
    }

    int ReadExecutablePath(String& path) override {
        path = String(executable);
        return 0;
    }

    std::unique_ptr<qn::dsc::osdep::FolderHold> HoldFolder(const String&) override { return nullptr; }

  private:
    struct OpenFile {
        File* file;
        size_t offset;
    };

    // A path ends at its first NUL.
    static std::u16string_view Trimmed(const String& path) {
        const std::u16string_view text = path.View();
        return text.substr(0, text.find(u'\0'));
    }

    File* Find(const String& path) {
        const auto found = files.find(std::u16string(Trimmed(path)));
        return found == files.end() ? nullptr : &found->second;
    }

    bool IsFolder(const String& path) const {
        std::u16string prefix(Trimmed(path));
        if (prefix.empty() || prefix.back() != u'\\') {
            prefix.push_back(u'\\');
        }
        const auto next = files.lower_bound(prefix);
        return next != files.end() && next->first.compare(0, prefix.size(), prefix) == 0;
    }

    int Open(const String& path, qn::dsc::osdep::FileHandle& handle) {
        File* file = Find(path);
        if (file == nullptr) {
            return ENOENT;
        }
        handle = static_cast<qn::dsc::osdep::FileHandle>(opens.size());
        opens.push_back({file, 0});
        return 0;
    }

    std::u16string executable;
    std::vector<OpenFile> opens;
    std::vector<std::vector<std::u16string>> searches;
};

}  // namespace fuzz
