#pragma once

// Makes chosen task allocations fail while it lives.

#include <cstdint>

#include "qn/dsc/osdep/AllocationFault.h"

namespace support {

class AllocationFaultScope {
  public:
    // The `nth` allocation from here on fails, counted from 1; with `fromThenOn` all behind it as well.
    explicit AllocationFaultScope(uint64_t nth, bool fromThenOn = false) {
        qn::dsc::osdep::FailAllocation(nth, fromThenOn);
    }
    AllocationFaultScope(const AllocationFaultScope&) = delete;
    AllocationFaultScope& operator=(const AllocationFaultScope&) = delete;
    ~AllocationFaultScope() { qn::dsc::osdep::ClearAllocationFault(); }
};

// Counts task allocations while it lives; none fails.
class AllocationCounter : public AllocationFaultScope {
  public:
    AllocationCounter() : AllocationFaultScope(UINT64_MAX) {}
    uint64_t Count() const { return qn::dsc::osdep::AllocationCount(); }
};

}  // namespace support
