#include <windows.h>

#include "SlotsHostModule.h"

void* LoadLibraryFile(const char* file) {
    return LoadLibraryA(file);
}

void* FindExport(void* library, const char* name) {
    /* Those for memory are the system's. */
    const HMODULE modules[] = {library, LoadLibraryA("ole32.dll"), LoadLibraryA("oleaut32.dll")};
    for (size_t i = 0; i < sizeof modules / sizeof *modules; ++i) {
        const FARPROC function = GetProcAddress(modules[i], name);
        if (function != NULL) {
            return (void*)function;
        }
    }
    return NULL;
}
