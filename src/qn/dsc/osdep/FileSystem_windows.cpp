#include "qn/dsc/osdep/FileSystem.h"

#include <fcntl.h>
#include <io.h>
#include <sys/stat.h>
#include <windows.h>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <string>
#include <utility>

#include "qn/dsc/osdep/FolderList_windows.h"
#include "qn/dsc/osdep/FolderWalk_windows.h"
#include "qn/dsc/osdep/NameOrder.h"
#include "qn/dsc/osdep/NativeFile_windows.h"

namespace qn::dsc::osdep {

namespace {

// What the narrow calls for paths are given; the NUL included.
constexpr DWORD narrowPathSize = 261;

struct OpenSearch {
    FolderList names;
    size_t next = 0;
};

OpenSearch* SearchOf(SearchHandle search) {
    return reinterpret_cast<OpenSearch*>(search);
}

int DescriptorOf(FileHandle file) {
    return static_cast<int>(file);
}

// Only what lies on a disk, so that nothing is waited for.
bool IsDiskFile(int descriptor) {
    return GetFileType(reinterpret_cast<HANDLE>(_get_osfhandle(descriptor))) == FILE_TYPE_DISK;
}

int OpenAny(const String& path, int flags, FileHandle& file) {
    CallPath call;
    const int error = MakeCallPath(path.View(), call);
    if (error != 0 || call.endsInSeparator) {
        return error != 0 ? error : ENOENT;
    }
    // The run-time's own text type has as many bits.
    const auto* const text = reinterpret_cast<const wchar_t*>(call.text.c_str());
    const int descriptor = _wopen(text, flags | _O_NOINHERIT, _S_IREAD | _S_IWRITE);
    if (descriptor < 0) {
        return errno;
    }
    if ((flags & _O_WRONLY) == 0 && !IsDiskFile(descriptor)) {
        _close(descriptor);
        return EACCES;
    }
    file = descriptor;
    return 0;
}

unsigned int CallCount(size_t count) {
    return static_cast<unsigned int>(std::min<size_t>(count, INT_MAX));
}

class NativeFileSystem final : public FileSystem {
  public:
    int ReadAttributes(const String& path, FileAttributes& attributes) override;
    int ReadIdentity(const String& path, FileIdentity& identity) override;
    int BeginSearch(const String& pattern, SearchHandle& search, String& firstName) override;
    int NextName(SearchHandle search, String& name) override;
    void EndSearch(SearchHandle search) override;
    int BeginWalk(const String& folder, const String& pattern, std::unique_ptr<FolderWalk>& walk) override;
    int MakeFolder(const String& path) override;
    int OpenBinary(const String& path, uint32_t mode, FileHandle& file) override;
    int OpenText(const String& path, TextMode mode, FileHandle& file) override;
    int ReadBytes(FileHandle file, void* buffer, size_t count, size_t& got) override;
    int WriteBytes(FileHandle file, const void* buffer, size_t count, size_t& put) override;
    int CutFile(FileHandle file, uint64_t length) override;
    int CloseFile(FileHandle file) override;
    int ReadWorkingFolder(String& path) override;
    int ReadExecutablePath(String& path) override;
    std::unique_ptr<FolderHold> HoldFolder(const String& folder) override;
};

int NativeFileSystem::ReadAttributes(const String& path, FileAttributes& attributes) {
    CallPath call;
    FileAttributes read;
    int error = MakeCallPath(path.View(), call);
    if (error == 0) {
        error = ReadCallAttributes(call.text, read);
    }
    if (error == 0 && call.endsInSeparator && !read.isDirectory) {
        error = ENOTDIR;
    }
    if (error == 0) {
        attributes = read;
    }
    return error;
}

int NativeFileSystem::ReadIdentity(const String& path, FileIdentity& identity) {
    CallPath call;
    const int error = MakeCallPath(path.View(), call);
    return error != 0 ? error : ReadCallIdentity(call, identity);
}

int NativeFileSystem::BeginSearch(const String& pattern, SearchHandle& search, String& firstName) {
    const std::u16string_view text = pattern.View().substr(0, pattern.View().find(u'\0'));
    const size_t end = text.find_last_of(u"\\/:");
    const std::u16string_view name = end == std::u16string_view::npos ? text : text.substr(end + 1);
    const std::u16string_view folder = end == std::u16string_view::npos ? u"." : text.substr(0, end + 1);
    CallPath call;
    int error = name.empty() ? ENOENT : MakeCallPath(folder, call);
    if (error != 0) {
        return error;
    }
    std::u16string upperName;
    AppendUpper(name, upperName);
    auto names = std::make_unique<OpenSearch>();
    error = names->names.Read(call.text, upperName, false);
    if (error == 0) {
        error = NextName(reinterpret_cast<SearchHandle>(names.get()), firstName);
    }
    if (error == 0) {
        search = reinterpret_cast<SearchHandle>(names.release());
    }
    return error;
}

int NativeFileSystem::NextName(SearchHandle search, String& name) {
    OpenSearch& names = *SearchOf(search);
    if (names.next == names.names.Count()) {
        return ENOENT;
    }
    name.Assign(std::u16string_view(names.names.At(names.next).text));
    ++names.next;
    return 0;
}

void NativeFileSystem::EndSearch(SearchHandle search) {
    const std::unique_ptr<OpenSearch> ended(SearchOf(search));
}

int NativeFileSystem::BeginWalk(const String& folder, const String& pattern, std::unique_ptr<FolderWalk>& walk) {
    auto begun = std::make_unique<NativeFolderWalk>(pattern);
    const int error = begun->Begin(folder);
    if (error == 0) {
        walk = std::move(begun);
    }
    return error;
}

int NativeFileSystem::MakeFolder(const String& path) {
    CallPath call;
    const int error = MakeCallPath(path.View(), call);
    return error != 0 || CreateDirectoryW(call.text.c_str(), nullptr) != 0 ? error : LastErrno();
}

int NativeFileSystem::OpenBinary(const String& path, uint32_t mode, FileHandle& file) {
    int flags = _O_RDONLY;
    if ((mode & BinaryMode::ReadWrite) != 0) {
        flags = _O_RDWR;
    } else if ((mode & BinaryMode::Write) != 0) {
        flags = _O_WRONLY;
    }
    flags |= (mode & BinaryMode::Truncate) != 0 ? _O_TRUNC : 0;
    flags |= (mode & BinaryMode::Create) != 0 ? _O_CREAT : 0;
    return OpenAny(path, flags | _O_BINARY, file);
}

int NativeFileSystem::OpenText(const String& path, TextMode mode, FileHandle& file) {
    const int flags = mode == TextMode::Reading ? _O_RDONLY : _O_WRONLY | _O_CREAT | _O_TRUNC;
    return OpenAny(path, flags | _O_TEXT, file);
}

int NativeFileSystem::ReadBytes(FileHandle file, void* buffer, size_t count, size_t& got) {
    const int result = _read(DescriptorOf(file), buffer, CallCount(count));
    if (result < 0) {
        return errno;
    }
    got = static_cast<size_t>(result);
    return 0;
}

int NativeFileSystem::WriteBytes(FileHandle file, const void* buffer, size_t count, size_t& put) {
    const int result = _write(DescriptorOf(file), buffer, CallCount(count));
    if (result < 0) {
        return errno;
    }
    put = static_cast<size_t>(result);
    return 0;
}

int NativeFileSystem::CutFile(FileHandle file, uint64_t length) {
    const int descriptor = DescriptorOf(file);
    const auto end = static_cast<int64_t>(length);
    if (_chsize_s(descriptor, end) != 0 || _lseeki64(descriptor, end, SEEK_SET) < 0) {
        return errno;
    }
    // A length that stays as it is doesn't count as a write.
    FILETIME now;
    GetSystemTimeAsFileTime(&now);
    const auto handle = reinterpret_cast<HANDLE>(_get_osfhandle(descriptor));
    return SetFileTime(handle, nullptr, nullptr, &now) != 0 ? 0 : LastErrno();
}

int NativeFileSystem::CloseFile(FileHandle file) {
    return _close(DescriptorOf(file)) != 0 ? errno : 0;
}

int NativeFileSystem::ReadWorkingFolder(String& path) {
    char narrow[narrowPathSize];
    const DWORD length = GetCurrentDirectoryA(narrowPathSize, narrow);
    if (length == 0 || length >= narrowPathSize) {
        return length == 0 ? LastErrno() : ENAMETOOLONG;
    }
    path = String(narrow);
    return 0;
}

int NativeFileSystem::ReadExecutablePath(String& path) {
    char narrow[narrowPathSize];
    const DWORD length = GetModuleFileNameA(nullptr, narrow, narrowPathSize);
    if (length == 0 || length >= narrowPathSize) {
        return length == 0 ? LastErrno() : ENAMETOOLONG;
    }
    path = String(narrow);
    return 0;
}

std::unique_ptr<FolderHold> NativeFileSystem::HoldFolder(const String&) {
    // The system is blind to case by itself.
    return nullptr;
}

}  // namespace

FileSystem& GetNativeFileSystem() {
    // Never destroyed: exit handlers may still use files.
    static FileSystem& native = *new NativeFileSystem;
    return native;
}

}  // namespace qn::dsc::osdep
