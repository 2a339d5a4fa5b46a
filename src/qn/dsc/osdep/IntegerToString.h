#pragma once

// Integers as text.

#include <cstdint>

#include "qn/dsc/StringBase.h"

namespace qn::dsc::osdep {

// The digits of `value` in `radix`, 2 to 36, with capital letters for digits above 9: "0" for 0, no leading zeros.
// exception::UnableToConvert for any other radix.
String IntegerToString(uint32_t value, uint32_t radix);

// The same, with a "-" in front of a negative value in radix 10. In any other radix a negative value is written as its
// 32-bit pattern: -1 is "FFFFFFFF" in radix 16.
String IntegerToString(int32_t value, uint32_t radix);

}  // namespace qn::dsc::osdep
