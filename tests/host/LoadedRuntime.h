#pragma once

// Run-time modules for a test, and a process of its own for it: what is loaded, bound and remembered there is gone at
// its end. The modules, by the names of their files (zkfpga_use_stand_in_runtime gives them to a test program):
//
//     STAND_IN_RUNTIME    StandInRuntime.h as libzkrt.so (zkrt.dll), which is found once it is loaded
//     UNNAMED_RUNTIME     the same under a name that isn't looked for
//     POOR_RUNTIME        libzkffrt.so (zkffrt.dll), without any of the host's functions

#include <cstdlib>

#include <gtest/gtest.h>

#include "host/StandInRuntime.h"
#include "support/Modules.h"

template <typename Check>
[[noreturn]] void ExitWith(Check check) {
    std::_Exit(check() ? 0 : 9);
}

// Runs a lambda, which gives whether all is well, in a process of its own, which must have nothing to say.
#define EXPECT_IN_CHILD(...) EXPECT_EXIT(ExitWith(__VA_ARGS__), testing::ExitedWithCode(0), "^$")

inline void* LoadModule(const char* file) {
    void* module = qn::dsc::osdep::LoadModuleFile(file);
    if (module == nullptr) {
        std::abort();
    }
    return module;
}

inline StandInRuntime& StandInOf(void* module) {
    return *static_cast<StandInRuntime*>(qn::dsc::osdep::FindInModule(module, "standInRuntime"));
}

inline StandInRuntime& LoadStandInRuntime() {
    return StandInOf(LoadModule(STAND_IN_RUNTIME));
}
