// A host's accessor module: counts what it is asked, and answers with a number that tells so.
#include <cstdint>

#define EXPORTED extern "C" __attribute__((visibility("default")))

EXPORTED void* lastNode;
void* lastNode = nullptr;

EXPORTED int32_t EXPORTED_NAME(void* node);
int32_t EXPORTED_NAME(void* node) {
    lastNode = node;
    return -77;
}
