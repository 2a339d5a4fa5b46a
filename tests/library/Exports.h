#pragma once

// The library's functions as a host program holds them, whether it has loaded the library or is linked to it.

#include "zkfpga/exports.h"

struct Exports {
    decltype(&gFPGAResTree) singleton;
    decltype(&QueryResourceTreeInterface) queryInterface;
    decltype(&FPGAResTree_GetProperty) getProperty;
    decltype(&FPGAResTree_GetDescendantNames) getDescendantNames;
    decltype(&FPGAResTree_GetMultipleProperties) getMultipleProperties;
    decltype(&FPGAResTree_Dump) dump;
    decltype(&ZkhwResTree_GetNode) getNode;
    decltype(&FPGA_mbstowcs) mbsToWcs;
    decltype(&FPGA_wcstombs) wcsToMbs;
    decltype(&FPGA_MbsToUtf8) mbsToUtf8;
    decltype(&FPGA_Utf8ToMbs) utf8ToMbs;
    decltype(&SetZKRTModule) setModule;
};

// `library` is the file to load; a linked program has no use for it.
Exports GetExports(const char* library);
