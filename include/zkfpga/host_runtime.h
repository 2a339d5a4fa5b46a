/* What a host's run-time exports for this library, for those who make one. The library imports nothing: it finds the
 * run-time module when it needs it, looks each function up by the name below, and calls it. A function that is needed
 * but not exported ends the process with a message, so export all that have a prototype here. Plain C.
 *
 * Where the run-time is looked for, at every call; the first that there is answers:
 *   1. the module in the calling thread's slot, if SetZKRTTLSIndex named one;
 *   2. the module that SetZKRTModule named;
 *   3. the main module of the process, if it exports gZKRTVersion or HostNewHandle;
 *   4. the loaded module zkrt.dll (on Linux libzkrt.so), or else zkffrt.dll (libzkffrt.so).
 * Modules are never loaded for this. Without a run-time the library works by itself: texts are English, and targets are
 * those beside the executable.
 *
 * Memory. host_data.h says what handles, strings and arrays are. Sizes are in bytes. The library sets the lengths of
 * strings and the counts of arrays itself.
 *
 * Codes. A function that gives a code gives 0 for success and otherwise one of the host's own error codes, and has then
 * changed nothing. 1 is a wrong argument and 2 no memory: the library itself reports these two. No exception may leave
 * any of these functions. They are called on whatever thread calls the library. */
#ifndef ZKFPGA_HOST_RUNTIME_H
#define ZKFPGA_HOST_RUNTIME_H

#include <stddef.h>  // NOLINT(modernize-deprecated-headers): for C, too
#include <stdint.h>  // NOLINT(modernize-deprecated-headers): for C, too

#include "zkfpga/host_data.h"
#include "zkfpga/types.h"

#ifdef __cplusplus
extern "C" {
#endif

/* A path of the host. What it points to is the run-time's. */
typedef void* ZkPath;

/* 1. Makes the block `size` bytes; what fits of the content stays, new bytes are 0. A code. */
int32_t HostSetHandleSizeClear(ZkHandle handle, size_t size);

/* 2. Frees the block and the handle; for null it does nothing and gives 0. A code. */
int32_t HostDisposeHandle(ZkHandle handle);

/* 3. A new handle to `size` bytes, all 0; null if there is no memory. */
ZkHandle HostNewHandleClear(size_t size);

/* 4. 1, and in `*text` a new string with the words for the error `code`, which the caller disposes of; 0 if there are
 * none. `*text` is null before. */
uint8_t HostGetErrorText(int32_t code, ZkHandle* text);

/* 5. Makes room for `size` elements in a numeric array, behind its 32-bit count, which stays. A null `*array` becomes a
 * new handle, whose count may be anything. The library asks for arrays of bytes alone, which is what strings are:
 * `typeCode` is 5 and `dimensions` 1. A code. */
int32_t HostResizeArray(int32_t typeCode, int32_t dimensions, ZkHandle* array, size_t size);

/* 6. Writes the name of the host's language into `buffer`, which has room for 256 bytes at least: a byte that holds the
 * length, and the text. "English", "Japanese" and "ChineseS" are known, in any letter case; any other counts as
 * English. Asked once for a process. */
void HostGetLanguageName(unsigned char* buffer);

/* 7. Gives the interface `interfaceId` of what the host knows by the reference `refNum` in `*result`, with one
 * reference for the caller. The library asks for IzkhwResourceTreeNode4. S_OK, or a negative result and a null
 * `*result`. */
HRESULT QueryInterfaceForZKRefNum(uint32_t refNum, GUID interfaceId, void** result);

/* 8. Makes `path` an empty path and gives it; for null, gives a new empty path. Never null. */
ZkPath HostEmptyPath(ZkPath path);

/* 9. Writes the text of `path` into the string `*text`; a null `*text` becomes a new handle. On Linux the text may be a
 * native path, or one with a drive and backslashes. A code; the caller disposes of `*text` either way. */
int32_t HostPathToString(ZkPath path, ZkHandle* text);

/* 10. Makes `path` the host's special folder `code`: 0, 1, 3 to 10, 13 to 19, or 21 to 28. The library asks for 28, the
 * folder of the targets. A code. */
int32_t HostGetSpecialDir(int32_t code, ZkPath path);

/* 15. Frees `path`. */
void HostDestroyPath(ZkPath path);

/* 22. Makes `path` the one that `length` bytes of text in the host's own form name. A code. */
int32_t HostTextToPath(const char* text, size_t length, ZkPath path);

/* 23. The same for NUL-terminated text in the form of the file system. A code. */
int32_t HostSystemTextToPath(const char* text, ZkPath path);

/* These are part of the table but the library has no call of them. They have no prototype here, and need not be there:
 *   11. HostCopyFile             copies a file
 *   12. HostMoveFile             moves a file
 *   13. HostRemoveFile           removes a file
 *   14. HostFileExists           tests for a file
 *   16. HostArchiveHoldsFile     tests for a file in an archive
 *   17. HostDirName              the folder of a path
 *   18. HostNamePointer          the name of a path
 *   19. HostClonePath            copies a path
 *   20. HostFileInPackedLibrary  tests for a file in a packed library
 *   21. HostPathToSystemString   the text of a path in the form of the file system */

#ifdef __cplusplus
}
#endif

#endif
