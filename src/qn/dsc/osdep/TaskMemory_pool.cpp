#include "qn/dsc/osdep/PoolAllocator.h"
#include "qn/dsc/osdep/TaskMemory.h"

namespace qn::dsc::osdep {

void* TaskMemAlloc(size_t size) {
    return PoolAllocator::Allocate(size);
}

void* TaskMemRealloc(void* block, size_t size) {
    return PoolAllocator::Reallocate(block, size);
}

void TaskMemFree(void* block) {
    PoolAllocator::Free(block);
}

}  // namespace qn::dsc::osdep
