#include "qn/dsc/osdep/NativeFile_windows.h"

#include <cerrno>

namespace qn::dsc::osdep {

namespace {

// A folder's path must leave room for a short name in it.
constexpr size_t longestPlainPath = 247;

constexpr std::u16string_view longPrefix = u"\\\\?\\";
constexpr std::u16string_view longNetworkPrefix = u"\\\\?\\UNC";

bool IsSeparator(char16_t unit) {
    return unit == u'\\' || unit == u'/';
}

// The absolute and folded form, with the prefix for long paths.
int MakeLong(const std::u16string& path, std::u16string& result) {
    const DWORD room = GetFullPathNameW(path.c_str(), 0, nullptr, nullptr);
    if (room == 0) {
        return LastErrno();
    }
    std::u16string full(room, u'\0');
    const DWORD length = GetFullPathNameW(path.c_str(), room, full.data(), nullptr);
    if (length == 0 || length >= room) {
        return length == 0 ? LastErrno() : ENAMETOOLONG;
    }
    full.resize(length);
    if (full.starts_with(u"\\\\?\\") || full.starts_with(u"\\\\.\\")) {
        result = full;
    } else if (full.starts_with(u"\\\\")) {
        result = std::u16string(longNetworkPrefix) + full.substr(1);
    } else {
        result = std::u16string(longPrefix) + full;
    }
    return 0;
}

// Open for nothing but questions.
class QuestionHandle {
  public:
    explicit QuestionHandle(const std::u16string& path)
        : handle(CreateFileW(path.c_str(), 0, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE, nullptr,
                             OPEN_EXISTING, FILE_FLAG_BACKUP_SEMANTICS, nullptr)) {}
    ~QuestionHandle() {
        if (IsOpen()) {
            CloseHandle(handle);
        }
    }
    QuestionHandle(const QuestionHandle&) = delete;
    QuestionHandle& operator=(const QuestionHandle&) = delete;

    bool IsOpen() const { return handle != INVALID_HANDLE_VALUE; }
    HANDLE Get() const { return handle; }

  private:
    HANDLE handle;
};

}  // namespace

int MakeCallPath(std::u16string_view path, CallPath& call) {
    path = path.substr(0, path.find(u'\0'));
    if (path.empty()) {
        return ENOENT;
    }
    call.text = path;
    call.endsInSeparator = IsSeparator(path.back());
    if (path.size() <= longestPlainPath) {
        return 0;
    }
    return MakeLong(std::u16string(path), call.text);
}

int ErrnoOf(DWORD number) {
    switch (number) {
        case ERROR_SUCCESS:
            return 0;
        case ERROR_FILE_NOT_FOUND:
        case ERROR_PATH_NOT_FOUND:
        case ERROR_INVALID_DRIVE:
        case ERROR_NO_MORE_FILES:
        case ERROR_BAD_NETPATH:
        case ERROR_BAD_NET_NAME:
        case ERROR_BAD_PATHNAME:
        case ERROR_INVALID_NAME:
            return ENOENT;
        case ERROR_DIRECTORY:
            return ENOTDIR;
        case ERROR_TOO_MANY_OPEN_FILES:
            return EMFILE;
        case ERROR_ACCESS_DENIED:
        case ERROR_SHARING_VIOLATION:
        case ERROR_LOCK_VIOLATION:
            return EACCES;
        case ERROR_INVALID_HANDLE:
            return EBADF;
        case ERROR_NOT_ENOUGH_MEMORY:
        case ERROR_OUTOFMEMORY:
            return ENOMEM;
        case ERROR_WRITE_PROTECT:
            return EROFS;
        case ERROR_FILE_EXISTS:
        case ERROR_ALREADY_EXISTS:
            return EEXIST;
        case ERROR_INVALID_PARAMETER:
            return EINVAL;
        case ERROR_HANDLE_DISK_FULL:
        case ERROR_DISK_FULL:
            return ENOSPC;
        case ERROR_DIR_NOT_EMPTY:
            return ENOTEMPTY;
        case ERROR_BUFFER_OVERFLOW:
        case ERROR_FILENAME_EXCED_RANGE:
            return ENAMETOOLONG;
        default:
            return EIO;
    }
}

int LastErrno() {
    const int error = ErrnoOf(GetLastError());
    return error == 0 ? EIO : error;
}

bool IsFolder(DWORD attributes) {
    return (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
}

bool IsLink(DWORD attributes) {
    return (attributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0;
}

uint64_t TicksOf(const FILETIME& time) {
    return (uint64_t{time.dwHighDateTime} << 32) | time.dwLowDateTime;
}

int ReadFileInformation(const std::u16string& path, BY_HANDLE_FILE_INFORMATION& information) {
    const QuestionHandle opened(path);
    return opened.IsOpen() && GetFileInformationByHandle(opened.Get(), &information) != 0 ? 0 : LastErrno();
}

int ReadCallAttributes(const std::u16string& path, FileAttributes& attributes) {
    WIN32_FILE_ATTRIBUTE_DATA data;
    if (GetFileAttributesExW(path.c_str(), GetFileExInfoStandard, &data) == 0) {
        return LastErrno();
    }
    if (!IsLink(data.dwFileAttributes)) {
        attributes = {IsFolder(data.dwFileAttributes), TicksOf(data.ftLastWriteTime)};
        return 0;
    }
    // Attributes are those of the link itself.
    BY_HANDLE_FILE_INFORMATION information;
    const int error = ReadFileInformation(path, information);
    if (error == 0) {
        attributes = {IsFolder(information.dwFileAttributes), TicksOf(information.ftLastWriteTime)};
    }
    return error;
}

int ReadCallIdentity(const std::u16string& path, FileIdentity& identity) {
    BY_HANDLE_FILE_INFORMATION information;
    const int error = ReadFileInformation(path, information);
    if (error == 0) {
        identity = {information.dwVolumeSerialNumber,
                    (uint64_t{information.nFileIndexHigh} << 32) | information.nFileIndexLow};
    }
    return error;
}

}  // namespace qn::dsc::osdep
