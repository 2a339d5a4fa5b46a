#include "qn/dsc/osdep/AllocationFault.h"

namespace qn::dsc::osdep {

namespace detail {
std::atomic<bool> allocationFaultSet = false;
}

namespace {

std::atomic<uint64_t> allocationCount = 0;
uint64_t failingAllocation = 0;
bool failsFromThenOn = false;

}  // namespace

void FailAllocation(uint64_t nth, bool fromThenOn) {
    allocationCount = 0;
    failingAllocation = nth;
    failsFromThenOn = fromThenOn;
    detail::allocationFaultSet = true;
}

void ClearAllocationFault() {
    detail::allocationFaultSet = false;
}

uint64_t AllocationCount() {
    return allocationCount;
}

bool detail::CountAllocation() {
    const uint64_t number = ++allocationCount;
    return number == failingAllocation || (failsFromThenOn && number > failingAllocation);
}

}  // namespace qn::dsc::osdep
