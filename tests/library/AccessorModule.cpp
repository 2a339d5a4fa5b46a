// A host's accessor module: counts what it is asked, and answers with a number that tells so.
#include <cstdint>

#include "qn/dsc/osdep/Export.h"

#define EXPORTED extern "C" ZKFPGA_EXPORT

EXPORTED void* lastNode;
void* lastNode = nullptr;

EXPORTED int32_t EXPORTED_NAME(void* node);
int32_t EXPORTED_NAME(void* node) {
    lastNode = node;
    return -77;
}
