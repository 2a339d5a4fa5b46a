#pragma once

// The functions of the host's run-time that this system calls. Each is found by name in the run-time module at every
// call, and bound anew when another module answers. A call without a run-time module, or with one that lacks the
// function, ends the process with a message (osdep/FatalError.h); ask FindRuntimeModule first where that is not wanted.

#include <cstdint>

#include "qn/dsc/osdep/Module.h"

namespace zkhw {

struct HostFunctionRecord {
    qn::dsc::osdep::CodePointer function;  // Null until it is bound.
    qn::dsc::osdep::ModuleHandle module;   // Where `function` was found.
    char name[28];                         // Of the export.
};

// Returns only if `record.function` may be called. Written without a lock.
void ResolveHostFunction(HostFunctionRecord& record);

// A block of the host's memory that may move: a pointer to the pointer to it.
using HostHandle = char**;
// A path of the host.
using HostPathReference = void*;

// Frees a block. 0 or the host's error code, as all results below.
int32_t HostDisposeHandle(HostHandle handle);

// Writes the host's language name into `buffer`, which has room for 256 bytes at least: a length byte, then the text.
void HostGetLanguageName(unsigned char* buffer);

// Makes `path` empty, or a new empty path if it is null; gives it.
HostPathReference HostEmptyPath(HostPathReference path);

void HostDestroyPath(HostPathReference path);

// Writes the text of `path` into the string `*text`, which is made if it is null.
int32_t HostPathToString(HostPathReference path, HostHandle* text);

// Writes the host's special directory `code` into `path`.
int32_t HostGetSpecialDir(int32_t code, HostPathReference path);

}  // namespace zkhw
