// A host whose main executable is the run-time: it exports PROBE_EXPORT. Loads the module that its argument names, if
// there is one. Exit code 0 if the run-time is found in the main module.
#include <dlfcn.h>

#include "hostbridge/RuntimeModule.h"

extern "C" __attribute__((visibility("default"))) void PROBE_EXPORT();
void PROBE_EXPORT() {}

int main(int argc, char** argv) {
    if (argc > 1 && dlopen(argv[1], RTLD_NOW | RTLD_LOCAL) == nullptr) {
        return 4;
    }
    return zkhw::FindRuntimeModule() == qn::dsc::osdep::GetMainModule() ? 0 : 3;
}
