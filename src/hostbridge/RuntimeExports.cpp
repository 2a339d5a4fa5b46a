// The functions by which a host names its run-time module, for the whole process or for each thread by a thread-local
// slot. Their contract stands in zkfpga/exports.h.

#include "zkfpga/exports.h"

#include "hostbridge/RuntimeModule.h"
#include "qn/dsc/osdep/Export.h"

extern "C" {

// The hooks do nothing: a host that wants to follow what is set puts functions of the same names in their place. So
// they are called through the module's table of exports and never folded into their callers.
[[gnu::noinline]] ZKFPGA_EXPORT void SetZKRTModuleHook(void*) {}

[[gnu::noinline]] ZKFPGA_EXPORT void SetZKRTTLSIndexHook(uint32_t) {}

ZKFPGA_EXPORT void SetZKRTModule(void* module) {
    zkhw::runtimeModule = module;
    SetZKRTModuleHook(module);
}

ZKFPGA_EXPORT void SetZKRTTLSIndex(uint32_t index) {
    zkhw::runtimeTlsIndex = index;
    SetZKRTTLSIndexHook(index);
}

}  // extern "C"
