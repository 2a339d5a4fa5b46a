/* A host's run-time at its smallest: handles, strings, paths, a language, error texts and one special folder. The
 * library looks for these functions by name in the executable, which therefore has to export them (-rdynamic). Blocks
 * are made by calloc, and a path is one text. */

#include "runtime.h"

#include <stdio.h>
#include <stdlib.h>
#include <string.h>

/* The library takes an executable for a run-time if it exports this name. Its value isn't read. */
extern const int32_t gZKRTVersion;
const int32_t gZKRTVersion = 1;

enum { wrongArgument = 1, noMemory = 2, typeOfBytes = 5, targetsFolder = 28 };

static const char* installationFolder = ".";

void SetInstallationFolder(const char* folder) {
    installationFolder = folder;
}

/* --- Handles. The handle is the address of `bytes`, so the block may move while the handle stays. --- */

typedef struct Block {
    char* bytes;
    size_t size;
} Block;

static Block* BlockOf(ZkHandle handle) {
    return (Block*)(void*)handle;
}

ZkHandle HostNewHandleClear(size_t size) {
    Block* const block = malloc(sizeof *block);
    char* const bytes = calloc(1, size + 1); /* one more: calloc may give null for 0 */
    if (block == NULL || bytes == NULL) {
        free(block);
        free(bytes);
        return NULL;
    }
    block->bytes = bytes;
    block->size = size;
    return &block->bytes;
}

int32_t HostSetHandleSizeClear(ZkHandle handle, size_t size) {
    Block* const block = BlockOf(handle);
    char* const bytes = realloc(block->bytes, size + 1);
    if (bytes == NULL) {
        return noMemory;
    }
    if (size > block->size) {
        memset(bytes + block->size, 0, size - block->size);
    }
    block->bytes = bytes;
    block->size = size;
    return 0;
}

int32_t HostDisposeHandle(ZkHandle handle) {
    if (handle != NULL) {
        free(*handle);
        free(BlockOf(handle));
    }
    return 0;
}

int32_t HostResizeArray(int32_t typeCode, int32_t dimensions, ZkHandle* array, size_t size) {
    if (typeCode != typeOfBytes || dimensions != 1) {
        return wrongArgument;
    }
    if (*array == NULL) {
        *array = HostNewHandleClear(sizeof(int32_t) + size);
        return *array == NULL ? noMemory : 0;
    }
    return HostSetHandleSizeClear(*array, sizeof(int32_t) + size);
}

/* --- Strings: an int32_t, the length, and the bytes. --- */

static int32_t StoreString(const char* text, ZkHandle* string) {
    const int32_t length = (int32_t)strlen(text);
    const int32_t error = HostResizeArray(typeOfBytes, 1, string, (size_t)length);
    if (error == 0) {
        memcpy(**string, &length, sizeof length);
        memcpy(**string + sizeof length, text, (size_t)length);
    }
    return error;
}

ZkStringHandle NewString(void) {
    const ZkStringHandle string = HostNewHandleClear(sizeof(int32_t));
    if (string == NULL) {
        abort();
    }
    return string;
}

size_t StringLength(ZkStringHandle string) {
    int32_t length = 0;
    if (string != NULL) {
        memcpy(&length, *string, sizeof length);
    }
    return (size_t)length;
}

const char* StringBytes(ZkStringHandle string) {
    return string == NULL ? "" : *string + sizeof(int32_t);
}

/* --- Arrays of strings: an int32_t, the count, and the handles, aligned as a compiler aligns them. --- */

typedef struct StringArray {
    int32_t count;
    ZkStringHandle strings[1];
} StringArray;

size_t ArrayCount(ZkStringArrayHandle array) {
    return array == NULL ? 0 : (size_t)((const StringArray*)(void*)*array)->count;
}

ZkStringHandle ArrayElement(ZkStringArrayHandle array, size_t index) {
    ZkStringHandle string;
    memcpy(&string, *array + offsetof(StringArray, strings) + index * sizeof string, sizeof string);
    return string;
}

void DisposeStringArray(ZkStringArrayHandle array) {
    for (size_t i = 0; i < ArrayCount(array); ++i) {
        HostDisposeHandle(ArrayElement(array, i));
    }
    HostDisposeHandle(array);
}

/* --- Paths: one text. --- */

typedef struct Path {
    char* text;
} Path;

static int32_t SetPathText(Path* path, const char* text, size_t length) {
    char* const copy = malloc(length + 1);
    if (copy == NULL) {
        return noMemory;
    }
    memcpy(copy, text, length);
    copy[length] = '\0';
    free(path->text);
    path->text = copy;
    return 0;
}

/* The library relies on a path: there is no way to report that there is no memory for one. */
ZkPath HostEmptyPath(ZkPath path) {
    Path* result = path;
    if (result == NULL) {
        result = calloc(1, sizeof *result);
    }
    if (result == NULL || SetPathText(result, "", 0) != 0) {
        abort();
    }
    return result;
}

void HostDestroyPath(ZkPath path) {
    if (path != NULL) {
        free(((Path*)path)->text);
        free(path);
    }
}

int32_t HostPathToString(ZkPath path, ZkHandle* text) {
    return StoreString(((Path*)path)->text, text);
}

int32_t HostTextToPath(const char* text, size_t length, ZkPath path) {
    return SetPathText(path, text, length);
}

int32_t HostSystemTextToPath(const char* text, ZkPath path) {
    return SetPathText(path, text, strlen(text));
}

/* The one folder that the library asks for. Its text is a native path here. */
int32_t HostGetSpecialDir(int32_t code, ZkPath path) {
    /* With the separator that the folder itself is written with. */
    const char* const below = strchr(installationFolder, '\\') != NULL ? "\\Targets" : "/Targets";
    if (code != targetsFolder) {
        return wrongArgument;
    }
    const size_t length = strlen(installationFolder);
    char* const text = malloc(length + strlen(below) + 1);
    if (text == NULL) {
        return noMemory;
    }
    memcpy(text, installationFolder, length);
    memcpy(text + length, below, strlen(below) + 1);
    const int32_t error = SetPathText(path, text, strlen(text));
    free(text);
    return error;
}

/* --- The rest. --- */

/* "English", "Japanese" or "ChineseS", as a length byte and the text. Asked once. */
void HostGetLanguageName(unsigned char* buffer) {
    const char* const chosen = getenv("BROWSE_LANGUAGE");
    const char* const name = chosen != NULL && strlen(chosen) < 256 ? chosen : "English";
    buffer[0] = (unsigned char)strlen(name);
    memcpy(buffer + 1, name, buffer[0]);
}

uint8_t HostGetErrorText(int32_t code, ZkHandle* text) {
    if (code != wrongArgument && code != noMemory) {
        return 0;
    }
    return StoreString(code == noMemory ? "There is no memory." : "An argument is wrong.", text) == 0;
}

/* This host hands out no references to its objects. */
HRESULT QueryInterfaceForZKRefNum(uint32_t refNum, GUID interfaceId, void** result) {
    (void)refNum;
    (void)interfaceId;
    *result = NULL;
    return E_NOINTERFACE;
}
