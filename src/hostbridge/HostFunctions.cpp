#include "hostbridge/HostFunctions.h"

#include "hostbridge/HostFunctionTable.h"

namespace zkhw {

namespace {

// What all stubs have in common. The host's function is called last and its result given as it comes, so the compiler
// makes that call a jump: the function returns straight to the stub's caller.
template <typename Result, typename... Parameters>
inline Result Call(HostFunction function, Parameters... parameters) {
    HostFunctionRecord& record = RecordOf(function);
    ResolveHostFunction(record);
    return reinterpret_cast<Result (*)(Parameters...)>(record.function)(parameters...);
}

}  // namespace

int32_t HostSetHandleSizeClear(HostHandle handle, size_t size) {
    return Call<int32_t>(HostFunction::HostSetHandleSizeClear, handle, size);
}

int32_t HostDisposeHandle(HostHandle handle) {
    return Call<int32_t>(HostFunction::HostDisposeHandle, handle);
}

HostHandle HostNewHandleClear(size_t size) {
    return Call<HostHandle>(HostFunction::HostNewHandleClear, size);
}

uint8_t HostGetErrorText(int32_t code, HostHandle* text) {
    return Call<uint8_t>(HostFunction::HostGetErrorText, code, text);
}

int32_t HostResizeArray(int32_t typeCode, int32_t dimensions, HostHandle* array, size_t size) {
    return Call<int32_t>(HostFunction::HostResizeArray, typeCode, dimensions, array, size);
}

void HostGetLanguageName(unsigned char* buffer) {
    Call<void>(HostFunction::HostGetLanguageName, buffer);
}

int32_t QueryInterfaceForZKRefNum(uint32_t refNum, qn::dsc::Guid interfaceId, void** result) {
    return Call<int32_t>(HostFunction::QueryInterfaceForZKRefNum, refNum, interfaceId, result);
}

HostPathReference HostEmptyPath(HostPathReference path) {
    return Call<HostPathReference>(HostFunction::HostEmptyPath, path);
}

int32_t HostPathToString(HostPathReference path, HostHandle* text) {
    return Call<int32_t>(HostFunction::HostPathToString, path, text);
}

int32_t HostGetSpecialDir(int32_t code, HostPathReference path) {
    return Call<int32_t>(HostFunction::HostGetSpecialDir, code, path);
}

void HostDestroyPath(HostPathReference path) {
    Call<void>(HostFunction::HostDestroyPath, path);
}

int32_t HostTextToPath(const char* text, size_t length, HostPathReference path) {
    return Call<int32_t>(HostFunction::HostTextToPath, text, length, path);
}

int32_t HostSystemTextToPath(const char* text, HostPathReference path) {
    return Call<int32_t>(HostFunction::HostSystemTextToPath, text, path);
}

}  // namespace zkhw
