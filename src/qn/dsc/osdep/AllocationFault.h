#pragma once

// Lets a test make chosen task allocations fail. One switch for the process; off, it costs at most one predictable
// branch for each allocation. Not for use while other threads allocate.

#include <atomic>
#include <cstddef>
#include <cstdint>

#include "qn/dsc/osdep/SizeClass.h"

namespace qn::dsc::osdep {

// From now on counts the allocations, from 1, and makes the `nth` fail; with `fromThenOn` all behind it too.
// An allocation is a TaskMemAlloc, or a TaskMemRealloc that needs a block of a greater size class, or one above the
// greatest class. UINT64_MAX only counts.
void FailAllocation(uint64_t nth, bool fromThenOn);

// No allocation fails any more, and none is counted; the count stays readable.
void ClearAllocationFault();

// How many allocations there were between the last FailAllocation and ClearAllocationFault (or now).
uint64_t AllocationCount();

// Whether allocations are being counted: while they are not, ShouldFailAllocation need not be asked.
inline bool IsAllocationFaultSet();

// Whether an allocation of `size` bytes is both one of the fine classes (SizeClass.h) and one that need not ask: two
// questions in one comparison.
inline bool IsQuickAllocation(size_t size);

// Counts one allocation and says whether it is to fail. Every allocator asks this once before it allocates; a test's
// own global operator new may ask as well, and so take part in the count.
inline bool ShouldFailAllocation();

namespace detail {
// Sizes below this are quick. 0 while allocations are counted.
extern std::atomic<size_t> quickSizeLimit;
bool CountAllocation();
}  // namespace detail

inline bool IsAllocationFaultSet() {
    return detail::quickSizeLimit.load(std::memory_order_relaxed) == 0;
}

inline bool IsQuickAllocation(size_t size) {
    return size < detail::quickSizeLimit.load(std::memory_order_relaxed);
}

inline bool ShouldFailAllocation() {
    return IsAllocationFaultSet() && detail::CountAllocation();
}

}  // namespace qn::dsc::osdep
