#pragma once

// How a process ends, as its parent sees it, in words that hold on every platform.

#include <cstdint>
#include <string>

namespace qn::dsc::osdep {

// The ends of a ProgramResult (RunProgram.h) that are no plain exit status: of the debug trap, and of an exception that
// nobody caught.
inline constexpr char endByTrap[] = "trap";
inline constexpr char endByAbort[] = "abort";

// The end of a program that has given the result code `result` as its exit status: "exit 0". On Linux a parent sees the
// low byte of it, on Windows all of it, in hexadecimal digits from 256 on: "exit 5", "exit 0x80004005".
std::string EndWithResult(uint32_t result);

// For EXPECT_EXIT: whether the child's status is that of the debug trap.
bool EndsByTrap(int status);

}  // namespace qn::dsc::osdep
