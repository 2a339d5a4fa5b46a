#include <cstdio>
#include <cstdlib>
#include <cstring>

#include <dlfcn.h>

#include "library/Exports.h"

namespace {

template <typename Function>
void Find(void* module, const char* name, Function*& function) {
    void* const address = dlsym(module, name);
    if (address == nullptr) {
        std::printf("no export %s\n", name);
        std::exit(3);
    }
    std::memcpy(&function, &address, sizeof function);
}

}  // namespace

Exports GetExports(const char* library) {
    void* const module = dlopen(library, RTLD_NOW | RTLD_LOCAL);
    if (module == nullptr) {
        std::printf("no library %s\n", library);
        std::exit(3);
    }
    Exports exports{};
    Find(module, "gFPGAResTree", exports.singleton);
    Find(module, "QueryResourceTreeInterface", exports.queryInterface);
    Find(module, "FPGAResTree_GetProperty", exports.getProperty);
    Find(module, "FPGAResTree_GetDescendantNames", exports.getDescendantNames);
    Find(module, "FPGAResTree_GetMultipleProperties", exports.getMultipleProperties);
    Find(module, "FPGAResTree_Dump", exports.dump);
    Find(module, "ZkhwResTree_GetNode", exports.getNode);
    Find(module, "FPGA_mbstowcs", exports.mbsToWcs);
    Find(module, "FPGA_wcstombs", exports.wcsToMbs);
    Find(module, "FPGA_MbsToUtf8", exports.mbsToUtf8);
    Find(module, "FPGA_Utf8ToMbs", exports.utf8ToMbs);
    Find(module, "SetZKRTModule", exports.setModule);
    return exports;
}
