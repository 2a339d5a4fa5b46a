#include <windows.h>

#include <atomic>
#include <cstring>

#include "qn/dsc/osdep/Module.h"

namespace qn::dsc::osdep {

ModuleHandle GetMainModule() {
    return GetModuleHandleA(nullptr);
}

ModuleHandle FindLoadedModule(const char* name) {
    return GetModuleHandleA(name);
}

uint64_t CountLoadedModules() {
    // The system doesn't tell. To look for a module costs little here.
    static std::atomic<uint64_t> calls = 0;
    return calls.fetch_add(1, std::memory_order_relaxed);
}

CodePointer FindExport(ModuleHandle module, const char* name) {
    const FARPROC address = GetProcAddress(static_cast<HMODULE>(module), name);
    CodePointer code = nullptr;
    static_assert(sizeof code == sizeof address);
    std::memcpy(&code, &address, sizeof code);
    return code;
}

void* ReadThreadSlot(uint32_t slot) {
    return TlsGetValue(slot);
}

}  // namespace qn::dsc::osdep
