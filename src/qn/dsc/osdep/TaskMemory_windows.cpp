// The system's own task allocator.

#include <objbase.h>

#include "qn/dsc/osdep/AllocationFault.h"
#include "qn/dsc/osdep/SizeClass.h"
#include "qn/dsc/osdep/TaskMemory.h"

namespace qn::dsc::osdep {

namespace {

size_t SizeOf(void* block) {
    IMalloc* allocator = nullptr;
    return CoGetMalloc(1, &allocator) == S_OK ? allocator->GetSize(block) : 0;
}

}  // namespace

void* TaskMemAlloc(size_t size) {
    return ShouldFailAllocation() ? nullptr : CoTaskMemAlloc(size);
}

void* TaskMemRealloc(void* block, size_t size) {
    if (block == nullptr) {
        return TaskMemAlloc(size);
    }
    // Counted by the size classes, so that a fault strikes the same call whichever allocator is behind it.
    if (IsAllocationFaultSet() && size != 0 && NeedsGreaterClass(SizeOf(block), size) && ShouldFailAllocation()) {
        return nullptr;
    }
    return CoTaskMemRealloc(block, size);
}

void TaskMemFree(void* block) {
    CoTaskMemFree(block);
}

}  // namespace qn::dsc::osdep
