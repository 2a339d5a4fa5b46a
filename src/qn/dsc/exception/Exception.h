#pragma once

// The failures of the foundation library. Each class has a fixed text and a fixed code, and an object carries the place
// that threw it. Objects are thrown by value, through ThrowAt, and caught by reference.
// A failed allocation is std::bad_alloc and no member of this tree (ThrowBadAllocation). Making or copying an object
// that holds text can itself fail so.

#include <cstdint>
#include <exception>
#include <utility>

#include "qn/dsc/StringBase.h"

namespace qn::dsc::exception {

class Exception : public std::exception {
  public:
    Exception() = default;
    Exception(const Exception&) = default;
    Exception& operator=(const Exception&) = default;
    ~Exception() override;

    // NUL-terminated narrow text, owned by the object.
    const char* what() const noexcept override;

    // The code that layers above report for this failure.
    virtual int32_t GetErrorCode() const;

    // The line of the throw, 0 if not set.
    int32_t GetLine() const { return line; }
    void SetLine(int32_t newLine) { line = newLine; }

    // The module path of the throw ("qn/dsc/StringBase"), null if not set: a text that lives as long as the program.
    const char* GetFile() const { return file; }
    void SetFile(const char* newFile) { file = newFile; }

  private:
    int32_t line = 0;
    const char* file = nullptr;
};

// Throws `failure` with the place of the throw recorded in it: `file` is the module path, a literal.
template <class Failure>
[[noreturn, gnu::cold, gnu::noinline]] void ThrowAt(Failure failure, const char* file, int32_t line) {
    failure.SetLine(line);
    failure.SetFile(file);
    throw failure;
}

// Throws a std::bad_alloc whose text is "bad allocation", whatever the run-time's own is.
[[noreturn]] void ThrowBadAllocation();

class OutOfRange : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

// An OutOfRange that has more to say: "Out of range: " and `text`.
class OutOfRange2 : public OutOfRange {
  public:
    explicit OutOfRange2(const NarrowString& text);

    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;

  private:
    NarrowString message;
};

class ObjectAlreadyExists : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

class NonexistentException : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

class InvalidArgument : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

class FileWriteFailed : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

class FileReadFailed : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

class BufferOverflow : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

// "Access denied: " and the path, converted to narrow text by the system's default code page.
class AccessDenied : public Exception {
  public:
    explicit AccessDenied(const String& path);

    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;

  private:
    NarrowString message;
};

class FileAlreadyExists : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

class InvalidLocale : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

class InvalidSequence : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

class BadGuidString : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

class UnableToConvert : public Exception {
  public:
    const char* what() const noexcept override;
    int32_t GetErrorCode() const override;
};

}  // namespace qn::dsc::exception
