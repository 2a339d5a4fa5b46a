#include "hostbridge/HostFunctionTable.h"

#include <cstdio>

#include "hostbridge/RuntimeModule.h"
#include "qn/dsc/osdep/FatalError.h"

namespace zkhw {

using qn::dsc::osdep::FatalError;
using qn::dsc::osdep::FindExport;

constinit HostFunctionRecord hostFunctions[] = {
    {nullptr, nullptr, "HostSetHandleSizeClear"},
    {nullptr, nullptr, "HostDisposeHandle"},
    {nullptr, nullptr, "HostNewHandleClear"},
    {nullptr, nullptr, "HostGetErrorText"},
    {nullptr, nullptr, "HostResizeArray"},
    {nullptr, nullptr, "HostGetLanguageName"},
    {nullptr, nullptr, "QueryInterfaceForZKRefNum"},
    {nullptr, nullptr, "HostEmptyPath"},
    {nullptr, nullptr, "HostPathToString"},
    {nullptr, nullptr, "HostGetSpecialDir"},
    {nullptr, nullptr, "HostCopyFile"},
    {nullptr, nullptr, "HostMoveFile"},
    {nullptr, nullptr, "HostRemoveFile"},
    {nullptr, nullptr, "HostFileExists"},
    {nullptr, nullptr, "HostDestroyPath"},
    {nullptr, nullptr, "HostArchiveHoldsFile"},
    {nullptr, nullptr, "HostDirName"},
    {nullptr, nullptr, "HostNamePointer"},
    {nullptr, nullptr, "HostClonePath"},
    {nullptr, nullptr, "HostFileInPackedLibrary"},
    {nullptr, nullptr, "HostPathToSystemString"},
    {nullptr, nullptr, "HostTextToPath"},
    {nullptr, nullptr, "HostSystemTextToPath"},
};

void ResolveHostFunction(HostFunctionRecord& record) {
    const ModuleHandle module = FindRuntimeModule();
    if (module == nullptr) {
        FatalError("ZARVIKV.LIB was not called from a Zarvik process.");
    }
    if (module != record.module || record.function == nullptr) {
        record.function = FindExport(module, record.name);
        record.module = module;
    }
    if (record.function != nullptr) {
        return;
    }
    char message[300];
    std::snprintf(message, sizeof message, "ZARVIKV.LIB could not locate \"%s\".", record.name);
    FatalError(message);
}

}  // namespace zkhw
