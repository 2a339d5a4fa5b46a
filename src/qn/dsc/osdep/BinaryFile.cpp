#include "qn/dsc/osdep/BinaryFile.h"

#include <algorithm>
#include <cerrno>
#include <utility>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/OSException.h"

namespace qn::dsc::osdep {

namespace {

constexpr uint32_t mostAtOnce = 0x7FFFFFFF;

[[noreturn]] void ThrowPosixError(int number, int32_t line) {
    errno = number;
    exception::ThrowAt(PosixError(), "qn/dsc/osdep/BinaryFile", line);
}

}  // namespace

BinaryFile::BinaryFile(const String& path, uint32_t mode) {
    Open(path, mode);
}

BinaryFile::~BinaryFile() {
    Close();
}

void BinaryFile::Open(const String& path, uint32_t mode) {
    if (IsOpen()) {
        ThrowPosixError(EBUSY, __LINE__);
    }
    const int error = GetFileSystem().OpenBinary(path, mode, file);
    if (error != 0) {
        ThrowPosixError(error, __LINE__);
    }
}

int32_t BinaryFile::Read(void* buffer, uint32_t count) {
    size_t got = 0;
    if (!IsOpen() || GetFileSystem().ReadBytes(file, buffer, std::min(count, mostAtOnce), got) != 0) {
        return -1;
    }
    return static_cast<int32_t>(got);
}

int32_t BinaryFile::Write(const void* buffer, uint32_t count) {
    size_t put = 0;
    if (!IsOpen() || GetFileSystem().WriteBytes(file, buffer, std::min(count, mostAtOnce), put) != 0) {
        return -1;
    }
    return static_cast<int32_t>(put);
}

bool BinaryFile::CutAt(uint64_t length) {
    return IsOpen() && GetFileSystem().CutFile(file, length) == 0;
}

void BinaryFile::Close() {
    if (IsOpen()) {
        GetFileSystem().CloseFile(std::exchange(file, noFile));
    }
}

}  // namespace qn::dsc::osdep
