#include "hostbridge/HostFunctions.h"

#include <cstdio>

#include "hostbridge/RuntimeModule.h"
#include "qn/dsc/osdep/FatalError.h"

namespace zkhw {

using qn::dsc::osdep::FatalError;
using qn::dsc::osdep::FindExport;

namespace {

// Calls the function of a record with the parameters of the stub that stands for it.
template <typename Result, typename... Parameters>
Result Call(HostFunctionRecord& record, Parameters... parameters) {
    ResolveHostFunction(record);
    return reinterpret_cast<Result (*)(Parameters...)>(record.function)(parameters...);
}

}  // namespace

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

int32_t HostDisposeHandle(HostHandle handle) {
    static HostFunctionRecord record{nullptr, nullptr, "HostDisposeHandle"};
    return Call<int32_t>(record, handle);
}

void HostGetLanguageName(unsigned char* buffer) {
    static HostFunctionRecord record{nullptr, nullptr, "HostGetLanguageName"};
    Call<void>(record, buffer);
}

HostPathReference HostEmptyPath(HostPathReference path) {
    static HostFunctionRecord record{nullptr, nullptr, "HostEmptyPath"};
    return Call<HostPathReference>(record, path);
}

void HostDestroyPath(HostPathReference path) {
    static HostFunctionRecord record{nullptr, nullptr, "HostDestroyPath"};
    Call<void>(record, path);
}

int32_t HostPathToString(HostPathReference path, HostHandle* text) {
    static HostFunctionRecord record{nullptr, nullptr, "HostPathToString"};
    return Call<int32_t>(record, path, text);
}

int32_t HostGetSpecialDir(int32_t code, HostPathReference path) {
    static HostFunctionRecord record{nullptr, nullptr, "HostGetSpecialDir"};
    return Call<int32_t>(record, code, path);
}

}  // namespace zkhw
