// A host whose main executable is the run-time: it exports PROBE_EXPORT. Loads the module that its argument names, if
// there is one. Exit code 0 if the run-time is found in the main module.
#include "hostbridge/RuntimeModule.h"
#include "qn/dsc/osdep/Export.h"
#include "support/Modules.h"

extern "C" ZKFPGA_EXPORT void PROBE_EXPORT();
void PROBE_EXPORT() {}

int main(int argc, char** argv) {
    if (argc > 1 && qn::dsc::osdep::LoadModuleFile(argv[1]) == nullptr) {
        return 4;
    }
    return zkhw::FindRuntimeModule() == qn::dsc::osdep::GetMainModule() ? 0 : 7;
}
