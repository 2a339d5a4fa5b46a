#include "qn/dsc/osdep/NativeFile_windows.h"

#include <algorithm>
#include <cerrno>
#include <utility>

namespace qn::dsc::osdep {

namespace {

constexpr std::u16string_view prefix = u"\\\\?\\";
constexpr std::u16string_view networkPrefix = u"\\\\?\\UNC\\";

bool IsLetter(char16_t unit) {
    return (unit >= u'a' && unit <= u'z') || (unit >= u'A' && unit <= u'Z');
}

// What the system makes of a path that doesn't begin at a root: the working folder, that of a drive, or a drive's root.
int ReadStart(const char16_t* path, std::u16string& start) {
    const DWORD room = GetFullPathNameW(path, 0, nullptr, nullptr);
    start.resize(room);
    const DWORD length = room == 0 ? 0 : GetFullPathNameW(path, room, start.data(), nullptr);
    if (length == 0 || length >= room) {
        return length == 0 ? LastErrno() : ENAMETOOLONG;
    }
    start.resize(length);
    return 0;
}

// Puts the start in front of a path that has none, so that it begins with a drive and a separator, or is a network
// path.
int Complete(std::u16string& path) {
    const bool hasDrive = path.size() >= 2 && IsLetter(path[0]) && path[1] == u':';
    const bool isRooted = path[0] == u'\\';
    if (path.starts_with(u"\\\\") || (hasDrive && path.size() >= 3 && path[2] == u'\\')) {
        return 0;
    }
    const char16_t driveFolder[] = {path[0], u':', u'.', u'\0'};
    std::u16string start;
    const int error = ReadStart(isRooted ? u"\\" : (hasDrive ? driveFolder : u"."), start);
    if (error == 0) {
        path = start + u'\\' + path.substr(hasDrive ? 2 : 0);
    }
    return error;
}

// Takes the next name off `rest`. False if there is none.
bool TakeName(std::u16string_view& rest, std::u16string_view& name) {
    rest.remove_prefix(std::min(rest.find_first_not_of(u'\\'), rest.size()));
    const size_t end = std::min(rest.find(u'\\'), rest.size());
    name = rest.substr(0, end);
    rest.remove_prefix(end);
    return !name.empty();
}

// The root of a complete path as calls take it, and what stands behind it. ENOENT for what can name nothing.
int SplitRoot(std::u16string_view path, std::u16string& root, std::u16string_view& rest) {
    if (!path.starts_with(u"\\\\")) {
        root.append(prefix).append(path.substr(0, 3));
        rest = path.substr(3);
        return 0;
    }
    rest = path.substr(2);
    std::u16string_view server;
    std::u16string_view share;
    if (!TakeName(rest, server) || server == u"." || server == u"?" || !TakeName(rest, share)) {
        return ENOENT;
    }
    root.append(networkPrefix).append(server).append(1, u'\\').append(share).append(1, u'\\');
    return 0;
}

// Appends the names of `rest` to `path`, which is a root with a separator at its end; "." and ".." are folded.
void AppendFolded(std::u16string_view rest, std::u16string& path) {
    const size_t rootLength = path.size();
    std::u16string_view name;
    while (TakeName(rest, name)) {
        if (name == u"..") {
            const size_t end = path.size() > rootLength ? path.rfind(u'\\') : rootLength;
            path.resize(std::max(end, rootLength));
        } else if (name != u".") {
            path.append(path.size() > rootLength ? u"\\" : u"").append(name);
        }
    }
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
    std::u16string whole(path);
    std::replace(whole.begin(), whole.end(), u'/', u'\\');
    const bool endsInSeparator = whole.back() == u'\\';
    int error = Complete(whole);
    std::u16string_view rest;
    std::u16string root;
    if (error == 0) {
        error = SplitRoot(whole, root, rest);
    }
    if (error == 0) {
        call.text = std::move(root);
        AppendFolded(rest, call.text);
        call.endsInSeparator = endsInSeparator;
    }
    return error;
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

int ReadCallIdentity(const CallPath& call, FileIdentity& identity) {
    BY_HANDLE_FILE_INFORMATION information;
    int error = ReadFileInformation(call.text, information);
    if (error == 0 && call.endsInSeparator && !IsFolder(information.dwFileAttributes)) {
        error = ENOTDIR;
    }
    if (error == 0) {
        identity = {information.dwVolumeSerialNumber,
                    (uint64_t{information.nFileIndexHigh} << 32) | information.nFileIndexLow};
    }
    return error;
}

}  // namespace qn::dsc::osdep
