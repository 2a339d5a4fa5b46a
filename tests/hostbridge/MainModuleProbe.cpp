// A host whose main executable is the run-time: it exports PROBE_EXPORT. Exit code 0 if that is how it is found.
#include "hostbridge/RuntimeModule.h"

extern "C" __attribute__((visibility("default"))) void PROBE_EXPORT();
void PROBE_EXPORT() {}

int main() {
    return zkhw::FindRuntimeModule() == qn::dsc::osdep::GetMainModule() ? 0 : 3;
}
