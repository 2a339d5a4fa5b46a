#pragma once

// The functions of the host's run-time that this system calls. Each is found by name in the run-time module at every
// call, and bound anew when another module answers. A call without a run-time module, or with one that lacks the
// function, ends the process with a message (osdep/FatalError.h); ask FindRuntimeModule first where that is not wanted.

#include "qn/dsc/osdep/Module.h"

namespace zkhw {

struct HostFunctionRecord {
    qn::dsc::osdep::CodePointer function;  // Null until it is bound.
    qn::dsc::osdep::ModuleHandle module;   // Where `function` was found.
    char name[28];                         // Of the export.
};

// Returns only if `record.function` may be called. Written without a lock.
void ResolveHostFunction(HostFunctionRecord& record);

// Writes the host's language name into `buffer`, which has room for 256 bytes at least: a length byte, then the text.
void HostGetLanguageName(unsigned char* buffer);

}  // namespace zkhw
