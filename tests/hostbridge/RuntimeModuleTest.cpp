#include "hostbridge/RuntimeModule.h"

#include <thread>

#include <pthread.h>

#include "host/LoadedRuntime.h"
#include "support/RunProgram.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::RunProgram;

int first = 1;
int second = 2;

// A slot of the system, in which the calling thread holds `value`.
uint32_t MakeSlot(void* value) {
    pthread_key_t key = 0;
    if (pthread_key_create(&key, nullptr) != 0 || pthread_setspecific(key, value) != 0) {
        std::abort();
    }
    return key;
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
        dlclose(LoadModule(STAND_IN_RUNTIME));
        const bool wasFound = FindRuntimeModule() != nullptr;
        void* module = LoadModule(STAND_IN_RUNTIME);
        return !wasFound && FindRuntimeModule() == module;
    });
}

TEST(RuntimeModule, LookingKeepsNoModuleLoaded) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(STAND_IN_RUNTIME);
        const bool found = FindRuntimeModule() == module && FindRuntimeModule() == module;
        dlclose(module);
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
        pthread_setspecific(runtimeTlsIndex, nullptr);
        found = found && FindRuntimeModule() == &first;
        runtimeModule = nullptr;
        found = found && FindRuntimeModule() == zkrt;
        dlclose(zkrt);
        found = found && FindRuntimeModule() == zkffrt;
        dlclose(zkffrt);
        return found && FindRuntimeModule() == nullptr;
    });
}

TEST(RuntimeModule, MainModuleThatExportsAVersionIsTheRuntime) {
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_gZKRTVersion", {}, "/").end, "exit 0");
}

TEST(RuntimeModule, MainModuleThatMakesHandlesIsTheRuntime) {
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_HostNewHandle", {}, "/").end, "exit 0");
}

TEST(RuntimeModule, MainModuleThatIsTheRuntimeComesBeforeLoadedOnes) {
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_gZKRTVersion", {STAND_IN_RUNTIME}, "/").end, "exit 0");
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_HostNewHandle", {STAND_IN_RUNTIME}, "/").end, "exit 0");
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_OtherName", {STAND_IN_RUNTIME}, "/").end, "exit 3");
}

TEST(RuntimeModule, MainModuleThatExportsSomethingElseIsNot) {
    EXPECT_EQ(RunProgram(MAIN_MODULE_PROBES "/main_module_OtherName", {}, "/").end, "exit 3");
}

}  // namespace
}  // namespace zkhw
