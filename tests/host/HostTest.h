#pragma once

// A test in the process of a host, which is there from its beginning to its end. Afterwards the host must have all its
// handles and paths back.

#include <string>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "host/LoadedRuntime.h"
#include "hostbridge/RuntimeModule.h"

class HostTest : public testing::Test {
  protected:
    // The module is named, not found: tests without a host can go on in the same process. It stays loaded, because
    // records of its functions stay bound.
    HostTest() : module(LoadModule(UNNAMED_RUNTIME)), host(StandInOf(module)) {
        host.Reset();
        zkhw::runtimeModule = module;
    }
    ~HostTest() override {
        EXPECT_EQ(host.LiveHandleCount(), 0u);
        EXPECT_EQ(host.LivePathCount(), 0u);
        zkhw::runtimeModule = nullptr;
    }

    // What the host was asked since the last time.
    std::vector<std::string> TakeCalls() { return std::exchange(host.calls, {}); }

    void* const module;
    StandInRuntime& host;
};
