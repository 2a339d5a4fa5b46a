/* The header is plain C99 and needs nothing before it. */
#include "zkfpga/host_runtime.h"

int32_t CallFromC(ZkHandle handle);
int32_t CallFromC(ZkHandle handle) {
    return HostDisposeHandle(handle);
}
