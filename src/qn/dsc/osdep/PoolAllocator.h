#pragma once

// Task memory from size classes (SizeClass.h), with the contract of TaskMemory.h. For many small blocks that live long:
// a block has no header, and allocating or freeing one is a handful of instructions without a lock.
//
// Memory comes from the system in regions of 4 MB, aligned to their size, cut into spans of 32 KB; all blocks of a span
// are of one class, which a table at the head of the region tells from the block's address. Each thread has, for each
// class, a list of free blocks and a span from which new blocks are cut in ascending order, so that what is allocated
// together lies together and untouched pages stay unused. A freed block goes to the list of the thread that frees it.
// A list that grows long is handed over, whole, to a common store, from which any thread takes before it cuts a new
// span; at its end a thread hands over all its lists. Spans never change their class, and nothing is given back to the
// system. Blocks above the greatest class come from malloc.

#include <cstddef>

namespace qn::dsc::osdep {

class PoolAllocator {
  public:
    static void* Allocate(size_t size);
    static void* Reallocate(void* block, size_t size);
    static void Free(void* block);
};

}  // namespace qn::dsc::osdep
