/* Memory that crosses the boundary: the side that receives a block frees it with the function that matches the one it
 * was made with. The two families are distinct: neither frees what the other made, and neither is malloc. On Windows
 * they are the system's own. Any thread may call. Nothing here throws or reports but by a null result. */
#ifndef ZKFPGA_MEMORY_H
#define ZKFPGA_MEMORY_H

#include "zkfpga/types.h"

#if defined(_WIN32)

#include <objbase.h>

#else

#include <stddef.h>  // NOLINT(modernize-deprecated-headers): for C, too

#ifdef __cplusplus
extern "C" {
#endif

/* Task memory: arrays of strings and of nodes. Blocks are aligned to 16 bytes. */

/* A block of at least `size` bytes with undefined content; null if there is no memory. A size of 0 gives a block too.
 */
ZKFPGA_API void* CoTaskMemAlloc(size_t size);

/* Makes `block` hold at least `size` bytes and gives its place now, with what fits of its content. Null `block`: as
 * CoTaskMemAlloc. Null result with `size` not 0: no memory, and `block` is as it was. A `size` of 0 frees `block` and
 * gives null. */
ZKFPGA_API void* CoTaskMemRealloc(void* block, size_t size);

/* Frees a block; null does nothing. */
ZKFPGA_API void CoTaskMemFree(void* block);

/* Strings (BSTR). */

/* A copy of a NUL-terminated text. Null for a null text, or if there is no memory. */
ZKFPGA_API BSTR SysAllocString(const OLECHAR* text);

/* A string of `length` units, taken from `text` with NUL units and all, and a NUL unit behind them. A null `text`
 * leaves the units undefined. Null if there is no memory. */
ZKFPGA_API BSTR SysAllocStringLen(const OLECHAR* text, unsigned int length);

/* How many units `string` has, NUL units among them counted, the one behind the last not. 0 for null. */
ZKFPGA_API unsigned int SysStringLen(BSTR string);

/* Frees a string; null does nothing. */
ZKFPGA_API void SysFreeString(BSTR string);

#ifdef __cplusplus
}
#endif

#endif /* _WIN32 */

#endif
