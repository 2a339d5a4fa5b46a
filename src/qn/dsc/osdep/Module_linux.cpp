#include "qn/dsc/osdep/Module.h"

#include <cstring>
#include <string>
#include <string_view>

#include <dlfcn.h>
#include <link.h>
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

struct ModuleSearch {
    std::string_view fileName;
    const char* path;  // Of the module that was found. The dynamic linker's; null: none yet.
};

// Called for each loaded module; not 0 ends the search.
int LookAtModule(dl_phdr_info* module, size_t, void* context) noexcept {
    ModuleSearch& search = *static_cast<ModuleSearch*>(context);
    const std::string_view path = module->dlpi_name;
    // Without a slash npos + 1 is 0: all of it.
    if (path.substr(path.rfind('/') + 1) != search.fileName) {
        return 0;
    }
    search.path = module->dlpi_name;
    return 1;
}

}  // namespace

ModuleHandle GetMainModule() {
    return OpenUncounted(nullptr, RTLD_LAZY);
}

ModuleHandle FindLoadedModule(const char* name) {
    const std::string nativeName = NativeModuleName(name);
    void* const module = OpenUncounted(nativeName.c_str(), RTLD_LAZY | RTLD_NOLOAD);
    if (module != nullptr) {
        return module;
    }
    // A plug-in bears no name inside. The dynamic linker knows it only by the path from which it was loaded.
    ModuleSearch search{nativeName, nullptr};
    dl_iterate_phdr(&LookAtModule, &search);
    return search.path == nullptr ? nullptr : OpenUncounted(search.path, RTLD_LAZY | RTLD_NOLOAD);
}

uint64_t CountLoadedModules() {
    uint64_t count = 0;
    dl_iterate_phdr(
        [](dl_phdr_info* module, size_t, void* context) {
            *static_cast<uint64_t*>(context) = module->dlpi_adds;
            return 1;
        },
        &count);
    return count;
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
