// A host that puts its own hooks in the place of the library's. Exit code 0 if they hear of what is set.
#include "zkfpga/exports.h"

namespace {

void* heardModule = nullptr;
uint32_t heardIndex = 0;
int calls = 0;

}  // namespace

extern "C" __attribute__((visibility("default"))) void SetZKRTModuleHook(void* module) {
    heardModule = module;
    ++calls;
}

extern "C" __attribute__((visibility("default"))) void SetZKRTTLSIndexHook(uint32_t index) {
    heardIndex = index;
    ++calls;
}

int main() {
    SetZKRTModule(&calls);
    SetZKRTTLSIndex(0x12345678);
    return heardModule == &calls && heardIndex == 0x12345678 && calls == 2 ? 0 : 3;
}
