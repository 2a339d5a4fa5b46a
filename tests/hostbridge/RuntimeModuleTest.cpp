#include "hostbridge/RuntimeModule.h"

#include <thread>

#include "host/LoadedRuntime.h"
#include "support/RunProgram.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::MakeThreadSlot;
using qn::dsc::osdep::RunProgram;
using qn::dsc::osdep::SetThreadSlot;
using qn::dsc::osdep::UnloadModule;

int first = 1;
int second = 2;

// A slot of the system, in which the calling thread holds `value`.
uint32_t MakeSlot(void* value) {
    const uint32_t slot = MakeThreadSlot();
    SetThreadSlot(slot, value);
    return slot;
}

TEST(RuntimeModule, ThereIsNoneInAPlainProcess) {
    EXPECT_EQ(runtimeModule, nullptr);
    EXPECT_EQ(runtimeTlsIndex, 0xFFFFFFFF);
    EXPECT_EQ(FindRuntimeModule(), nullptr);
}

TEST(RuntimeModule, TheOneThatTheHostNamedWinsOverLoadedOnes) {
    EXPECT_IN_CHILD([] {
        LoadModule(STAND_IN_RUNTIME);
        runtimeModule = &first;
        return FindRuntimeModule() == &first;
    });
}

TEST(RuntimeModule, TheOneInTheSlotOfTheThreadWinsOverTheNamedOne) {
    EXPECT_IN_CHILD([] {
        runtimeModule = &first;
        runtimeTlsIndex = MakeSlot(&second);
        return FindRuntimeModule() == &second;
    });
}

TEST(RuntimeModule, ThreadWithAnEmptySlotFallsThroughToTheNamedOne) {
    EXPECT_IN_CHILD([] {
        runtimeModule = &first;
        runtimeTlsIndex = MakeSlot(nullptr);
        return FindRuntimeModule() == &first;
    });
}

TEST(RuntimeModule, EachThreadHasItsOwn) {
    EXPECT_IN_CHILD([] {
        runtimeModule = &first;
        runtimeTlsIndex = MakeSlot(&second);
        ModuleHandle ofOther = nullptr;
        std::thread([&] { ofOther = FindRuntimeModule(); }).join();
        return ofOther == &first && FindRuntimeModule() == &second;
    });
}

TEST(RuntimeModule, LoadedZkrtIsFound) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(STAND_IN_RUNTIME);
        return FindRuntimeModule() == module;
    });
}

TEST(RuntimeModule, LoadedZkffrtIsFound) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(POOR_RUNTIME);
        return FindRuntimeModule() == module;
    });
}

TEST(RuntimeModule, ZkrtComesBeforeZkffrt) {
    EXPECT_IN_CHILD([] {
        LoadModule(POOR_RUNTIME);
        void* module = LoadModule(STAND_IN_RUNTIME);
        return FindRuntimeModule() == module;
    });
}

TEST(RuntimeModule, OneThatComesAfterLooksInVainIsFound) {
    EXPECT_IN_CHILD([] {
        const bool wasFound = FindRuntimeModule() != nullptr || FindRuntimeModule() != nullptr;
        void* module = LoadModule(STAND_IN_RUNTIME);
        return !wasFound && FindRuntimeModule() == module;
    });
}

TEST(RuntimeModule, OneThatHasGoneAndComeAgainIsFound) {
    EXPECT_IN_CHILD([] {
        UnloadModule(LoadModule(STAND_IN_RUNTIME));
        const bool wasFound = FindRuntimeModule() != nullptr;
        void* module = LoadModule(STAND_IN_RUNTIME);
        return !wasFound && FindRuntimeModule() == module;
    });
}

TEST(RuntimeModule, LookingKeepsNoModuleLoaded) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(STAND_IN_RUNTIME);
        const bool found = FindRuntimeModule() == module && FindRuntimeModule() == module;
        UnloadModule(module);
        return found && FindRuntimeModule() == nullptr;
    });
}

TEST(RuntimeModule, EachIsFoundOnceThoseBeforeItHaveGone) {
    EXPECT_IN_CHILD([] {
        void* zkffrt = LoadModule(POOR_RUNTIME);
        void* zkrt = LoadModule(STAND_IN_RUNTIME);
        runtimeModule = &first;
        runtimeTlsIndex = MakeSlot(&second);
        bool found = FindRuntimeModule() == &second;
        SetThreadSlot(runtimeTlsIndex, nullptr);
        found = found && FindRuntimeModule() == &first;
        runtimeModule = nullptr;
        found = found && FindRuntimeModule() == zkrt;
        UnloadModule(zkrt);
        found = found && FindRuntimeModule() == zkffrt;
        UnloadModule(zkffrt);
        return found && FindRuntimeModule() == nullptr;
    });
}

TEST(RuntimeModule, MainModuleThatExportsAVersionIsTheRuntime) {
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_gZKRTVersion" PROGRAM_SUFFIX, {}, "/").end, "exit 0");
}

TEST(RuntimeModule, MainModuleThatMakesHandlesIsTheRuntime) {
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_HostNewHandle" PROGRAM_SUFFIX, {}, "/").end, "exit 0");
}

TEST(RuntimeModule, MainModuleThatIsTheRuntimeComesBeforeLoadedOnes) {
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_gZKRTVersion" PROGRAM_SUFFIX, {STAND_IN_RUNTIME}, "/").end,
              "exit 0");
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_HostNewHandle" PROGRAM_SUFFIX, {STAND_IN_RUNTIME}, "/").end,
              "exit 0");
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_OtherName" PROGRAM_SUFFIX, {STAND_IN_RUNTIME}, "/").end,
              "exit 7");
}

TEST(RuntimeModule, MainModuleThatExportsSomethingElseIsNot) {
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_OtherName" PROGRAM_SUFFIX, {}, "/").end, "exit 7");
}

}  // namespace
}  // namespace zkhw
