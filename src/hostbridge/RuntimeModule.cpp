#include "hostbridge/RuntimeModule.h"

#include <atomic>

namespace zkhw {

using qn::dsc::osdep::CountLoadedModules;
using qn::dsc::osdep::FindExport;
using qn::dsc::osdep::FindLoadedModule;
using qn::dsc::osdep::GetMainModule;
using qn::dsc::osdep::ReadThreadSlot;

ModuleHandle runtimeModule = nullptr;
uint32_t runtimeTlsIndex = noThreadSlot;

namespace {

// How many modules had been loaded when there was no run-time among them; UINT64_MAX: nobody has looked yet. A look in
// vain costs some fifty failing system calls.
std::atomic<uint64_t> modulesWithoutRuntime = UINT64_MAX;

// One that nobody has named.
ModuleHandle FindUnnamedModule() {
    const ModuleHandle main = GetMainModule();
    if (main != nullptr &&
        (FindExport(main, "gZKRTVersion") != nullptr || FindExport(main, "HostNewHandle") != nullptr)) {
        return main;
    }
    if (const ModuleHandle runtime = FindLoadedModule("zkrt.dll")) {
        return runtime;
    }
    return FindLoadedModule("zkffrt.dll");
}

}  // namespace

ModuleHandle FindRuntimeModule() {
    if (runtimeTlsIndex != noThreadSlot) {
        if (const ModuleHandle ofThread = ReadThreadSlot(runtimeTlsIndex)) {
            return ofThread;
        }
    }
    if (runtimeModule != nullptr) {
        return runtimeModule;
    }
    // Before the look: what is loaded meanwhile is looked at the next time.
    const uint64_t loadedModules = CountLoadedModules();
    if (loadedModules == modulesWithoutRuntime.load(std::memory_order_relaxed)) {
        return nullptr;
    }
    const ModuleHandle found = FindUnnamedModule();
    if (found == nullptr) {
        modulesWithoutRuntime.store(loadedModules, std::memory_order_relaxed);
    }
    return found;
}

}  // namespace zkhw
