#include "qn/dsc/osdep/Module.h"

#include <cstring>
#include <string>
#include <string_view>

#include <dlfcn.h>
#include <pthread.h>

namespace qn::dsc::osdep {

namespace {

std::string NativeModuleName(std::string_view name) {
    const size_t dot = name.rfind('.');
    const std::string_view stem = name.substr(0, dot);
    const bool isLibrary = dot != std::string_view::npos && name.substr(dot) == ".dll";
    return (isLibrary ? "lib" : "") + std::string(stem) + ".so";
}

// A handle that doesn't count as a use of the module.
ModuleHandle OpenUncounted(const char* nativeName, int flags) {
    void* handle = dlopen(nativeName, flags);
    if (handle != nullptr) {
        dlclose(handle);
    }
    return handle;
}

}  // namespace

ModuleHandle GetMainModule() {
    return OpenUncounted(nullptr, RTLD_LAZY);
}

ModuleHandle FindLoadedModule(const char* name) {
    return OpenUncounted(NativeModuleName(name).c_str(), RTLD_LAZY | RTLD_NOLOAD);
}

CodePointer FindExport(ModuleHandle module, const char* name) {
    void* const address = dlsym(module, name);
    CodePointer code = nullptr;
    static_assert(sizeof code == sizeof address);
    std::memcpy(&code, &address, sizeof code);
    return code;
}

void* ReadThreadSlot(uint32_t slot) {
    return pthread_getspecific(static_cast<pthread_key_t>(slot));
}

}  // namespace qn::dsc::osdep
