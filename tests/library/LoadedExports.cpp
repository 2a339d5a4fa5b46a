#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "library/Exports.h"
#include "support/Modules.h"

namespace {

template <typename Function>
void Find(void* module, const char* name, Function*& function) {
    void* const address = qn::dsc::osdep::FindInModule(module, name);
    if (address == nullptr) {
        std::printf("no export %s\n", name);
        std::exit(3);
    }
    std::memcpy(&function, &address, sizeof function);
}

}  // namespace

Exports GetExports(const char* library) {
    void* const module = qn::dsc::osdep::LoadModuleFile(library);
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
