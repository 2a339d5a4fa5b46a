#include "qn/dsc/osdep/OSException.h"

#include <cerrno>
#include <cstring>

#include "qn/dsc/osdep/SystemError.h"

namespace qn::dsc::osdep {

namespace {

constexpr int32_t unmappedError = 42;

}  // namespace

OSException::OSException() : OSException(0) {}

OSException::OSException(uint32_t number) : message("Unknown error"), systemError(number) {}

const char* OSException::what() const noexcept {
    return message.CStr();
}

int32_t OSException::GetErrorCode() const {
    return unmappedError;
}

uint32_t OSException::GetSystemError() const {
    return systemError;
}

// The number is read before the base is made: allocating its text may change it.
WinError::WinError() : OSException(LastSystemError()) {
    NarrowString text;
    if (!GetSystemMessage(systemError, text)) {
        return;
    }
    // The line break goes, and the full stop before it.
    const uint32_t lineEnd = text.Find('\r');
    if (lineEnd != NarrowString::npos) {
        text = text.Substring(0, lineEnd == 0 ? 0 : lineEnd - 1);
    }
    message = std::move(text);
}

int32_t WinError::GetErrorCode() const {
    switch (systemError) {
        case 0:
            return 0;
        case 2:
        case 3:
        case 15:
            return 7;
        case 4:
            return 11;
        case 5:
            return static_cast<int32_t>(0x80070005U);
        case 6:
        case 87:
            return 1;
        case 8:
        case 14:
            return 2;
        case 11:
            return 23;
        case 16:
        case 19:
        case 32:
        case 33:
            return 8;
        case 20:
            return 37;
        case 23:
            return -508;
        case 38:
            return 4;
        case 39:
            return 9;
        case 80:
            return -98;
        default:
            return unmappedError;
    }
}

PosixError::PosixError() : OSException(static_cast<uint32_t>(errno)) {
    message = NarrowString(std::strerror(static_cast<int>(systemError)));
}

int32_t PosixError::GetErrorCode() const {
    switch (systemError) {
        case 0:
            return 0;
        case 2:
            return 7;
        default:
            return unmappedError;
    }
}

}  // namespace qn::dsc::osdep
