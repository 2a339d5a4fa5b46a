#include "qn/dsc/zk/ThrowIfZKError.h"

#include <cstdio>

#include "qn/dsc/zk/HostErrorText.h"

namespace qn::dsc::zk {

namespace {

constexpr const char* moduleName = "qn/dsc/zk/ThrowIfZKError";

// What reports name as the place of a throw: fixed numbers, which stay when this text changes.
constexpr int32_t lineWithText = 61;
constexpr int32_t lineWithoutText = 75;

NarrowString Message(int32_t code, std::string_view text) {
    char header[64];
    std::snprintf(header, sizeof header, "Error Code: %d (%08x): ", static_cast<int>(code),
                  static_cast<unsigned>(code));
    return NarrowString::Concat({header, text});
}

}  // namespace

ZKErrorException::ZKErrorException(int32_t code) : message(Message(code, GetHostErrorText(code).View())), code(code) {}

ZKErrorException::ZKErrorException(int32_t code, const char* text)
    : message(Message(code, text == nullptr ? "" : text)), code(code) {}

const char* ZKErrorException::what() const noexcept {
    return message.CStr();
}

int32_t ZKErrorException::GetErrorCode() const {
    return code;
}

void ThrowIfZKError(int32_t code) {
    if (code != 0) {
        exception::ThrowAt(ZKErrorException(code), moduleName, lineWithoutText);
    }
}

void ThrowIfZKError(int32_t code, const char* text) {
    if (code != 0) {
        exception::ThrowAt(ZKErrorException(code, text), moduleName, lineWithText);
    }
}

}  // namespace qn::dsc::zk
