/* A run-time of a host that takes all its memory from malloc, and so goes on working where a test lets the library run
 * out of memory. Special folder 28 is what `specialFolder` says. The reference 77 stands for `objectOfRefNum`, which
 * goes to who asks, with the reference that it has. */
#include <stdint.h>
#include <stdlib.h>
#include <string.h>

#include "qn/dsc/osdep/Export.h"
#include "zkfpga/host_runtime.h"

#define EXPORTED ZKFPGA_EXPORT

EXPORTED extern char specialFolder[4096];
EXPORTED extern int liveHandles;
EXPORTED extern void* objectOfRefNum;
char specialFolder[4096];
int liveHandles;
void* objectOfRefNum;

/* In front of the content of each block. */
struct BlockHead {
    size_t size;
};

static char* Resize(char* block, size_t size) {
    struct BlockHead* head = block == NULL ? NULL : (struct BlockHead*)(void*)block - 1;
    const size_t held = head == NULL ? 0 : head->size;
    head = realloc(head, sizeof *head + size);
    if (head == NULL) {
        abort();
    }
    head->size = size;
    if (size > held) {
        memset((char*)(head + 1) + held, 0, size - held);
    }
    return (char*)(head + 1);
}

EXPORTED int32_t HostSetHandleSizeClear(ZkHandle handle, size_t size) {
    *handle = Resize(*handle, size);
    return 0;
}

EXPORTED ZkHandle HostNewHandleClear(size_t size) {
    ZkHandle handle = malloc(sizeof *handle);
    if (handle == NULL) {
        abort();
    }
    *handle = Resize(NULL, size);
    ++liveHandles;
    return handle;
}

EXPORTED int32_t HostDisposeHandle(ZkHandle handle) {
    if (handle != NULL) {
        free((struct BlockHead*)(void*)*handle - 1);
        free(handle);
        --liveHandles;
    }
    return 0;
}

EXPORTED uint8_t HostGetErrorText(int32_t code, ZkHandle* text) {
    (void)code;
    (void)text;
    return 0;
}

EXPORTED int32_t HostResizeArray(int32_t typeCode, int32_t dimensions, ZkHandle* array, size_t size) {
    (void)typeCode;
    (void)dimensions;
    if (*array == NULL) {
        *array = HostNewHandleClear(0);
    }
    return HostSetHandleSizeClear(*array, sizeof(int32_t) + size);
}

EXPORTED void HostGetLanguageName(unsigned char* buffer) {
    buffer[0] = 0;
}

EXPORTED ZkPath HostEmptyPath(ZkPath path) {
    return path == NULL ? specialFolder : path;
}

EXPORTED int32_t HostPathToString(ZkPath path, ZkHandle* text) {
    const int32_t length = (int32_t)strlen(path);
    HostResizeArray(5, 1, text, (size_t)length);
    memcpy(**text, &length, sizeof length);
    memcpy(**text + sizeof length, path, (size_t)length);
    return 0;
}

EXPORTED int32_t HostGetSpecialDir(int32_t code, ZkPath path) {
    (void)path;
    return code == 28 ? 0 : 7;
}

EXPORTED void HostDestroyPath(ZkPath path) {
    (void)path;
}

EXPORTED HRESULT QueryInterfaceForZKRefNum(uint32_t refNum, GUID interfaceId, void** result) {
    (void)interfaceId;
    *result = refNum == 77 ? objectOfRefNum : NULL;
    objectOfRefNum = refNum == 77 ? NULL : objectOfRefNum;
    return *result == NULL ? E_NOINTERFACE : S_OK;
}
