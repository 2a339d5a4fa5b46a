#pragma once

// Checked arithmetic for sizes: an unsigned 32-bit value whose sum and doubling throw exception::OutOfRange instead of
// wrapping round.

#include <cstdint>

#include "qn/dsc/exception/Exception.h"

namespace qn::dsc {

class SafeInteger {
  public:
    explicit constexpr SafeInteger(uint32_t size) : value(size) {}

    constexpr uint32_t Value() const { return value; }

    // The sum; OutOfRange if it is above 0xFFFFFFFF.
    friend constexpr SafeInteger operator+(SafeInteger left, SafeInteger right) {
        const uint32_t sum = left.value + right.value;
        if (sum < left.value) {
            exception::ThrowAt(exception::OutOfRange(), "qn/dsc/SafeInteger", __LINE__);
        }
        return SafeInteger(sum);
    }

    // Twice the value; OutOfRange if its top bit is set.
    constexpr SafeInteger Doubled() const {
        if ((value & 0x80000000U) != 0) {
            exception::ThrowAt(exception::OutOfRange(), "qn/dsc/SafeInteger", __LINE__);
        }
        return SafeInteger(value * 2);
    }

  private:
    uint32_t value;
};

}  // namespace qn::dsc
