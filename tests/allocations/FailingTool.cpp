// The tool, without memory from some place on. The first argument is the number of the allocation that fails, counted
// from 1; the second is "once" or "lasting", that is, with all behind it; the others are the tool's own.
//
// Ends as the tool does. Prints "reached" if there was such an allocation, or else "complete"; nothing if it doesn't
// come to that.

#include <cstdio>
#include <cstdlib>
#include <string_view>

#include "cachebuilder/Tool.h"
#include "qn/dsc/osdep/AllocationFault.h"

int main(int argc, char** argv) {
    if (argc < 3) {
        return 2;
    }
    const uint64_t nth = std::strtoull(argv[1], nullptr, 10);
    // Up to the end of the process: what is destroyed behind main must need no memory either.
    qn::dsc::osdep::FailAllocation(nth, std::string_view(argv[2]) == "lasting");
    const int32_t result = zkhw::RunTool(argc - 2, argv + 2);
    std::puts(qn::dsc::osdep::AllocationCount() < nth ? "complete" : "reached");
    return result;
}
