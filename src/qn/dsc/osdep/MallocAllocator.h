#pragma once

// Task memory straight from malloc, with the contract of TaskMemory.h: for sanitizer builds, which so see every block.

#include <cstddef>

namespace qn::dsc::osdep {

class MallocAllocator {
  public:
    static void* Allocate(size_t size);
    static void* Reallocate(void* block, size_t size);
    static void Free(void* block);
};

}  // namespace qn::dsc::osdep
