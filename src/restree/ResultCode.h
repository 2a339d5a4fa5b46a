#pragma once

// Result codes: 32 bits, negative means failure. 0 is success.

#include <cstdint>

namespace zkhw {

inline constexpr int32_t success = 0;
inline constexpr int32_t generalFailure = static_cast<int32_t>(0x80004005);
inline constexpr int32_t outOfMemory = static_cast<int32_t>(0x8007000E);
inline constexpr int32_t invalidArgument = static_cast<int32_t>(0x80070057);

}  // namespace zkhw
