#include "qn/dsc/osdep/MallocAllocator.h"
#include "qn/dsc/osdep/TaskMemory.h"

namespace qn::dsc::osdep {

void* TaskMemAlloc(size_t size) {
    return MallocAllocator::Allocate(size);
}

void* TaskMemRealloc(void* block, size_t size) {
    return MallocAllocator::Reallocate(block, size);
}

void TaskMemFree(void* block) {
    MallocAllocator::Free(block);
}

}  // namespace qn::dsc::osdep
