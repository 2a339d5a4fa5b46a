#pragma once

// The narrow encodings of the system, by name.

#include <cstdint>

namespace qn::dsc::osdep {

// The system's default code page.
inline constexpr uint32_t defaultCodePage = 0;
inline constexpr uint32_t asciiCodePage = 20127;
inline constexpr uint32_t japaneseCodePage = 932;

// The code page of a NUL-terminated locale name: "" is the default code page 0, "US-ASCII" is 20127, "cp932" is 932.
// Names are matched byte by byte. exception::InvalidLocale for any other name.
uint32_t GetCodePageID(const char* locale);

}  // namespace qn::dsc::osdep
