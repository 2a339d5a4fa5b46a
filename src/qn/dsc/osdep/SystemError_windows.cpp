#include <windows.h>

#include <cerrno>
#include <memory>

#include "qn/dsc/osdep/SystemError.h"

namespace qn::dsc::osdep {

namespace {

struct LocalFreer {
    void operator()(char* text) const { LocalFree(text); }
};

}  // namespace

uint32_t LastSystemError() {
    return GetLastError();
}

void SetLastSystemError(uint32_t number) {
    SetLastError(number);
}

uint32_t SystemErrorOf(int posixError) {
    switch (posixError) {
        case 0:
            return ERROR_SUCCESS;
        case ENOENT:
            return ERROR_FILE_NOT_FOUND;
        case ENOTDIR:
            return ERROR_PATH_NOT_FOUND;
        case EMFILE:
        case ENFILE:
            return ERROR_TOO_MANY_OPEN_FILES;
        case EACCES:
        case EPERM:
        case EISDIR:
            return ERROR_ACCESS_DENIED;
        case EBADF:
            return ERROR_INVALID_HANDLE;
        case ENOMEM:
            return ERROR_NOT_ENOUGH_MEMORY;
        case EXDEV:
            return ERROR_NOT_SAME_DEVICE;
        case EROFS:
            return ERROR_WRITE_PROTECT;
        case ENODEV:
        case ENXIO:
            return ERROR_BAD_UNIT;
        case EBUSY:
            return ERROR_SHARING_VIOLATION;
        case EEXIST:
            return ERROR_FILE_EXISTS;
        case EINVAL:
            return ERROR_INVALID_PARAMETER;
        case ENOSPC:
            return ERROR_DISK_FULL;
        case ENOTEMPTY:
            return ERROR_DIR_NOT_EMPTY;
        case ENAMETOOLONG:
            return ERROR_FILENAME_EXCED_RANGE;
        case EFBIG:
            return ERROR_FILE_TOO_LARGE;
        case EILSEQ:
            return ERROR_NO_UNICODE_TRANSLATION;
        case EIO:
            return ERROR_IO_DEVICE;
        default:
            return ERROR_GEN_FAILURE;
    }
}

bool GetSystemMessage(uint32_t number, NarrowString& text) {
    constexpr DWORD flags = FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_IGNORE_INSERTS | FORMAT_MESSAGE_FROM_SYSTEM;
    static_assert(flags == 0x1300);
    char* buffer = nullptr;
    const DWORD length = FormatMessageA(flags, nullptr, number, 0, reinterpret_cast<char*>(&buffer), 0, nullptr);
    const std::unique_ptr<char, LocalFreer> message(buffer);
    if (length == 0) {
        return false;
    }
    text = NarrowString(message.get());
    return true;
}

}  // namespace qn::dsc::osdep
