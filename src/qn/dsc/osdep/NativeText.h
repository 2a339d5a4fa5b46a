#pragma once

// The rule between bytes of the operating system (UTF-8, but not always) and UTF-16 units: code page 0 of the text
// conversions, and the names of files and folders. Pure text; nothing is refused, nothing allocates.
//
// Valid UTF-8 is decoded, four-byte sequences becoming pairs of surrogates. A byte that is not part of valid UTF-8
// (encoded surrogates, overlong forms and all above U+10FFFF count as such, byte by byte) becomes the unit
// 0xDC00 + byte, so every sequence of bytes comes back as it was.
// The other way, pairs become four-byte sequences, a lone unit from 0xDC80 to 0xDCFF gives its byte back, and any other
// lone surrogate becomes "?".
// Names of files have one more exchange, for the backslash; it is not made here but in NativePath.h.

#include <cstddef>
#include <string_view>

namespace qn::dsc::osdep {

// Stores the units of `bytes` at `units` and gives their number. With a null `units` it only counts. The number is
// never greater than that of the bytes. NUL bytes are ordinary. Linear.
size_t NativeToUnits(std::string_view bytes, char16_t* units);

// Stores the bytes of `text` at `bytes` and gives their number. With a null `bytes` it only counts. The number is at
// most three times that of the units. NUL units are ordinary. Linear.
size_t UnitsToNative(std::u16string_view text, char* bytes);

}  // namespace qn::dsc::osdep
