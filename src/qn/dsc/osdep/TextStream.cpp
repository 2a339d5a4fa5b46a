#include "qn/dsc/osdep/TextStream.h"

#include <cstring>
#include <utility>

namespace qn::dsc::osdep {

TextStream::~TextStream() {
    Close();
}

bool TextStream::OpenForReading(const NarrowString& path) {
    return Open(path, TextMode::Reading);
}

bool TextStream::OpenForWriting(const NarrowString& path) {
    return Open(path, TextMode::Writing);
}

bool TextStream::Open(const NarrowString& path, TextMode mode) {
    Close();
    return GetFileSystem().OpenText(String(path), mode, file) == 0;
}

size_t TextStream::Read(void* buffer, size_t count) {
    size_t total = 0;
    while (IsOpen() && total < count) {
        size_t got = 0;
        const int error = GetFileSystem().ReadBytes(file, static_cast<char*>(buffer) + total, count - total, got);
        if (error != 0 || got == 0) {
            break;
        }
        total += got;
    }
    return total;
}

int32_t TextStream::Put(const char* text) {
    return Put(text, std::strlen(text));
}

int32_t TextStream::Put(const char* bytes, size_t count) {
    if (!IsOpen()) {
        return -1;
    }
    size_t total = 0;
    while (total < count) {
        size_t put = 0;
        const int error = GetFileSystem().WriteBytes(file, bytes + total, count - total, put);
        if (error != 0 || put == 0) {
            return -1;
        }
        total += put;
    }
    return 0;
}

void TextStream::Close() {
    if (IsOpen()) {
        GetFileSystem().CloseFile(std::exchange(file, noFile));
    }
}

}  // namespace qn::dsc::osdep
