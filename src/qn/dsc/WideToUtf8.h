#pragma once

// UTF-16 to UTF-8, each unit by itself: the halves of a surrogate pair become one sequence of three bytes each, as does
// an unpaired half, and a sequence of four bytes is never made. No unit is refused.

#include <cstddef>
#include <cstdint>

namespace qn::dsc {

// The units from `begin` up to `end` as UTF-8, with a NUL behind the last byte, in a buffer from array new that the
// caller frees with array delete. A null `begin` gives the NUL alone. `resultLength`, if not null, receives the number
// of bytes. exception::BufferOverflow if there are more than `limit`; std::bad_alloc.
char* WideToUtf8(const char16_t* begin, const char16_t* end, uint32_t* resultLength = nullptr,
                 uint32_t limit = 0xFFFFFFFF);

// How many bytes the units take as UTF-8: of as many units from the start as take no more than `limit` bytes together.
uint32_t MeasureAsUtf8(const char16_t* begin, const char16_t* end, uint32_t limit = 0xFFFFFFFF);

// Writes the units as UTF-8, as many from the start as take no more than `capacity` bytes together; gives the end of
// what was encoded.
const char16_t* EncodeUtf8(const char16_t* begin, const char16_t* end, char* target, size_t capacity);

}  // namespace qn::dsc
