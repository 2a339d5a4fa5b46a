#pragma once

// The table of the host's functions, one row each, and how a row is bound: by name, to the run-time module that answers
// at the moment of the call (RuntimeModule.h). Nothing is set up at start.

#include <cstdint>

#include "qn/dsc/osdep/Module.h"

namespace zkhw {

// Rows have one size: they stand one behind the other without a gap, and a host's tools find row n by its number.
struct HostFunctionRecord {
    qn::dsc::osdep::CodePointer function;  // Null until it is bound.
    qn::dsc::osdep::ModuleHandle module;   // Where `function` was looked for; null at first.
    char name[32];                         // Of the export, NUL-terminated.
};

static_assert(sizeof(HostFunctionRecord) == 2 * sizeof(void*) + 32, "rows have no padding of their own");

// The rows in order. Those that no stub calls (HostFunctions.h) are there because the table is what was agreed with
// the run-time: a row keeps its number whether this system calls it or not.
enum class HostFunction : uint32_t {
    HostSetHandleSizeClear,
    HostDisposeHandle,
    HostNewHandleClear,
    HostGetErrorText,
    HostResizeArray,
    HostGetLanguageName,
    QueryInterfaceForZKRefNum,
    HostEmptyPath,
    HostPathToString,
    HostGetSpecialDir,
    HostCopyFile,
    HostMoveFile,
    HostRemoveFile,
    HostFileExists,
    HostDestroyPath,
    HostArchiveHoldsFile,
    HostDirName,
    HostNamePointer,
    HostClonePath,
    HostFileInPackedLibrary,
    HostPathToSystemString,
    HostTextToPath,
    HostSystemTextToPath,
    Count,
};

constexpr uint32_t hostFunctionCount = static_cast<uint32_t>(HostFunction::Count);

// Any thread may bind a row; it is written without a lock, field by field.
extern HostFunctionRecord hostFunctions[hostFunctionCount];

inline HostFunctionRecord& RecordOf(HostFunction function) {
    return hostFunctions[static_cast<uint32_t>(function)];
}

// Returns only if `record.function` may be called: it is then that of the run-time module that answers now. Otherwise
// tells the user what is missing and ends the process with exit code 1 (osdep/FatalError.h).
void ResolveHostFunction(HostFunctionRecord& record);

}  // namespace zkhw
