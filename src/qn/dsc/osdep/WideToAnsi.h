#pragma once

// UTF-16 units as text of the system's narrow encodings.

namespace qn::dsc::osdep {

// The bytes, in the encoding of `locale` (_GetCodePageID.h), of the units from `begin` up to, not including, `end`, in
// a NUL-terminated buffer of array new that the caller deletes. A NUL unit ends the source early. An empty source, null
// included, gives the empty text, whatever the locale.
// No unit is refused: one without a counterpart becomes "?". In the default code page these are the lone surrogates
// except 0xDC80 to 0xDCFF, which give the byte back that AnsiToWide made them of (NativeText.h); in "US-ASCII" all
// units above 0x7F. exception::InvalidLocale for an unknown locale, std::bad_alloc, and WinError if the platform
// cannot convert. Linear.
char* WideToAnsi(const char16_t* begin, const char16_t* end, const char* locale);

}  // namespace qn::dsc::osdep
