#include "qn/dsc/osdep/AllocationFault.h"

namespace qn::dsc::osdep {

namespace {

constexpr size_t usualLimit = maximumFineSize + 1;

std::atomic<uint64_t> allocationCount = 0;
uint64_t failingAllocation = 0;
bool failsFromThenOn = false;

}  // namespace

namespace detail {
std::atomic<size_t> quickSizeLimit = usualLimit;
}

void FailAllocation(uint64_t nth, bool fromThenOn) {
    allocationCount = 0;
    failingAllocation = nth;
    failsFromThenOn = fromThenOn;
    detail::quickSizeLimit = 0;
}

void ClearAllocationFault() {
    detail::quickSizeLimit = usualLimit;
}

uint64_t AllocationCount() {
    return allocationCount;
}

bool detail::CountAllocation() {
    const uint64_t number = ++allocationCount;
    return number == failingAllocation || (failsFromThenOn && number > failingAllocation);
}

}  // namespace qn::dsc::osdep
