/* The host's own form of data: a handle is a pointer to the pointer to a block of memory, which the host may move
 * whenever one of its functions is called. Blocks are made, resized and freed by the host's run-time only. */
#ifndef ZKFPGA_HOST_DATA_H
#define ZKFPGA_HOST_DATA_H

#include <stdint.h>  // NOLINT(modernize-deprecated-headers): for C, too

typedef char** ZkHandle;

/* A string: a block of an int32_t, the length in bytes, and that many bytes; no terminator. A null handle and a length
 * of 0 are both the empty string. */
typedef ZkHandle ZkStringHandle;

/* An array of strings: a block of an int32_t, the count, and that many string handles, naturally aligned. */
typedef ZkHandle ZkStringArrayHandle;

#endif
