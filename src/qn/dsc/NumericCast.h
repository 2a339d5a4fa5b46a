#pragma once

// Conversion between integer types that refuses what the target cannot hold.

#include <cstdint>

#include "qn/dsc/exception/Exception.h"

namespace qn::dsc {

// The same value; exception::OutOfRange if it is negative.
constexpr uint32_t NumericCast(int32_t value) {
    if (value < 0) {
        exception::ThrowAt(exception::OutOfRange(), "qn/dsc/NumericCast", __LINE__);
    }
    return static_cast<uint32_t>(value);
}

}  // namespace qn::dsc
