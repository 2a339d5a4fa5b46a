#pragma once

namespace qn::dsc::osdep {

// Ends the process on the spot: with SIGTRAP on Linux, with a breakpoint exception on Windows. For broken contracts
// that have no result code. Nothing is taken down.
[[noreturn]] void DebugTrap();

}  // namespace qn::dsc::osdep
