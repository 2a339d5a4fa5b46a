#include <dlfcn.h>

#include "SlotsHostModule.h"

void* LoadLibraryFile(const char* file) {
    return dlopen(file, RTLD_NOW);
}

void* FindExport(void* library, const char* name) {
    return dlsym(library, name);
}
