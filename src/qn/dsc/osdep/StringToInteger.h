#pragma once

// Integers from text. What isn't a number is 0, and what follows the digits doesn't matter; only a radix out of range
// and an overflow that shows are failures.

#include <cstdint>

#include "qn/dsc/TextArgument.h"

namespace qn::dsc::osdep {

// The magnitude of the number at the start of `text`, and whether a "-" stands before it. In this order may stand in
// front of the digits: blanks, tabs, returns and line feeds; "-"; "+" (so "-+5" is 5 with `negative` set, and "+-5" is
// 0); in radix 16 "0x" or "0X" if at least one more unit follows. Digits are 0 to 9 and the letters of ASCII in either
// case, as far as they are below `radix`; the first other unit ends the number. No digits: 0.
// exception::UnableToConvert for a `radix` not in 2 to 36, and when the number so far times `radix`, modulo 2^32, is
// less than the number so far. This finds some overflows ("99999999999" in radix 10) and misses others ("4294967296"
// is 0): the value wraps round then.
uint32_t StringToInteger(TextArgument text, uint32_t radix, bool& negative);

// The same as a signed value. Only in radix 10 does a "-" count; in any other it is read and ignored. A magnitude above
// 0x7FFFFFFF wraps round.
int32_t StringToInteger(TextArgument text, uint32_t radix);

}  // namespace qn::dsc::osdep
