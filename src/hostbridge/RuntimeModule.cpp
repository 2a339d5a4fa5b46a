#include "hostbridge/RuntimeModule.h"

namespace zkhw {

using qn::dsc::osdep::FindExport;
using qn::dsc::osdep::FindLoadedModule;
using qn::dsc::osdep::GetMainModule;
using qn::dsc::osdep::ReadThreadSlot;

ModuleHandle runtimeModule = nullptr;
uint32_t runtimeTlsIndex = noThreadSlot;

ModuleHandle FindRuntimeModule() {
    if (runtimeTlsIndex != noThreadSlot) {
        if (const ModuleHandle ofThread = ReadThreadSlot(runtimeTlsIndex)) {
            return ofThread;
        }
    }
    if (runtimeModule != nullptr) {
        return runtimeModule;
    }
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

}  // namespace zkhw
