#pragma once

// The host's run-time module, if this code runs inside a host. It is never loaded here, only found. Any thread may ask.

#include <cstdint>

#include "qn/dsc/osdep/Module.h"

namespace zkhw {

using qn::dsc::osdep::ModuleHandle;

inline constexpr uint32_t noThreadSlot = 0xFFFFFFFF;

// The module that the host named, or null.
extern ModuleHandle runtimeModule;

// The thread-local slot in which a thread of the host may hold a module of its own, or noThreadSlot.
extern uint32_t runtimeTlsIndex;

// The run-time module: what the calling thread holds in its slot, or else the module that the host named, or else the
// main module if it exports what a run-time does, or else the loaded "zkrt.dll" or "zkffrt.dll". Null: there is no
// host. Without a host it costs a few look-ups among the loaded modules.
ModuleHandle FindRuntimeModule();

}  // namespace zkhw
