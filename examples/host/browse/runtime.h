/* The run-time of this host, as its own program uses it. The functions that the library calls are those of
 * zkfpga/host_runtime.h. */
#ifndef BROWSE_RUNTIME_H
#define BROWSE_RUNTIME_H

#include "zkfpga/host_runtime.h"

/* Names the installation's folder, in which "Targets" lies. To be called before the first query; `folder` is kept. */
void SetInstallationFolder(const char* folder);

/* A new, empty string; never null. The caller frees it with HostDisposeHandle. */
ZkStringHandle NewString(void);

/* Frees an array with its strings; null does nothing. */
void DisposeStringArray(ZkStringArrayHandle array);

/* A string's length in bytes, and its bytes: valid until the next call of any function of the run-time. */
size_t StringLength(ZkStringHandle string);
const char* StringBytes(ZkStringHandle string);

/* An array's count, and the string at `index`, which stays the array's. */
size_t ArrayCount(ZkStringArrayHandle array);
ZkStringHandle ArrayElement(ZkStringArrayHandle array, size_t index);

#endif
