#pragma once

// Modules and thread-local slots of the system, for tests that play the host.

#include <cstdint>

namespace qn::dsc::osdep {

// Loads the module in `file`, a native path. Null if it can't be loaded. A null `file` stands for the main module.
void* LoadModuleFile(const char* file);

// One use of the module less: it goes with the last.
void UnloadModule(void* module);

// The address of an export; null if there is none of that name.
void* FindInModule(void* module, const char* name);

// A slot of its own, in which every thread holds null. Ends the test program if there is none left.
uint32_t MakeThreadSlot();
void FreeThreadSlot(uint32_t slot);
void SetThreadSlot(uint32_t slot, void* value);

}  // namespace qn::dsc::osdep
