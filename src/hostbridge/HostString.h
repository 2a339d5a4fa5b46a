#pragma once

// Strings of the host: a handle to a block that holds a 32-bit length and then that many bytes, without a terminator.
// No handle and a length of 0 are both the empty string. Handles that come in are the caller's and stay so.
// Every operation that stores calls the host's run-time (HostFunctions.h) and throws qn::dsc::zk::ZKErrorException with
// the host's code and words if the host refuses. No memory of our own: std::bad_alloc.

#include <cstdint>

#include "hostbridge/HostFunctions.h"
#include "qn/dsc/StringBase.h"

namespace zkhw {

// All bytes of the string, NULs included.
qn::dsc::NarrowString HostStringToNarrow(HostHandle handle);

// The string, widened by the system's default code page; that conversion ends at a NUL (osdep/AnsiToWide.h).
qn::dsc::String HostStringToString(HostHandle handle);

// Makes `handle` hold the text; a null handle becomes a new string. All bytes are stored, NULs included; wide text goes
// through the system's default code page, and that conversion ends at a NUL (osdep/WideToAnsi.h). `bytes` must not lie
// in the block of `handle`, and may be null if `length` is 0. On a failure the string is as it was.
void StoreInHostString(const qn::dsc::NarrowString& text, HostHandle& handle);
void StoreInHostString(const qn::dsc::String& text, HostHandle& handle);
void StoreInHostString(const char* bytes, uint32_t length, HostHandle& handle);

// The same for a handle that was handed over by value: a new string couldn't be given back, so that without one nothing
// is stored, nor asked of the host.
void StoreInGivenHostString(const qn::dsc::String& text, HostHandle handle);
void StoreInGivenHostString(const char* bytes, uint32_t length, HostHandle handle);

// Stores the empty string: a null handle becomes a string of length 0.
void ClearHostString(HostHandle& handle);

// Gives the string back to the host and makes `handle` null. On a failure `handle` stays.
void DisposeHostString(HostHandle& handle);

}  // namespace zkhw
