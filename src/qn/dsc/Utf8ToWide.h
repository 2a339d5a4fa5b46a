#pragma once

// UTF-8 to UTF-16, one unit for each sequence: sequences of one to three bytes, the shortest form only. Sequences of
// four bytes are refused, so characters beyond the 16-bit range cannot be read; encoded surrogates give the unit as it
// stands, which is what WideToUtf8.h writes for them.

#include <cstddef>
#include <cstdint>

namespace qn::dsc {

// The units that `length` bytes of UTF-8 stand for, with a NUL behind the last, in a buffer from array new that the
// caller frees with array delete. A null `begin` gives the NUL alone. `resultLength`, if not null, receives the number
// of units (NUL bytes become NUL units, so the text cannot be measured by its NUL).
// exception::InvalidSequence if the bytes are not such text or end inside a sequence; std::bad_alloc.
char16_t* Utf8ToWide(const char* begin, uint32_t length, uint32_t* resultLength = nullptr);

// Whether all bytes are below 0x80. Eight or sixteen bytes at a step.
bool IsAscii(const char* begin, size_t length);

// Writes `length` units, one for each byte. False if one of the bytes is not below 0x80; what was written is of no use
// then.
bool WidenAscii(const char* begin, size_t length, char16_t* target);

// How many units the bytes stand for; SIZE_MAX if they are not well formed. Linear, without memory.
size_t MeasureUtf8(const char* begin, size_t length);

// Decodes well-formed bytes until they end or `capacity` units are written, and gives the end of what was decoded.
// Bytes that are not well formed end the decoding too.
const char* DecodeUtf8(const char* begin, size_t length, char16_t* target, size_t capacity);

}  // namespace qn::dsc
