#pragma once

// Files read and written as bytes.

#include <cstdint>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/FileSystem.h"

namespace qn::dsc::osdep {

// Owns its open file.
class BinaryFile {
  public:
    BinaryFile() = default;
    // Opens; see Open.
    BinaryFile(const String& path, uint32_t mode);
    ~BinaryFile();

    BinaryFile(const BinaryFile&) = delete;
    BinaryFile& operator=(const BinaryFile&) = delete;

    // Opens the file with a sum of BinaryMode::Bits. Of Read, Write and ReadWrite the last that is set counts; none is
    // Read. PosixError if that fails, and if a file is already open here, which then stays open (number EBUSY). Only
    // regular files can be read: a folder, a pipe or a device fails with EACCES, at once.
    void Open(const String& path, uint32_t mode);

    bool IsOpen() const { return file != noFile; }

    // Up to `count` bytes, as many as the system gives at once. The number of bytes; 0 at the end of the file; -1 if
    // the read fails or no file is open. `count` above 2147483647 counts as that.
    int32_t Read(void* buffer, uint32_t count);

    // The number of bytes written, which is less than `count` where the disk is full; -1 if the write fails or no file
    // is open. `count` above 2147483647 counts as that.
    int32_t Write(const void* buffer, uint32_t count);

    // Makes the file `length` bytes long, and its write time the present; the next Read or Write is behind those bytes.
    // False if that fails, as it does for a file that isn't open for writing.
    bool CutAt(uint64_t length);

    // Does nothing if no file is open.
    void Close();

  private:
    // noFile: closed.
    FileHandle file = noFile;
};

}  // namespace qn::dsc::osdep
