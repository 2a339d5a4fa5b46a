#pragma once

// What the default code page makes of bytes that are no UTF-8, which is not the same on both platforms.

#include <string>

namespace zkhw {

// The exact text (ExactText.h) of the unit that stands for such a byte in narrow text.
std::string StrayByte(unsigned char byte);

}  // namespace zkhw
