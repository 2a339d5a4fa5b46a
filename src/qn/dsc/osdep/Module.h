#pragma once

// Modules that are loaded in this process, their exports, and thread-local slots. Nothing here loads a module or keeps
// one from being unloaded. Any thread may call.

#include <cstdint>

namespace qn::dsc::osdep {

using ModuleHandle = void*;
using CodePointer = void (*)();

// The main module of the process. Its exports count together with those of the modules that were linked to it.
ModuleHandle GetMainModule();

// An already loaded module, wherever it was loaded from; null if it isn't. `name` is a file name as on Windows: "x.dll"
// is libx.so on Linux, and "x" with any other ending is x.so there.
ModuleHandle FindLoadedModule(const char* name);

// How many modules have been loaded into the process so far, those that have gone included. While the number stays, no
// module has come: one that was looked for in vain isn't there still. On Windows, which doesn't count, the number is
// another one at each call.
uint64_t CountLoadedModules();

// The address of an export of `module`; null if it has none of that name.
CodePointer FindExport(ModuleHandle module, const char* name);

// What the calling thread holds in a thread-local slot of the system; null if nothing.
void* ReadThreadSlot(uint32_t slot);

}  // namespace qn::dsc::osdep
