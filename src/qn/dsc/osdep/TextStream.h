#pragma once

// A file read or written as a stream of text bytes, with the translation of line ends that is the platform's (none on
// Linux). The path is narrow text in code page 0, made from one in the system's form; it leads to the same file.

#include <cstddef>
#include <cstdint>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/FileSystem.h"

namespace qn::dsc::osdep {

// Owns its open file. Nothing is buffered: what Put has taken is with the system.
class TextStream {
  public:
    TextStream() = default;
    // Closes.
    ~TextStream();

    TextStream(const TextStream&) = delete;
    TextStream& operator=(const TextStream&) = delete;

    // Both close what was open before. False if the file can't be opened; why isn't kept. std::bad_alloc if there is no
    // memory for the path.
    // For reading: only a regular file can be opened; a folder, a pipe or a device is refused at once.
    bool OpenForReading(const NarrowString& path);
    // For writing: the file is created if it is missing, and empty from now on.
    bool OpenForWriting(const NarrowString& path);

    bool IsOpen() const { return file != noFile; }

    // Reads until `count` bytes are there. Less means the end of the file, or that a read failed, or that none is open.
    size_t Read(void* buffer, size_t count);

    // Writes the text up to its NUL; negative if not all of it could be written.
    int32_t Put(const char* text);
    // The same for `count` bytes, whatever they are.
    int32_t Put(const char* bytes, size_t count);

    // Does nothing if no file is open.
    void Close();

  private:
    bool Open(const NarrowString& path, TextMode mode);

    // noFile: closed.
    FileHandle file = noFile;
};

}  // namespace qn::dsc::osdep
