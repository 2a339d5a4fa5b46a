#include <cstdlib>

#include <dlfcn.h>
#include <pthread.h>

#include "support/Modules.h"

namespace qn::dsc::osdep {

void* LoadModuleFile(const char* file) {
    return dlopen(file, RTLD_NOW | RTLD_LOCAL);
}

void UnloadModule(void* module) {
    dlclose(module);
}

void* FindInModule(void* module, const char* name) {
    return dlsym(module, name);
}

uint32_t MakeThreadSlot() {
    pthread_key_t key = 0;
    if (pthread_key_create(&key, nullptr) != 0) {
        std::abort();
    }
    return key;
}

void FreeThreadSlot(uint32_t slot) {
    pthread_key_delete(slot);
}

void SetThreadSlot(uint32_t slot, void* value) {
    if (pthread_setspecific(slot, value) != 0) {
        std::abort();
    }
}

}  // namespace qn::dsc::osdep
