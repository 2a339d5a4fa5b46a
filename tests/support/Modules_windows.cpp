#include <windows.h>

#include <cstdlib>

#include "support/Modules.h"

namespace qn::dsc::osdep {

void* LoadModuleFile(const char* file) {
    return file == nullptr ? GetModuleHandleA(nullptr) : LoadLibraryA(file);
}

void UnloadModule(void* module) {
    FreeLibrary(static_cast<HMODULE>(module));
}

void* FindInModule(void* module, const char* name) {
    return reinterpret_cast<void*>(GetProcAddress(static_cast<HMODULE>(module), name));
}

uint32_t MakeThreadSlot() {
    const DWORD slot = TlsAlloc();
    if (slot == TLS_OUT_OF_INDEXES) {
        std::abort();
    }
    return slot;
}

void FreeThreadSlot(uint32_t slot) {
    TlsFree(slot);
}

void SetThreadSlot(uint32_t slot, void* value) {
    if (TlsSetValue(slot, value) == 0) {
        std::abort();
    }
}

}  // namespace qn::dsc::osdep
