#pragma once

// The functions of the host's run-time that this system calls, each a stub that binds its row of the table at every
// call (HostFunctionTable.h) and goes on to the host's function with the caller's arguments. A call without a run-time
// module, or with one that lacks the function, ends the process with a message; ask FindRuntimeModule first where that
// is not wanted. What a run-time owes its callers stands in zkfpga/host_runtime.h.

#include <cstddef>
#include <cstdint>
#include <type_traits>

#include "qn/dsc/Guid.h"

namespace zkhw {

// A block of the host's memory: a pointer to the pointer to it. Any call of the host may move the block.
using HostHandle = char**;
// A path of the host.
using HostPathReference = void*;

static_assert(std::is_trivially_copyable_v<qn::dsc::Guid>, "passed by value as C passes a GUID");

// Makes the block `size` bytes; new ones are 0. 0 or the host's error code, as all results called codes below.
int32_t HostSetHandleSizeClear(HostHandle handle, size_t size);

// Frees the block and its handle. A code.
int32_t HostDisposeHandle(HostHandle handle);

// A new block of `size` bytes, all 0; null if there is no memory.
HostHandle HostNewHandleClear(size_t size);

// 1, and a new string with the host's words for `code`, which the caller disposes of; 0 if there are none.
uint8_t HostGetErrorText(int32_t code, HostHandle* text);

// Makes room for `size` elements in the array `*array`, which is made if it is null; the count in the block is the
// caller's to set. A code: `*array` is as it was if it isn't 0. This system has arrays of bytes (below) alone.
int32_t HostResizeArray(int32_t typeCode, int32_t dimensions, HostHandle* array, size_t size);
constexpr int32_t hostTypeOfBytes = 5;

// Writes the host's language name into `buffer`, which has room for 256 bytes at least: a length byte, then the text.
void HostGetLanguageName(unsigned char* buffer);

// The interface `interfaceId` of the object that the host knows by `refNum`, with a reference that the caller releases.
// A result code: negative if there is none, and `*result` is null then.
int32_t QueryInterfaceForZKRefNum(uint32_t refNum, qn::dsc::Guid interfaceId, void** result);

// Makes `path` empty, or a new empty path if it is null; gives it.
HostPathReference HostEmptyPath(HostPathReference path);

// Writes the text of `path` into the string `*text`, which is made if it is null. A code.
int32_t HostPathToString(HostPathReference path, HostHandle* text);

// Writes the host's special directory `code` into `path`. A code.
int32_t HostGetSpecialDir(int32_t code, HostPathReference path);

void HostDestroyPath(HostPathReference path);

// Makes `path` the one that `length` bytes of text in the host's own form name. A code: `path` is as it was if it
// isn't 0.
int32_t HostTextToPath(const char* text, size_t length, HostPathReference path);

// The same for NUL-terminated text in the form of the file system.
int32_t HostSystemTextToPath(const char* text, HostPathReference path);

}  // namespace zkhw
