#pragma once

// Arrays of strings of the host: a handle to a block that holds a 32-bit count and then that many handles to strings
// (HostString.h). Arrays and strings belong to the caller. The host must be there, as for strings.

#include <cstddef>
#include <cstdint>

#include "hostbridge/HostFunctions.h"
#include "qn/dsc/StringBase.h"

namespace zkhw {

struct HostStringArrayBlock {
    int32_t count;
    HostHandle elements[1];  // As many as `count` says.
};

static_assert(offsetof(HostStringArrayBlock, elements) == sizeof(void*), "elements follow at their natural alignment");

// The number of elements; -1 if `array` is null.
int32_t GetHostStringArrayCount(HostHandle array);

// The string at `index`, which stays the array's. This and the two below throw qn::dsc::zk::ZKErrorException with code
// 1 and the text "Array index out of bounds." if there is no such element, as always if `array` is null.
HostHandle GetHostStringArrayElement(HostHandle array, uint32_t index);

// StoreInHostString into the string at `index`.
void StoreInHostStringArray(const qn::dsc::String& text, HostHandle array, uint32_t index);

// DisposeHostString of the string at `index`, which is null then; the count stays.
void DisposeHostStringArrayElement(HostHandle array, uint32_t index);

// Makes `array` hold `newSize` elements; a null array becomes a new one. Strings beyond the new size are disposed of in
// ascending order, the others stay, and new ones are empty strings. Nothing happens if the size is right already.
// qn::dsc::zk::ZKErrorException with code 1 and the text "Invalid new_size for array." if `newSize` is negative, with
// code 2 if the host has no memory for a new array, and with the host's code if it refuses anything else: the count is
// then as it was, new strings are given back, and strings that were disposed of are null.
void ResizeHostStringArray(int32_t newSize, HostHandle& array);

}  // namespace zkhw
