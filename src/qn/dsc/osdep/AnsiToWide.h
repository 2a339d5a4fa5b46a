#pragma once

// Text of the system's narrow encodings as UTF-16 units.

namespace qn::dsc::osdep {

// The units of the bytes from `begin` up to, not including, `end`, which are in the encoding of `locale`
// (_GetCodePageID.h), in a NUL-terminated buffer of array new that the caller deletes. A NUL byte ends the source
// early. An empty source, null included, gives the empty text, whatever the locale. No byte is refused: in the default
// code page a byte that is no part of valid UTF-8 becomes the unit 0xDC00 + byte (NativeText.h), in "US-ASCII" a byte
// above 0x7F loses its top bit, in "cp932" one without a character becomes U+30FB, the default character of that code
// page. exception::InvalidLocale for an unknown locale, std::bad_alloc, and WinError if the platform cannot convert.
// Linear.
char16_t* AnsiToWide(const char* begin, const char* end, const char* locale);

}  // namespace qn::dsc::osdep
