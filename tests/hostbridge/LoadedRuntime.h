#pragma once

// Run-time modules for a test, and a process of its own for it: what is loaded, bound and remembered there is gone at
// its end.

#include <cstdlib>

#include <dlfcn.h>
#include <gtest/gtest.h>

#include "hostbridge/FakeRuntime.h"

template <typename Check>
[[noreturn]] void ExitWith(Check check) {
    std::_Exit(check() ? 0 : 9);
}

// Runs a lambda, which gives whether all is well, in a process of its own.
#define EXPECT_IN_CHILD(...) EXPECT_EXIT(ExitWith(__VA_ARGS__), testing::ExitedWithCode(0), "")

inline void* LoadModule(const char* file) {
    void* module = dlopen(file, RTLD_NOW | RTLD_LOCAL);
    if (module == nullptr) {
        std::abort();
    }
    return module;
}

inline FakeRuntime& LoadFakeRuntime() {
    return *static_cast<FakeRuntime*>(dlsym(LoadModule(FAKE_RUNTIME), "fakeRuntime"));
}
