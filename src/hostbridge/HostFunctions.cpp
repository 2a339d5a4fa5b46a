#include "hostbridge/HostFunctions.h"

#include <cstdio>

#include "hostbridge/RuntimeModule.h"
#include "qn/dsc/osdep/FatalError.h"

namespace zkhw {

using qn::dsc::osdep::FatalError;
using qn::dsc::osdep::FindExport;

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

void HostGetLanguageName(unsigned char* buffer) {
    static HostFunctionRecord record{nullptr, nullptr, "HostGetLanguageName"};
    ResolveHostFunction(record);
    reinterpret_cast<void (*)(unsigned char*)>(record.function)(buffer);
}

}  // namespace zkhw
