#include "host/LoadedRuntime.h"
#include "hostbridge/RuntimeModule.h"
#include "support/RunProgram.h"
#include "zkfpga/exports.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::RunProgram;

TEST(RuntimeExports, ModuleThatTheHostNamesIsTheRuntime) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(UNNAMED_RUNTIME);
        SetZKRTModule(module);
        return runtimeModule == module && FindRuntimeModule() == module;
    });
}

TEST(RuntimeExports, NamedModuleCanBeTakenBack) {
    EXPECT_IN_CHILD([] {
        SetZKRTModule(LoadModule(UNNAMED_RUNTIME));
        SetZKRTModule(nullptr);
        return runtimeModule == nullptr && FindRuntimeModule() == nullptr;
    });
}

TEST(RuntimeExports, ThreadWithAnEmptySlotFallsThroughToTheNamedModule) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(UNNAMED_RUNTIME);
        const uint32_t key = qn::dsc::osdep::MakeThreadSlot();
        SetZKRTModule(module);
        SetZKRTTLSIndex(key);
        return runtimeTlsIndex == key && FindRuntimeModule() == module;
    });
}

TEST(RuntimeExports, SlotIsLookedAtUntilItIsTakenBack) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(UNNAMED_RUNTIME);
        const uint32_t key = qn::dsc::osdep::MakeThreadSlot();
        qn::dsc::osdep::SetThreadSlot(key, module);
        SetZKRTTLSIndex(key);
        const bool found = FindRuntimeModule() == module;
        SetZKRTTLSIndex(0xFFFFFFFF);
        return found && FindRuntimeModule() == nullptr;
    });
}

TEST(RuntimeExports, SlotThatTheSystemHasNotIsPassedOver) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(UNNAMED_RUNTIME);
        SetZKRTModule(module);
        SetZKRTTLSIndex(0x7FFFFFFF);
        return FindRuntimeModule() == module;
    });
}

TEST(RuntimeExports, HooksDoNothing) {
    int other = 0;
    SetZKRTModuleHook(&other);
    SetZKRTTLSIndexHook(3);
    EXPECT_EQ(runtimeModule, nullptr);
    EXPECT_EQ(runtimeTlsIndex, 0xFFFFFFFF);
}

// On Windows a call inside a module reaches the module's own function, whatever the host exports.
TEST(RuntimeExports, EachSetterCallsItsHookWithWhatWasSetAsOnlyLinuxLetsHostsReplaceIt) {
    EXPECT_EQ(RunProgram(HOOK_PROBE, {}, "/").end, "exit 0");
}

}  // namespace
}  // namespace zkhw
