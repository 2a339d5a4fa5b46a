#pragma once

// Runs a part of a test where the stack is small, so that recursion over the depth of some input ends the process.

#include <cstdint>
#include <functional>

namespace qn::dsc::osdep {

// Calls `work` on a thread of its own with a stack of 256 KB and waits for it. An exception must not leave `work`.
void RunOnSmallStack(const std::function<void()>& work);

// A number of nested folders over which recursion would exhaust that stack: `wanted`, or fewer where a call's time
// grows with the depth of its path.
uint32_t FoldersBeyondTheSmallStack(uint32_t wanted);

}  // namespace qn::dsc::osdep
