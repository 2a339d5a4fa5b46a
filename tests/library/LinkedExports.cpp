#include "library/Exports.h"
#include "qn/dsc/osdep/Export.h"

// The program's own run-time functions make it the host's run-time module.
extern "C" ZKFPGA_EXPORT int gZKRTVersion;
int gZKRTVersion = 1;

Exports GetExports(const char*) {
    return {&gFPGAResTree,
            &QueryResourceTreeInterface,
            &FPGAResTree_GetProperty,
            &FPGAResTree_GetDescendantNames,
            &FPGAResTree_GetMultipleProperties,
            &FPGAResTree_Dump,
            &ZkhwResTree_GetNode,
            &FPGA_mbstowcs,
            &FPGA_wcstombs,
            &FPGA_MbsToUtf8,
            &FPGA_Utf8ToMbs,
            &SetZKRTModule};
}
