#include <cerrno>
#include <cstring>
#include <new>
#include <string_view>
#include <vector>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/BinaryFile.h"
#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/FileSystem.h"
#include "qn/dsc/osdep/path.h"

namespace qn::dsc::osdep {

namespace {

using exception::ThrowAt;

constexpr char module[] = "qn/dsc/osdep/path";
constexpr char16_t separator = u'\\';

bool ReadIsDirectory(const String& path) {
    FileAttributes attributes;
    return IsAbsolutePath(path) && GetFileSystem().ReadAttributes(path, attributes) == 0 && attributes.isDirectory;
}

// The folders that an absolute path asks for, from the top, as lengths of its start. Ends before a name that ends in
// "."; `isSound` is then false.
std::vector<uint32_t> LevelsOf(std::u16string_view path, bool& isSound) {
    std::vector<uint32_t> levels;
    size_t start = path.find(u':') + 2;
    if (path[0] == separator) {
        const size_t serverEnd = path.find(separator, 2);
        if (serverEnd == std::u16string_view::npos) {
            ThrowAt(exception::InvalidArgument(), module, __LINE__);
        }
        start = serverEnd + 1;
    } else {
        levels.push_back(static_cast<uint32_t>(start));
    }
    isSound = true;
    for (size_t end = path.find(separator, start); end != std::u16string_view::npos;
         end = path.find(separator, start)) {
        if (end > start && path[end - 1] == u'.') {
            isSound = false;
            break;
        }
        if (end > start) {
            levels.push_back(static_cast<uint32_t>(end));
        }
        start = end + 1;
    }
    return levels;
}

enum class NextBytes {
    Same,
    Other,
    None,
};

// What the next `count` bytes of the file, at most 4096, are to those of `block`. Up to as many are read.
NextBytes CompareNext(BinaryFile& file, const char* block, int32_t count) {
    char held[4096];
    int32_t compared = 0;
    while (compared < count) {
        const int32_t got = file.Read(held, static_cast<uint32_t>(count - compared));
        if (got == 0 && compared == 0) {
            return NextBytes::None;
        }
        if (got <= 0 || std::memcmp(held, block + compared, static_cast<size_t>(got)) != 0) {
            return NextBytes::Other;
        }
        compared += got;
    }
    return NextBytes::Same;
}

// Reads on in both files as long as they agree, then cuts `to` where it goes on otherwise. `block` is room for 4096
// bytes; the result is what the last read of `from` gave, whose bytes are to be written next. Most copies are there
// already, and to empty a file and write the same into it again takes the system four times as long, since it hurries
// such a file to the disk.
int32_t SkipAlike(BinaryFile& from, BinaryFile& to, char* block) {
    uint64_t alike = 0;
    NextBytes next = NextBytes::Same;
    int32_t got = from.Read(block, 4096);
    while (got > 0 && (next = CompareNext(to, block, got)) == NextBytes::Same) {
        alike += static_cast<uint64_t>(got);
        got = from.Read(block, 4096);
    }
    if (next != NextBytes::None && !to.CutAt(alike)) {
        ThrowAt(exception::FileWriteFailed(), module, __LINE__);
    }
    return got;
}

}  // namespace

String GetCurrentDirectoryPath() {
    String path;
    return GetFileSystem().ReadWorkingFolder(path) == 0 ? path : String();
}

bool IsDirectory(const String& path) noexcept {
    try {
        return ReadIsDirectory(path);
    } catch (const std::bad_alloc&) {
        return false;
    }
}

bool IsExistingFile(const String& path) {
    if (!IsAbsolutePath(path)) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
    FileAttributes attributes;
    return GetFileSystem().ReadAttributes(path, attributes) == 0 && !attributes.isDirectory;
}

TimeStamp GetFileModificationTime(const String& path) {
    FileAttributes attributes;
    return GetFileSystem().ReadAttributes(path, attributes) == 0 ? TimeStamp::FromFileTime(attributes.lastWriteTime)
                                                                 : TimeStamp();
}

void CopyFileTo(const String& source, const String& destination, bool overwrite) {
    if (!IsAbsolutePath(source) || !IsAbsolutePath(destination)) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
    if (!overwrite && IsExistingFile(destination)) {
        ThrowAt(exception::FileAlreadyExists(), module, __LINE__);
    }
    if (Equal(source.View(), destination.View())) {
        return;
    }
    BinaryFile from(source, BinaryMode::Read);
    BinaryFile to(destination, BinaryMode::Create | BinaryMode::ReadWrite);
    char block[4096];
    int32_t got = overwrite ? SkipAlike(from, to, block) : from.Read(block, sizeof block);
    while (got > 0) {
        if (to.Write(block, static_cast<uint32_t>(got)) < got) {
            ThrowAt(exception::FileWriteFailed(), module, __LINE__);
        }
        got = from.Read(block, sizeof block);
    }
    if (got < 0) {
        ThrowAt(exception::FileReadFailed(), module, __LINE__);
    }
}

void CreateDirectoryPath(const String& path) {
    if (!IsAbsolutePath(path)) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
    bool isSound = true;
    const std::vector<uint32_t> levels = LevelsOf(path.View(), isSound);
    // A folder that stands has all above it standing, so the first missing one is found from below, in one step for
    // a new folder in an old one.
    size_t missing = levels.size();
    while (missing > 0 && !IsDirectory(path.Substring(0, levels[missing - 1]))) {
        --missing;
    }
    for (; missing < levels.size(); ++missing) {
        CreateOneDirectory(path.Substring(0, levels[missing]));
    }
    if (!isSound) {
        ThrowAt(exception::InvalidArgument(), module, __LINE__);
    }
}

void CreateOneDirectory(const String& path) {
    const int error = GetFileSystem().MakeFolder(path);
    if (error == EEXIST) {
        ThrowAt(exception::ObjectAlreadyExists(), module, __LINE__);
    }
    if (error != 0) {
        ThrowAt(exception::AccessDenied(path), module, __LINE__);
    }
}

}  // namespace qn::dsc::osdep
