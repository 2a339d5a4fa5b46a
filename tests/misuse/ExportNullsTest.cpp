// Null for every pointer of the exported functions. A null text counts as the empty one, and where there is no handle
// nothing is stored.

#include "misuse/MisuseTest.h"

namespace {

const std::string cluster =
    "<Cluster><Name></Name><NumElts>2</NumElts><String><Name>name</Name><Val>S/B/Width</Val></String>"
    "<String><Name>value</Name><Val>2</Val></String></Cluster>";

// The queries ask for something at "Rack" and a path below it.
Expectations OfQueries() {
    return {
        Answers("FPGAResTree_GetProperty basePath", "00000000 \"\" found=0"),
        Answers("FPGAResTree_GetProperty subPath", "00000000 \"\" found=0"),
        Answers("FPGAResTree_GetProperty options", "00000000 \"7\" found=1"),
        Answers("FPGAResTree_GetProperty value", "00000000 \"untouched\" found=1"),
        Answers("FPGAResTree_GetProperty found", "00000000 \"7\""),
        Answers("FPGAResTree_GetDescendantNames basePath", "00000000 [] found=0"),
        Answers("FPGAResTree_GetDescendantNames subPath", "00000000 [] found=1"),
        Answers("FPGAResTree_GetDescendantNames options", "00000000 [S/A,S/B] found=1"),
        Answers("FPGAResTree_GetDescendantNames names", "80004003 no array found=9"),
        Answers("FPGAResTree_GetDescendantNames found", "00000000 [S/A,S/B]"),
        Answers("FPGAResTree_GetMultipleProperties basePath", "00000000 [] found=0"),
        Answers("FPGAResTree_GetMultipleProperties subPath", "00000000 [] found=1"),
        Answers("FPGAResTree_GetMultipleProperties options", "00000000 [" + cluster + "] found=1"),
        Answers("FPGAResTree_GetMultipleProperties names", "80004003 no array found=9"),
        Answers("FPGAResTree_GetMultipleProperties found", "00000000 [" + cluster + "]"),
        // The empty path leads nowhere.
        Traps("FPGAResTree_Dump basePath"),
        Answers("FPGAResTree_Dump subPath", "00000000 |<Slot name=\"B\">|   <Width>2</Width>|</Slot>"),
        Answers("FPGAResTree_Dump options", "00000000 |<Slot name=\"B\">|   <Width>2</Width>|</Slot>"),
        Answers("FPGAResTree_Dump text", "00000000 untouched"),
    };
}

Expectations OfInterfaces() {
    return {
        Answers("QueryResourceTreeInterface id", "80004003 untouched"),
        Answers("QueryResourceTreeInterface context", "00000000 object"),
        Answers("QueryResourceTreeInterface item", "00000000 object"),
        Traps("QueryResourceTreeInterface result"),
        Traps("QueryResourceTreeInterface result of a tree"),
        Traps("QueryResourceTreeInterface result of an owner"),
        Answers("QueryResourceTreeInterface context and item of an owner", "80004003 null"),
        Answers("QueryResourceTreeInterface context and item of a tree", "00000000 object"),
        // The reference stands for no node.
        Answers("ZkhwResTree_GetNode accessor", "00000001 55"),
        // The run-time is found by its name.
        Answers("SetZKRTModule module", "00000000 \"7\" found=1"),
        Answers("SetZKRTModuleHook module", "00000000 \"7\" found=1"),
    };
}

Expectations OfMemory() {
    return {
        Answers("CoTaskMemRealloc block", "block"), Answers("CoTaskMemFree block", "freed"),
        Answers("SysAllocString text", "null"),     Answers("SysAllocStringLen text", "length 2"),
        Answers("SysStringLen string", "length 0"), Answers("SysFreeString string", "freed"),
    };
}

}  // namespace

Expectations ExportNullExpectations() {
    Expectations all = OfQueries();
    for (const char* const function : {"FPGA_mbstowcs", "FPGA_wcstombs", "FPGA_MbsToUtf8", "FPGA_Utf8ToMbs"}) {
        all.push_back(Answers(std::string(function) + " source", "00000000 \"\""));
        all.push_back(Answers(std::string(function) + " destination", "00000000 \"untouched\""));
    }
    for (const Expectations& each : {OfInterfaces(), OfMemory()}) {
        all.insert(all.end(), each.begin(), each.end());
    }
    return all;
}

INSTANTIATE_TEST_SUITE_P(OfNullInExports, Misuse, testing::ValuesIn(ExportNullExpectations()), TestName);
