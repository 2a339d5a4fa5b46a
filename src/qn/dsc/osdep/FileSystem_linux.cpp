#include "qn/dsc/osdep/FileSystem.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <climits>
#include <string>
#include <utility>

#include "qn/dsc/osdep/FolderSearch_linux.h"
#include "qn/dsc/osdep/FolderWalk_linux.h"
#include "qn/dsc/osdep/NativeFolder_linux.h"
#include "qn/dsc/osdep/NativePath.h"

namespace qn::dsc::osdep {

namespace {

constexpr mode_t ownerOnly = S_IRUSR | S_IWUSR;
constexpr mode_t everybody = S_IRUSR | S_IWUSR | S_IRGRP | S_IWGRP | S_IROTH | S_IWOTH;
constexpr mode_t everybodyInFolder = S_IRWXU | S_IRWXG | S_IRWXO;

// Calls `call(path)`, which gives 0 or an errno number, with the native path as it stands and, where nothing is there,
// with what differs from it only in letter case.
template <typename Call>
int CallBlindToCase(std::string& path, const Call& call) {
    const int error = call(path);
    if (error != ENOENT) {
        return error;
    }
    FolderNames* held = nullptr;
    return FindOtherCase(path, held) == Standing::Whole ? call(path) : ENOENT;
}

int ReadStatus(const String& path, struct stat& status) {
    NativePath native;
    const int error = MakeNativePath(path, native);
    if (error != 0) {
        return error;
    }
    return CallBlindToCase(native.text, [&](const std::string& text) {
        const PathStart start(text);
        if (start.Error() != 0) {
            return start.Error();
        }
        if (fstatat(start.Folder(), start.Rest(), &status, 0) != 0) {
            return errno;
        }
        return native.endsInSeparator && !S_ISDIR(status.st_mode) ? ENOTDIR : 0;
    });
}

int OpenNative(const std::string& path, int flags, mode_t permissions, int& descriptor) {
    const PathStart start(path);
    if (start.Error() != 0) {
        return start.Error();
    }
    descriptor = OpenAt(start.Folder(), start.Rest(), flags, permissions);
    return descriptor < 0 ? errno : 0;
}

// Opens what stands at `path`, blind to case; else, with O_CREAT among `flags`, creates it in a folder that stands.
int OpenOrCreate(std::string& path, int flags, mode_t permissions, int& descriptor) {
    const int error = OpenNative(path, flags & ~O_CREAT, permissions, descriptor);
    if (error != ENOENT) {
        return error;
    }
    FolderNames* held = nullptr;
    const Standing standing = FindOtherCase(path, held);
    if (standing == Standing::Less || (standing == Standing::AllButLast && (flags & O_CREAT) == 0)) {
        return ENOENT;
    }
    const int secondError = OpenNative(path, flags, permissions, descriptor);
    if (secondError == 0 && held != nullptr && standing == Standing::AllButLast) {
        held->Add(std::string_view(path).substr(path.rfind('/') + 1));
    }
    return secondError;
}

// What was opened without waiting must be readable or, for writing alone, may be anything that takes bytes.
int SettleOpened(int descriptor, int access) {
    if (access == O_WRONLY) {
        // The open may have emptied a file, so it is no failure any more if this doesn't work: to a file it means
        // nothing, and a pipe then fails where it is full.
        fcntl(descriptor, F_SETFL, 0);
        return 0;
    }
    struct stat status;
    if (fstat(descriptor, &status) != 0) {
        return errno;
    }
    return S_ISREG(status.st_mode) ? 0 : EACCES;
}

int OpenAny(const String& path, int access, int flags, mode_t permissions, FileHandle& file) {
    NativePath native;
    int error = MakeNativePath(path, native);
    if (error != 0 || native.endsInSeparator) {
        return error != 0 ? error : ENOENT;
    }
    // Without O_NONBLOCK a pipe would be waited for.
    int descriptor = -1;
    error = OpenOrCreate(native.text, access | flags | O_NONBLOCK | O_CLOEXEC | O_NOCTTY, permissions, descriptor);
    if (error == EISDIR) {
        return EACCES;
    }
    if (error == 0) {
        error = SettleOpened(descriptor, access);
        if (error == 0) {
            file = descriptor;
        } else {
            close(descriptor);
        }
    }
    return error;
}

int DescriptorOf(FileHandle file) {
    return static_cast<int>(file);
}

FolderSearch* SearchOf(SearchHandle search) {
    return reinterpret_cast<FolderSearch*>(search);
}

class NativeFileSystem final : public FileSystem {
  public:
    int ReadAttributes(const String& path, FileAttributes& attributes) override;
    int ReadIdentity(const String& path, FileIdentity& identity) override;
    int BeginSearch(const String& pattern, SearchHandle& search, String& firstName) override;
    int NextName(SearchHandle search, String& name) override;
    void EndSearch(SearchHandle search) override;
    int BeginWalk(const String& folder, const String& pattern, std::unique_ptr<FolderWalk>& walk) override;
    int MakeFolder(const String& path) override;
    int OpenBinary(const String& path, uint32_t mode, FileHandle& file) override;
    int OpenText(const String& path, TextMode mode, FileHandle& file) override;
    int ReadBytes(FileHandle file, void* buffer, size_t count, size_t& got) override;
    int WriteBytes(FileHandle file, const void* buffer, size_t count, size_t& put) override;
    int CutFile(FileHandle file, uint64_t length) override;
    int CloseFile(FileHandle file) override;
    int ReadWorkingFolder(String& path) override;
    int ReadExecutablePath(String& path) override;
    std::unique_ptr<FolderHold> HoldFolder(const String& folder) override;
};

int NativeFileSystem::ReadAttributes(const String& path, FileAttributes& attributes) {
    struct stat status;
    const int error = ReadStatus(path, status);
    if (error == 0) {
        attributes = {S_ISDIR(status.st_mode), NativeFileTime(status.st_mtim)};
    }
    return error;
}

int NativeFileSystem::ReadIdentity(const String& path, FileIdentity& identity) {
    struct stat status;
    const int error = ReadStatus(path, status);
    if (error == 0) {
        identity = {status.st_dev, status.st_ino};
    }
    return error;
}

int NativeFileSystem::BeginSearch(const String& pattern, SearchHandle& search, String& firstName) {
    NativePath native;
    int error = MakeNativePath(pattern, native);
    if (error != 0 || native.endsInSeparator || native.lastName.empty()) {
        return error != 0 ? error : ENOENT;
    }
    native.text.resize(std::max<size_t>(native.text.rfind('/'), 1));
    auto names = std::make_unique<FolderSearch>();
    error = CallBlindToCase(native.text, [&](const std::string& text) { return names->Read(text, native.lastName); });
    if (error == 0 && !names->Next(firstName)) {
        error = ENOENT;
    }
    if (error == 0) {
        search = reinterpret_cast<SearchHandle>(names.release());
    }
    return error;
}

int NativeFileSystem::NextName(SearchHandle search, String& name) {
    return SearchOf(search)->Next(name) ? 0 : ENOENT;
}

void NativeFileSystem::EndSearch(SearchHandle search) {
    const std::unique_ptr<FolderSearch> ended(SearchOf(search));
}

int NativeFileSystem::BeginWalk(const String& folder, const String& pattern, std::unique_ptr<FolderWalk>& walk) {
    auto begun = std::make_unique<NativeFolderWalk>(pattern);
    const int error = begun->Begin(folder);
    if (error == 0) {
        walk = std::move(begun);
    }
    return error;
}

int NativeFileSystem::MakeFolder(const String& path) {
    NativePath native;
    const int error = MakeNativePath(path, native);
    if (error != 0) {
        return error;
    }
    FolderNames* held = nullptr;
    switch (FindOtherCase(native.text, held)) {
        case Standing::Whole:
            return EEXIST;
        case Standing::Less:
            return ENOENT;
        case Standing::AllButLast:
            break;
    }
    const PathStart start(native.text);
    if (start.Error() != 0) {
        return start.Error();
    }
    if (mkdirat(start.Folder(), start.Rest(), everybodyInFolder) != 0) {
        return errno;
    }
    if (held != nullptr) {
        held->Add(std::string_view(native.text).substr(native.text.rfind('/') + 1));
    }
    return 0;
}

int NativeFileSystem::OpenBinary(const String& path, uint32_t mode, FileHandle& file) {
    int access = O_RDONLY;
    if ((mode & BinaryMode::ReadWrite) != 0) {
        access = O_RDWR;
    } else if ((mode & BinaryMode::Write) != 0) {
        access = O_WRONLY;
    }
    int flags = (mode & BinaryMode::Truncate) != 0 ? O_TRUNC : 0;
    flags |= (mode & BinaryMode::Create) != 0 ? O_CREAT : 0;
    return OpenAny(path, access, flags, ownerOnly, file);
}

int NativeFileSystem::OpenText(const String& path, TextMode mode, FileHandle& file) {
    if (mode == TextMode::Reading) {
        return OpenAny(path, O_RDONLY, 0, 0, file);
    }
    return OpenAny(path, O_WRONLY, O_CREAT | O_TRUNC, everybody, file);
}

int NativeFileSystem::ReadBytes(FileHandle file, void* buffer, size_t count, size_t& got) {
    ssize_t result = 0;
    do {
        result = read(DescriptorOf(file), buffer, count);
    } while (result < 0 && errno == EINTR);
    if (result < 0) {
        return errno;
    }
    got = static_cast<size_t>(result);
    return 0;
}

int NativeFileSystem::WriteBytes(FileHandle file, const void* buffer, size_t count, size_t& put) {
    ssize_t result = 0;
    do {
        result = write(DescriptorOf(file), buffer, count);
    } while (result < 0 && errno == EINTR);
    if (result < 0) {
        return errno;
    }
    put = static_cast<size_t>(result);
    return 0;
}

int NativeFileSystem::CutFile(FileHandle file, uint64_t length) {
    const auto end = static_cast<off_t>(length);
    int result = 0;
    do {
        // Sets the write time also where the length stays as it is.
        result = ftruncate(DescriptorOf(file), end);
    } while (result != 0 && errno == EINTR);
    return result != 0 || lseek(DescriptorOf(file), end, SEEK_SET) < 0 ? errno : 0;
}

int NativeFileSystem::CloseFile(FileHandle file) {
    // Not repeated after EINTR: the descriptor is free all the same.
    return close(DescriptorOf(file)) != 0 ? errno : 0;
}

int NativeFileSystem::ReadWorkingFolder(String& path) {
    std::string native;
    const int error = ReadNativeWorkingFolder(native);
    if (error == 0) {
        path = SystemPathFromNative(native);
    }
    return error;
}

int NativeFileSystem::ReadExecutablePath(String& path) {
    // The link has no length of its own to ask for.
    std::string native(PATH_MAX, '\0');
    const ssize_t length = readlink("/proc/self/exe", native.data(), native.size());
    if (length < 0) {
        return errno;
    }
    if (static_cast<size_t>(length) == native.size()) {
        return ENAMETOOLONG;
    }
    native.resize(static_cast<size_t>(length));
    path = SystemPathFromNative(native);
    return 0;
}

std::unique_ptr<FolderHold> NativeFileSystem::HoldFolder(const String& folder) {
    NativePath native;
    if (MakeNativePath(folder, native) != 0) {
        return nullptr;
    }
    FileIdentity identity;
    const int error = CallBlindToCase(
        native.text, [&identity](const std::string& text) { return ReadNativeIdentity(text, identity); });
    return error == 0 ? std::make_unique<FolderNames>(native.text, identity) : nullptr;
}

}  // namespace

FileSystem& GetNativeFileSystem() {
    // Never destroyed: exit handlers may still use files.
    static FileSystem& native = *new NativeFileSystem;
    return native;
}

}  // namespace qn::dsc::osdep
