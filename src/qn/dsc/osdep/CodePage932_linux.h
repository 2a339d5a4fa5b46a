#pragma once

// Code page 932 (Shift JIS as Windows has it) through ICU, for AnsiToWide and WideToAnsi.

#include <cstddef>
#include <string_view>

namespace qn::dsc::osdep {

// Stores the units of `bytes` at `units`, which has room for `capacity`, and gives their number; with a capacity of 0
// it only counts. A byte or pair of bytes without a character becomes U+30FB. WinError if ICU cannot convert, bad_alloc
// if it has no memory. Linear.
size_t CodePage932ToUnits(std::string_view bytes, char16_t* units, size_t capacity);

// Stores the bytes of `text` at `bytes` in the same way. A character without a counterpart becomes "?".
size_t UnitsToCodePage932(std::u16string_view text, char* bytes, size_t capacity);

}  // namespace qn::dsc::osdep
