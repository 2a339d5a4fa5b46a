#include "hostbridge/HostFunctions.h"

#include <functional>
#include <iterator>
#include <thread>

#include "host/HostTest.h"
#include "hostbridge/HostFunctionTable.h"
#include "zkfpga/exports.h"
#include "zkfpga/host_runtime.h"

namespace zkhw {
namespace {

using qn::dsc::Guid;
using Calls = std::vector<std::string>;

// What a maker of a run-time is told is what the stubs call.
static_assert(std::is_same_v<HostHandle, ZkHandle> && std::is_same_v<HostPathReference, ZkPath>);
static_assert(std::is_same_v<decltype(zkhw::HostSetHandleSizeClear), decltype(::HostSetHandleSizeClear)>);
static_assert(std::is_same_v<decltype(zkhw::HostDisposeHandle), decltype(::HostDisposeHandle)>);
static_assert(std::is_same_v<decltype(zkhw::HostNewHandleClear), decltype(::HostNewHandleClear)>);
static_assert(std::is_same_v<decltype(zkhw::HostGetErrorText), decltype(::HostGetErrorText)>);
static_assert(std::is_same_v<decltype(zkhw::HostResizeArray), decltype(::HostResizeArray)>);
static_assert(std::is_same_v<decltype(zkhw::HostGetLanguageName), decltype(::HostGetLanguageName)>);
// A GUID under another name, by value.
static_assert(std::is_same_v<decltype(::QueryInterfaceForZKRefNum), HRESULT(uint32_t, GUID, void**)>);
static_assert(std::is_same_v<decltype(zkhw::QueryInterfaceForZKRefNum), int32_t(uint32_t, Guid, void**)>);
static_assert(sizeof(HRESULT) == sizeof(int32_t) && HRESULT(-1) < 0);
static_assert(sizeof(Guid) == sizeof(GUID));
static_assert(std::is_same_v<decltype(zkhw::HostEmptyPath), decltype(::HostEmptyPath)>);
static_assert(std::is_same_v<decltype(zkhw::HostPathToString), decltype(::HostPathToString)>);
static_assert(std::is_same_v<decltype(zkhw::HostGetSpecialDir), decltype(::HostGetSpecialDir)>);
static_assert(std::is_same_v<decltype(zkhw::HostDestroyPath), decltype(::HostDestroyPath)>);
static_assert(std::is_same_v<decltype(zkhw::HostTextToPath), decltype(::HostTextToPath)>);
static_assert(std::is_same_v<decltype(zkhw::HostSystemTextToPath), decltype(::HostSystemTextToPath)>);

struct Stub {
    const char* name;
    std::function<void()> call;
};

std::vector<Stub> AllStubs() {
    return {
        {"HostSetHandleSizeClear", [] { zkhw::HostSetHandleSizeClear(nullptr, 0); }},
        {"HostDisposeHandle", [] { zkhw::HostDisposeHandle(nullptr); }},
        {"HostNewHandleClear", [] { zkhw::HostNewHandleClear(0); }},
        {"HostGetErrorText", [] { zkhw::HostGetErrorText(0, nullptr); }},
        {"HostResizeArray", [] { zkhw::HostResizeArray(5, 1, nullptr, 0); }},
        {"HostGetLanguageName", [] { zkhw::HostGetLanguageName(nullptr); }},
        {"QueryInterfaceForZKRefNum", [] { QueryInterfaceForZKRefNum(0, Guid(), nullptr); }},
        {"HostEmptyPath", [] { zkhw::HostEmptyPath(nullptr); }},
        {"HostPathToString", [] { zkhw::HostPathToString(nullptr, nullptr); }},
        {"HostGetSpecialDir", [] { zkhw::HostGetSpecialDir(0, nullptr); }},
        {"HostDestroyPath", [] { zkhw::HostDestroyPath(nullptr); }},
        {"HostTextToPath", [] { zkhw::HostTextToPath(nullptr, 0, nullptr); }},
        {"HostSystemTextToPath", [] { zkhw::HostSystemTextToPath(nullptr, nullptr); }},
    };
}

TEST(HostFunctionsDeathTest, CallWithoutARuntimeIsFatal) {
    for (const Stub& stub : AllStubs()) {
        SCOPED_TRACE(stub.name);
        EXPECT_EXIT(stub.call(), testing::ExitedWithCode(1),
                    "^Fatal Error: ZARVIKV\\.LIB was not called from a Zarvik process\\.\n$");
    }
}

TEST(HostFunctionsDeathTest, MissingFunctionIsFatalAndNamed) {
    for (const Stub& stub : AllStubs()) {
        SCOPED_TRACE(stub.name);
        EXPECT_EXIT(
            {
                LoadModule(POOR_RUNTIME);
                stub.call();
            },
            testing::ExitedWithCode(1),
            "^Fatal Error: ZARVIKV\\.LIB could not locate \"" + std::string(stub.name) + "\"\\.\n$");
    }
}

using HostFunctions = HostTest;

TEST_F(HostFunctions, HandleFunctionsGetTheirArgumentsAndGiveTheirResults) {
    HostHandle handle = zkhw::HostNewHandleClear(8);
    ASSERT_NE(handle, nullptr);
    EXPECT_EQ(std::string(*handle, 8), std::string(8, '\0'));
    (*handle)[7] = 'x';
    EXPECT_EQ(zkhw::HostSetHandleSizeClear(handle, 12), 0);
    EXPECT_EQ(std::string(*handle, 12), std::string("\0\0\0\0\0\0\0x\0\0\0\0", 12));
    host.Fail("HostSetHandleSizeClear", -2);
    EXPECT_EQ(zkhw::HostSetHandleSizeClear(handle, 100), -2);
    host.Fail("HostDisposeHandle", 42);
    EXPECT_EQ(zkhw::HostDisposeHandle(handle), 42);
    EXPECT_EQ(zkhw::HostDisposeHandle(handle), 0);
    EXPECT_EQ(TakeCalls(), (Calls{"HostNewHandleClear 8", "HostSetHandleSizeClear 12", "HostSetHandleSizeClear 100",
                                  "HostDisposeHandle", "HostDisposeHandle"}));
}

TEST_F(HostFunctions, SizesMayHaveMoreThan32Bits) {
    host.Fail("HostNewHandleClear", 2);
    EXPECT_EQ(zkhw::HostNewHandleClear(0x123456789A), nullptr);
    EXPECT_EQ(TakeCalls(), Calls{"HostNewHandleClear 78187493530"});
}

TEST_F(HostFunctions, ArrayFunctionGetsAllFourArguments) {
    HostHandle array = nullptr;
    EXPECT_EQ(zkhw::HostResizeArray(7, 2, &array, 3), 1);
    EXPECT_EQ(zkhw::HostResizeArray(5, 1, &array, 3), 0);
    EXPECT_NE(array, nullptr);
    EXPECT_EQ(TakeCalls(), (Calls{"HostResizeArray 7 2 3", "HostResizeArray 5 1 3"}));
    zkhw::HostDisposeHandle(array);
}

TEST_F(HostFunctions, ErrorTextComesWithItsAnswer) {
    host.errorTexts[-7] = "words";
    HostHandle text = nullptr;
    EXPECT_EQ(zkhw::HostGetErrorText(8, &text), 0);
    EXPECT_EQ(text, nullptr);
    EXPECT_EQ(zkhw::HostGetErrorText(-7, &text), 1);
    ASSERT_NE(text, nullptr);
    EXPECT_EQ(std::string(*text, 9), std::string("\5\0\0\0words", 9));
    zkhw::HostDisposeHandle(text);
}

TEST_F(HostFunctions, PathFunctionsGetTheirArgumentsAndGiveTheirResults) {
    host.specialDirectories[3] = "/three";
    HostPathReference path = zkhw::HostEmptyPath(nullptr);
    StandInPath& known = *static_cast<StandInPath*>(path);
    EXPECT_EQ(zkhw::HostTextToPath("host text", 4, path), 0);
    EXPECT_EQ(known.text, "host");
    EXPECT_EQ(zkhw::HostSystemTextToPath("system text", path), 0);
    EXPECT_EQ(known.text, "system text");
    EXPECT_EQ(zkhw::HostEmptyPath(path), path);
    EXPECT_EQ(known.text, "");
    EXPECT_EQ(zkhw::HostGetSpecialDir(4, path), 7);
    EXPECT_EQ(zkhw::HostGetSpecialDir(3, path), 0);
    HostHandle text = nullptr;
    EXPECT_EQ(zkhw::HostPathToString(path, &text), 0);
    EXPECT_EQ(std::string(*text, 10), std::string("\6\0\0\0/three", 10));
    zkhw::HostDisposeHandle(text);
    zkhw::HostDestroyPath(path);
}

TEST_F(HostFunctions, InterfaceIdIsPassedByValue) {
    const uint8_t tail[] = {0xC0, 1, 2, 3, 4, 5, 6, 0x46};
    int object = 0;
    std::array<uint8_t, 16> asked{};
    host.queryInterface = [&](uint32_t, const std::array<uint8_t, 16>& id, void** result) {
        asked = id;
        *result = &object;
        return 0;
    };
    void* result = nullptr;
    EXPECT_EQ(QueryInterfaceForZKRefNum(0xFFFFFFF0, Guid(0x01020304, 0x0506, 0x0708, tail), &result), 0);
    EXPECT_EQ(result, &object);
    EXPECT_EQ(TakeCalls(), Calls{"QueryInterfaceForZKRefNum 4294967280"});
    const std::array<uint8_t, 16> expected{4, 3, 2, 1, 6, 5, 8, 7, 0xC0, 1, 2, 3, 4, 5, 6, 0x46};
    EXPECT_EQ(asked, expected);
}

TEST_F(HostFunctions, InterfaceThatTheHostHasNotIsANegativeResult) {
    void* result = this;
    EXPECT_EQ(static_cast<uint32_t>(QueryInterfaceForZKRefNum(1, Guid(), &result)), 0x80004002u);
    EXPECT_EQ(result, nullptr);
}

// In a process of its own: the first of two modules would be found by its name afterwards.
TEST(HostFunctionsOfTwoModules, CallGoesToTheModuleThatAnswersNow) {
    EXPECT_IN_CHILD([] {
        void* first = LoadModule(STAND_IN_RUNTIME);
        void* second = LoadModule(UNNAMED_RUNTIME);
        const auto callIn = [](void* module) {
            SetZKRTModule(module);
            zkhw::HostDestroyPath(zkhw::HostEmptyPath(nullptr));
            return RecordOf(HostFunction::HostEmptyPath).module == module;
        };
        const bool bound = callIn(first) && callIn(second) && callIn(second) && callIn(first);
        return bound && StandInOf(first).Count("HostEmptyPath") == 2 && StandInOf(second).Count("HostEmptyPath") == 2;
    });
}

TEST(HostFunctionsOfTwoModules, EachThreadCallsTheModuleInItsSlot) {
    EXPECT_IN_CHILD([] {
        void* first = LoadModule(STAND_IN_RUNTIME);
        void* second = LoadModule(UNNAMED_RUNTIME);
        const uint32_t key = qn::dsc::osdep::MakeThreadSlot();
        SetZKRTTLSIndex(key);
        // One thread at a time: a row is written without a lock.
        const auto callOnThread = [&](void* module) {
            bool bound = false;
            std::thread([&] {
                qn::dsc::osdep::SetThreadSlot(key, module);
                zkhw::HostDestroyPath(zkhw::HostEmptyPath(nullptr));
                bound = RecordOf(HostFunction::HostEmptyPath).module == module;
            }).join();
            return bound;
        };
        const bool bound = callOnThread(first) && callOnThread(second) && callOnThread(first);
        return bound && StandInOf(first).Count("HostEmptyPath") == 2 && StandInOf(second).Count("HostEmptyPath") == 1;
    });
}

}  // namespace
}  // namespace zkhw
