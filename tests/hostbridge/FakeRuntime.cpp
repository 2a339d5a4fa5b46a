#include "hostbridge/FakeRuntime.h"

#include <cstdlib>
#include <cstring>

#define EXPORTED extern "C" __attribute__((visibility("default")))

EXPORTED FakeRuntime fakeRuntime;
FakeRuntime fakeRuntime{"English", "", 0, 0, false, 0, -1, 0, 0};

namespace {
int32_t thePath = 0;
}

EXPORTED int32_t HostDisposeHandle(char** handle);
int32_t HostDisposeHandle(char** handle) {
    --fakeRuntime.openHandles;
    std::free(*handle);
    std::free(handle);
    return 0;
}

EXPORTED void HostGetLanguageName(unsigned char* buffer);
void HostGetLanguageName(unsigned char* buffer) {
    ++fakeRuntime.languageCalls;
    const size_t length = std::strlen(fakeRuntime.language);
    buffer[0] = static_cast<unsigned char>(length);
    std::memcpy(buffer + 1, fakeRuntime.language, length);
}

EXPORTED void* HostEmptyPath(void* path);
void* HostEmptyPath(void* path) {
    if (path != nullptr) {
        return path;
    }
    ++fakeRuntime.openPaths;
    return &thePath;
}

EXPORTED void HostDestroyPath(void* path);
void HostDestroyPath(void* path) {
    fakeRuntime.openPaths -= path == &thePath ? 1 : 1000;
}

EXPORTED int32_t HostPathToString(void* path, char*** text);
int32_t HostPathToString(void* path, char*** text) {
    if (path != &thePath || fakeRuntime.pathToStringError != 0) {
        return fakeRuntime.pathToStringError;
    }
    if (fakeRuntime.givesNoText) {
        return 0;
    }
    const int32_t length = static_cast<int32_t>(std::strlen(fakeRuntime.directory));
    *text = static_cast<char**>(std::malloc(sizeof(char*)));
    **text = static_cast<char*>(std::malloc(sizeof length + static_cast<size_t>(length)));
    std::memcpy(**text, &length, sizeof length);
    std::memcpy(**text + sizeof length, fakeRuntime.directory, static_cast<size_t>(length));
    ++fakeRuntime.openHandles;
    return 0;
}

EXPORTED int32_t HostGetSpecialDir(int32_t code, void* path);
int32_t HostGetSpecialDir(int32_t code, void* path) {
    fakeRuntime.askedCode = path == &thePath ? code : -2;
    return fakeRuntime.specialDirectoryError;
}
