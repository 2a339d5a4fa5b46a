#pragma once

// Failures that the operating system reports. The two classes that are thrown take number and text from the error state
// of the calling thread, so they must be made on the thread that failed, before any other call.

#include <cstdint>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/exception/Exception.h"

namespace qn::dsc::osdep {

class OSException : public exception::Exception {
  public:
    // System error 0, "Unknown error".
    OSException();

    // The message: the system's text for the error, "Unknown error" if it has none.
    const char* what() const noexcept override;

    // 42: the code of a failure without a better one.
    int32_t GetErrorCode() const override;

    // The system's own number.
    virtual uint32_t GetSystemError() const;

  protected:
    explicit OSException(uint32_t number);

    NarrowString message;
    uint32_t systemError;
};

// The last error of the calling thread (SystemError.h). The message has neither the full stop nor the line break that
// the system's text ends in.
class WinError : public OSException {
  public:
    WinError();

    // The code that the host has for the system's number; 42 if it has none.
    int32_t GetErrorCode() const override;
};

// errno and the C library's text for it.
class PosixError : public OSException {
  public:
    PosixError();

    // The code that the host has for the system's number; 42 if it has none.
    int32_t GetErrorCode() const override;
};

}  // namespace qn::dsc::osdep
