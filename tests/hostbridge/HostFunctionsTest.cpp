#include "hostbridge/HostFunctions.h"

#include "hostbridge/LoadedRuntime.h"
#include "hostbridge/RuntimeModule.h"

namespace zkhw {
namespace {

TEST(HostFunctionsDeathTest, CallWithoutARuntimeIsFatal) {
    EXPECT_EXIT(HostEmptyPath(nullptr), testing::ExitedWithCode(1),
                "^Fatal Error: ZARVIKV\\.LIB was not called from a Zarvik process\\.\n$");
}

TEST(HostFunctionsDeathTest, MissingFunctionIsFatalAndNamed) {
    EXPECT_EXIT(
        {
            LoadModule(POOR_RUNTIME);
            HostEmptyPath(nullptr);
        },
        testing::ExitedWithCode(1), "^Fatal Error: ZARVIKV\\.LIB could not locate \"HostEmptyPath\"\\.\n$");
}

TEST(HostFunctions, RecordIsBoundAtItsFirstCall) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(FAKE_RUNTIME);
        HostFunctionRecord record{nullptr, nullptr, "HostEmptyPath"};
        ResolveHostFunction(record);
        return record.module == module && record.function == qn::dsc::osdep::FindExport(module, "HostEmptyPath");
    });
}

TEST(HostFunctions, RecordIsBoundAnewWhenAnotherModuleAnswers) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(FAKE_RUNTIME);
        HostFunctionRecord record{nullptr, nullptr, "malloc"};
        runtimeModule = qn::dsc::osdep::GetMainModule();
        ResolveHostFunction(record);
        const bool wasMain = record.module == runtimeModule && record.function != nullptr;
        runtimeModule = module;
        ResolveHostFunction(record);
        return wasMain && record.module == module && record.function != nullptr;
    });
}

TEST(HostFunctionsDeathTest, FunctionOfAModuleThatNoLongerAnswersIsNotKept) {
    EXPECT_EXIT(
        {
            void* module = LoadModule(FAKE_RUNTIME);
            runtimeModule = module;
            HostEmptyPath(nullptr);
            runtimeModule = LoadModule(POOR_RUNTIME);
            HostEmptyPath(nullptr);
        },
        testing::ExitedWithCode(1), "could not locate \"HostEmptyPath\"\\.");
}

}  // namespace
}  // namespace zkhw
