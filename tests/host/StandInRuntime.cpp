#include "host/StandInRuntime.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <utility>

#include "qn/dsc/osdep/Export.h"
#include "zkfpga/host_runtime.h"

#define EXPORTED extern "C" ZKFPGA_EXPORT

EXPORTED StandInRuntime standInRuntime;
StandInRuntime standInRuntime;

namespace {

constexpr int32_t badArgument = 1;
constexpr int32_t notFound = 7;
constexpr int32_t typeOfBytes = 5;

[[noreturn]] void Misuse(const char* function, const char* what) {
    std::fprintf(stderr, "stand-in run-time: %s: %s\n", function, what);
    std::abort();
}

void* Allocate(size_t size) {
    void* const block = std::malloc(size == 0 ? 1 : size);
    if (block == nullptr) {
        std::abort();
    }
    return block;
}

// Gives the block a new place and size. New bytes are `fill`.
void Move(char** handle, size_t size, int fill) {
    size_t& held = standInRuntime.blockSizes.at(handle);
    char* const block = static_cast<char*>(Allocate(size));
    std::memcpy(block, *handle, std::min(held, size));
    if (size > held) {
        std::memset(block + held, fill, size - held);
    }
    std::free(*handle);
    *handle = block;
    held = size;
}

ZkHandle NewHandle(size_t size, int fill) {
    ZkHandle handle = static_cast<ZkHandle>(Allocate(sizeof(char*)));
    *handle = static_cast<char*>(Allocate(0));
    standInRuntime.blockSizes[handle] = 0;
    Move(handle, size, fill);
    return handle;
}

void RequireHandle(const char* function, ZkHandle handle) {
    if (standInRuntime.blockSizes.count(handle) == 0) {
        Misuse(function, "no handle of this run-time");
    }
}

StandInPath& RequirePath(const char* function, ZkPath path) {
    StandInPath* const known = static_cast<StandInPath*>(path);
    if (standInRuntime.paths.count(known) == 0) {
        Misuse(function, "no path of this run-time");
    }
    return *known;
}

// Every function begins with this. The code that the call is to fail with; 0 if it isn't to fail.
int32_t Enter(const char* function, const std::string& arguments = {}) {
    standInRuntime.calls.push_back(function + (arguments.empty() ? "" : " " + arguments));
    if (standInRuntime.movesAllBlocks) {
        for (const auto& [handle, size] : standInRuntime.blockSizes) {
            Move(handle, size, 0);
        }
    }
    const auto fault = standInRuntime.faults.find({function, ++standInRuntime.counts[function]});
    return fault == standInRuntime.faults.end() ? 0 : fault->second;
}

void ResizeOrMake(const char* function, ZkHandle* handle, size_t size, int fill) {
    if (*handle == nullptr) {
        *handle = NewHandle(size, fill);
        return;
    }
    RequireHandle(function, *handle);
    Move(*handle, size, fill);
}

void StoreString(const char* function, const std::string& text, ZkHandle* handle) {
    const int32_t length = static_cast<int32_t>(text.size());
    ResizeOrMake(function, handle, sizeof length + text.size(), 0);
    std::memcpy(**handle, &length, sizeof length);
    std::memcpy(**handle + sizeof length, text.data(), text.size());
}

}  // namespace

EXPORTED int32_t HostSetHandleSizeClear(ZkHandle handle, size_t size) {
    const int32_t fault = Enter(__func__, std::to_string(size));
    RequireHandle(__func__, handle);
    if (fault == 0) {
        Move(handle, size, 0);
    }
    return fault;
}

EXPORTED int32_t HostDisposeHandle(ZkHandle handle) {
    const int32_t fault = Enter(__func__);
    if (handle == nullptr || fault != 0) {
        return fault;
    }
    RequireHandle(__func__, handle);
    standInRuntime.blockSizes.erase(handle);
    std::free(*handle);
    std::free(static_cast<void*>(handle));
    return 0;
}

EXPORTED ZkHandle HostNewHandleClear(size_t size) {
    return Enter(__func__, std::to_string(size)) == 0 ? NewHandle(size, 0) : nullptr;
}

EXPORTED uint8_t HostGetErrorText(int32_t code, ZkHandle* text) {
    const int32_t fault = Enter(__func__, std::to_string(code));
    if (*text != nullptr) {
        Misuse(__func__, "the text isn't null");
    }
    using Answer = StandInRuntime::ErrorText;
    if (standInRuntime.errorTextAnswer == Answer::TrueWithoutText) {
        return 1;
    }
    const auto known = standInRuntime.errorTexts.find(code);
    if (fault != 0 || known == standInRuntime.errorTexts.end()) {
        return 0;
    }
    StoreString(__func__, known->second, text);
    return standInRuntime.errorTextAnswer == Answer::FalseWithText ? 0 : 1;
}

EXPORTED int32_t HostResizeArray(int32_t typeCode, int32_t dimensions, ZkHandle* array, size_t size) {
    const int32_t fault =
        Enter(__func__, std::to_string(typeCode) + " " + std::to_string(dimensions) + " " + std::to_string(size));
    if (typeCode != typeOfBytes || dimensions != 1) {
        return badArgument;
    }
    if (fault == 0) {
        ResizeOrMake(__func__, array, sizeof(int32_t) + size, 0xCD);
    }
    return fault;
}

EXPORTED void HostGetLanguageName(unsigned char* buffer) {
    Enter(__func__);
    const std::string& language = standInRuntime.language;
    buffer[0] = static_cast<unsigned char>(language.size());
    std::memcpy(buffer + 1, language.data(), buffer[0]);
    const std::string& further = standInRuntime.behindTheLanguage;
    std::memcpy(buffer + 1 + buffer[0], further.data(), std::min<size_t>(further.size(), 255U - buffer[0]));
}

EXPORTED HRESULT QueryInterfaceForZKRefNum(uint32_t refNum, GUID interfaceId, void** result) {
    const int32_t fault = Enter(__func__, std::to_string(refNum));
    *result = nullptr;
    if (fault != 0 || !standInRuntime.queryInterface) {
        return fault != 0 ? fault : E_NOINTERFACE;
    }
    std::array<uint8_t, 16> id;
    std::memcpy(id.data(), &interfaceId, id.size());
    return standInRuntime.queryInterface(refNum, id, result);
}

EXPORTED ZkPath HostEmptyPath(ZkPath path) {
    Enter(__func__);
    if (path == nullptr) {
        StandInPath* const made = new StandInPath;
        standInRuntime.paths.insert(made);
        return made;
    }
    RequirePath(__func__, path).text.clear();
    return path;
}

EXPORTED int32_t HostPathToString(ZkPath path, ZkHandle* text) {
    const int32_t fault = Enter(__func__);
    const StandInPath& known = RequirePath(__func__, path);
    if (fault == 0 && !standInRuntime.givesNoPathText) {
        StoreString(__func__, known.text, text);
    }
    return fault;
}

EXPORTED int32_t HostGetSpecialDir(int32_t code, ZkPath path) {
    const int32_t fault = Enter(__func__, std::to_string(code));
    StandInPath& known = RequirePath(__func__, path);
    if (fault != 0) {
        return fault;
    }
    const auto directory = standInRuntime.specialDirectories.find(code);
    if (directory == standInRuntime.specialDirectories.end()) {
        return notFound;
    }
    known.text = directory->second;
    return 0;
}

EXPORTED void HostDestroyPath(ZkPath path) {
    Enter(__func__);
    StandInPath* const known = &RequirePath(__func__, path);
    standInRuntime.paths.erase(known);
    delete known;
}

EXPORTED int32_t HostTextToPath(const char* text, size_t length, ZkPath path) {
    const int32_t fault = Enter(__func__, std::string(text, length));
    StandInPath& known = RequirePath(__func__, path);
    if (fault == 0) {
        known.text = std::string(text, length);
    }
    return fault;
}

EXPORTED int32_t HostSystemTextToPath(const char* text, ZkPath path) {
    const int32_t fault = Enter(__func__, text);
    StandInPath& known = RequirePath(__func__, path);
    if (fault == 0) {
        known.text = text;
    }
    return fault;
}

// Part of the table, but nobody may call them.
#define EXPORTED_BUT_NOT_CALLED(name) \
    EXPORTED void name();             \
    void name() {                     \
        Misuse(#name, "called");      \
    }

EXPORTED_BUT_NOT_CALLED(HostCopyFile)
EXPORTED_BUT_NOT_CALLED(HostMoveFile)
EXPORTED_BUT_NOT_CALLED(HostRemoveFile)
EXPORTED_BUT_NOT_CALLED(HostFileExists)
EXPORTED_BUT_NOT_CALLED(HostArchiveHoldsFile)
EXPORTED_BUT_NOT_CALLED(HostDirName)
EXPORTED_BUT_NOT_CALLED(HostNamePointer)
EXPORTED_BUT_NOT_CALLED(HostClonePath)
EXPORTED_BUT_NOT_CALLED(HostFileInPackedLibrary)
EXPORTED_BUT_NOT_CALLED(HostPathToSystemString)
