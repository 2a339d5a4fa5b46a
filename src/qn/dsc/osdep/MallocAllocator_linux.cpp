#include "qn/dsc/osdep/MallocAllocator.h"

#include <malloc.h>

#include <cstdlib>

#include "qn/dsc/osdep/AllocationFault.h"
#include "qn/dsc/osdep/SizeClass.h"

namespace qn::dsc::osdep {

void* MallocAllocator::Allocate(size_t size) {
    if (ShouldFailAllocation()) {
        return nullptr;
    }
    return std::malloc(size == 0 ? 1 : size);
}

void* MallocAllocator::Reallocate(void* block, size_t size) {
    if (block == nullptr) {
        return Allocate(size);
    }
    if (size == 0) {
        std::free(block);
        return nullptr;
    }
    // Counted by the size classes, so that a fault strikes the same call whichever allocator is behind it.
    if (NeedsGreaterClass(malloc_usable_size(block), size) && ShouldFailAllocation()) {
        return nullptr;
    }
    return std::realloc(block, size);
}

void MallocAllocator::Free(void* block) {
    std::free(block);
}

}  // namespace qn::dsc::osdep
