// Linux has errno alone. The record kept here takes the place of the other platform's, with its numbers and its texts,
// so that a failure reads the same on both.

#include <algorithm>
#include <array>
#include <cerrno>
#include <string_view>

#include "qn/dsc/osdep/SystemError.h"

namespace qn::dsc::osdep {

namespace {

thread_local uint32_t lastError = 0;

struct Message {
    uint32_t number;
    // Without the full stop and the line break, which all of them end in.
    std::string_view text;
};

// In ascending order of the numbers.
constexpr std::array messages = {
    Message{0, "The operation completed successfully"},
    Message{1, "Incorrect function"},
    Message{2, "The system cannot find the file specified"},
    Message{3, "The system cannot find the path specified"},
    Message{4, "The system cannot open the file"},
    Message{5, "Access is denied"},
    Message{6, "The handle is invalid"},
    Message{8, "Not enough memory resources are available to process this command"},
    Message{11, "An attempt was made to load a program with an incorrect format"},
    Message{14, "Not enough memory resources are available to complete this operation"},
    Message{15, "The system cannot find the drive specified"},
    Message{16, "The directory cannot be removed"},
    Message{17, "The system cannot move the file to a different disk drive"},
    Message{18, "There are no more files"},
    Message{19, "The media is write protected"},
    Message{20, "The system cannot find the device specified"},
    Message{21, "The device is not ready"},
    Message{23, "Data error (cyclic redundancy check)"},
    Message{31, "A device attached to the system is not functioning"},
    Message{32, "The process cannot access the file because it is being used by another process"},
    Message{33, "The process cannot access the file because another process has locked a portion of the file"},
    Message{38, "Reached the end of the file"},
    Message{39, "The disk is full"},
    Message{50, "The request is not supported"},
    Message{80, "The file exists"},
    Message{82, "The directory or file cannot be created"},
    Message{87, "The parameter is incorrect"},
    Message{112, "There is not enough space on the disk"},
    Message{122, "The data area passed to a system call is too small"},
    Message{123, "The filename, directory name, or volume label syntax is incorrect"},
    Message{126, "The specified module could not be found"},
    Message{127, "The specified procedure could not be found"},
    Message{145, "The directory is not empty"},
    Message{183, "Cannot create a file when that file already exists"},
    Message{206, "The filename or extension is too long"},
    Message{223, "The file size exceeds the limit allowed and cannot be saved"},
    Message{267, "The directory name is invalid"},
    Message{1004, "Invalid flags"},
    Message{1113, "No mapping for the Unicode character exists in the target multi-byte code page"},
    Message{1117, "The request could not be performed because of an I/O device error"},
};

constexpr bool IsBefore(const Message& message, uint32_t number) {
    return message.number < number;
}

}  // namespace

uint32_t LastSystemError() {
    return lastError;
}

void SetLastSystemError(uint32_t number) {
    lastError = number;
}

uint32_t SystemErrorOf(int posixError) {
    switch (posixError) {
        case 0:
            return 0;
        case ENOENT:
            return systemErrorFileNotFound;
        case ENOTDIR:
            return systemErrorPathNotFound;
        case EMFILE:
        case ENFILE:
            return 4;
        case EACCES:
        case EPERM:
        case EISDIR:
            return systemErrorAccessDenied;
        case EBADF:
            return 6;
        case ENOMEM:
            return systemErrorNotEnoughMemory;
        case EXDEV:
            return 17;
        case EROFS:
            return 19;
        case ENODEV:
        case ENXIO:
            return 20;
        case EBUSY:
        case ETXTBSY:
            return 32;
        case EEXIST:
            return 80;
        case EINVAL:
            return systemErrorInvalidParameter;
        case ENOSPC:
        case EDQUOT:
            return 112;
        case ENOTEMPTY:
            return 145;
        case ENAMETOOLONG:
            return 206;
        case EFBIG:
            return 223;
        case EILSEQ:
            return systemErrorNoMapping;
        case EIO:
            return 1117;
        default:
            return systemErrorGeneralFailure;
    }
}

bool GetSystemMessage(uint32_t number, NarrowString& text) {
    const auto* message = std::lower_bound(messages.begin(), messages.end(), number, IsBefore);
    if (message == messages.end() || message->number != number) {
        return false;
    }
    text = NarrowString::Concat({message->text, ".\r\n"});
    return true;
}

}  // namespace qn::dsc::osdep
