#include "qn/dsc/exception/Exception.h"

#include <new>

namespace qn::dsc::exception {

namespace {

// The codes are written as the host's tables have them: 32 bits with the top bit set.
constexpr int32_t Code(uint32_t code) {
    return static_cast<int32_t>(code);
}

class BadAllocation : public std::bad_alloc {
  public:
    const char* what() const noexcept override { return "bad allocation"; }
};

}  // namespace

Exception::~Exception() = default;

const char* Exception::what() const noexcept {
    return "unspecified exception";
}

int32_t Exception::GetErrorCode() const {
    return -1;
}

void ThrowBadAllocation() {
    throw BadAllocation();
}

const char* OutOfRange::what() const noexcept {
    return "Out of range";
}

int32_t OutOfRange::GetErrorCode() const {
    return Code(0x8ABC7007U);
}

OutOfRange2::OutOfRange2(const NarrowString& text) : message("Out of range: ") {
    message.Append(text);
}

const char* OutOfRange2::what() const noexcept {
    return message.CStr();
}

int32_t OutOfRange2::GetErrorCode() const {
    return Code(0x8ABC7007U);
}

const char* ObjectAlreadyExists::what() const noexcept {
    return "Object already exists";
}

int32_t ObjectAlreadyExists::GetErrorCode() const {
    return Code(0x8ABC7009U);
}

const char* NonexistentException::what() const noexcept {
    return "The object does not exist";
}

int32_t NonexistentException::GetErrorCode() const {
    return Code(0x8ABC700AU);
}

const char* InvalidArgument::what() const noexcept {
    return "Invalid argument(s)";
}

int32_t InvalidArgument::GetErrorCode() const {
    return Code(0x8ABC700FU);
}

const char* FileWriteFailed::what() const noexcept {
    return "Write file operation failed";
}

int32_t FileWriteFailed::GetErrorCode() const {
    return Code(0x8ABC7011U);
}

const char* FileReadFailed::what() const noexcept {
    return "Read file operation failed";
}

int32_t FileReadFailed::GetErrorCode() const {
    return Code(0x8ABC7012U);
}

const char* BufferOverflow::what() const noexcept {
    return "Buffer overflowed";
}

int32_t BufferOverflow::GetErrorCode() const {
    return Code(0x8ABC7017U);
}

AccessDenied::AccessDenied(const String& path) : message("Access denied: ") {
    message.Append(NarrowString(path));
}

const char* AccessDenied::what() const noexcept {
    return message.CStr();
}

int32_t AccessDenied::GetErrorCode() const {
    return Code(0x8ABC7019U);
}

const char* FileAlreadyExists::what() const noexcept {
    return "File already exists";
}

int32_t FileAlreadyExists::GetErrorCode() const {
    return Code(0x8ABC701BU);
}

const char* InvalidLocale::what() const noexcept {
    return "Invalid locale";
}

int32_t InvalidLocale::GetErrorCode() const {
    return Code(0x8ABC7024U);
}

const char* InvalidSequence::what() const noexcept {
    return "Invalid UTF8 encoding sequence";
}

int32_t InvalidSequence::GetErrorCode() const {
    return Code(0x8ABC7030U);
}

const char* BadGuidString::what() const noexcept {
    return "Badly formatted Guid string.";
}

int32_t BadGuidString::GetErrorCode() const {
    return Code(0x8ABC7032U);
}

const char* UnableToConvert::what() const noexcept {
    return "Unable to convert.";
}

int32_t UnableToConvert::GetErrorCode() const {
    return Code(0x8ABC7034U);
}

}  // namespace qn::dsc::exception
