#pragma once

// Task memory: the one allocator of all String buffers and of the nodes of the tree. Blocks are aligned to 8 bytes,
// those of a size that is a multiple of 16 to 16 bytes. Any thread may allocate, and a block may be freed on any
// thread. Nothing here throws. The build chooses what stands behind it: on Windows the system's own (CoTaskMemAlloc);
// on Linux size classes (PoolAllocator.h) or, where a sanitizer is to see every block, malloc (MallocAllocator.h).

#include <cstddef>

namespace qn::dsc::osdep {

// A block of at least `size` bytes with undefined content, to be freed by TaskMemFree; null if there is no memory.
// A size of 0 gives a block too.
void* TaskMemAlloc(size_t size);

// Makes `block` hold at least `size` bytes, at the same place if it can, and gives its place now; what fits of the
// content is kept. Null `block`: as TaskMemAlloc. Null is given if there is no memory: then `block` is as it was.
// A `size` of 0 frees `block` and gives null.
void* TaskMemRealloc(void* block, size_t size);

// Frees what the other two gave; null does nothing.
void TaskMemFree(void* block);

}  // namespace qn::dsc::osdep
