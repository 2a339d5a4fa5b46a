#include "hostbridge/HostFunctionTable.h"

#include <cstddef>

#include "host/LoadedRuntime.h"
#include "hostbridge/RuntimeModule.h"

namespace zkhw {
namespace {

using qn::dsc::osdep::FindExport;

constexpr const char* names[] = {
    "HostSetHandleSizeClear",
    "HostDisposeHandle",
    "HostNewHandleClear",
    "HostGetErrorText",
    "HostResizeArray",
    "HostGetLanguageName",
    "QueryInterfaceForZKRefNum",
    "HostEmptyPath",
    "HostPathToString",
    "HostGetSpecialDir",
    "HostCopyFile",
    "HostMoveFile",
    "HostRemoveFile",
    "HostFileExists",
    "HostDestroyPath",
    "HostArchiveHoldsFile",
    "HostDirName",
    "HostNamePointer",
    "HostClonePath",
    "HostFileInPackedLibrary",
    "HostPathToSystemString",
    "HostTextToPath",
    "HostSystemTextToPath",
};

TEST(HostFunctionTable, HasTwentyThreeRowsInOrder) {
    ASSERT_EQ(std::size(hostFunctions), 23u);
    for (uint32_t row = 0; row < 23; ++row) {
        EXPECT_STREQ(hostFunctions[row].name, names[row]) << row + 1;
    }
}

TEST(HostFunctionTable, EachFunctionHasTheRowOfItsName) {
    EXPECT_STREQ(RecordOf(HostFunction::HostSetHandleSizeClear).name, "HostSetHandleSizeClear");
    EXPECT_STREQ(RecordOf(HostFunction::HostGetSpecialDir).name, "HostGetSpecialDir");
    EXPECT_STREQ(RecordOf(HostFunction::HostDestroyPath).name, "HostDestroyPath");
    EXPECT_STREQ(RecordOf(HostFunction::HostTextToPath).name, "HostTextToPath");
    EXPECT_STREQ(RecordOf(HostFunction::HostSystemTextToPath).name, "HostSystemTextToPath");
}

TEST(HostFunctionTable, RowHoldsFunctionThenModuleThenItsName) {
    EXPECT_EQ(offsetof(HostFunctionRecord, function), 0u);
    EXPECT_EQ(offsetof(HostFunctionRecord, module), sizeof(void*));
    EXPECT_EQ(offsetof(HostFunctionRecord, name), 2 * sizeof(void*));
    EXPECT_EQ(sizeof(HostFunctionRecord) % 4, 0u);
}

TEST(HostFunctionTable, RowThatWasNeverCalledIsEmpty) {
    EXPECT_EQ(RecordOf(HostFunction::HostCopyFile).function, nullptr);
    EXPECT_EQ(RecordOf(HostFunction::HostCopyFile).module, nullptr);
}

TEST(HostFunctionTable, EveryRowIsBoundInACompleteRuntime) {
    EXPECT_IN_CHILD([] {
        void* module = LoadModule(STAND_IN_RUNTIME);
        for (HostFunctionRecord& record : hostFunctions) {
            ResolveHostFunction(record);
            if (record.module != module || record.function == nullptr ||
                record.function != FindExport(module, record.name)) {
                return false;
            }
        }
        return true;
    });
}

TEST(HostFunctionTableDeathTest, EveryRowThatTheRuntimeLacksIsFatalAndNamed) {
    for (const char* name : names) {
        SCOPED_TRACE(name);
        EXPECT_EXIT(
            {
                LoadModule(POOR_RUNTIME);
                for (HostFunctionRecord& record : hostFunctions) {
                    if (std::string(record.name) == name) {
                        ResolveHostFunction(record);
                    }
                }
            },
            testing::ExitedWithCode(1),
            "^Fatal Error: ZARVIKV\\.LIB could not locate \"" + std::string(name) + "\"\\.\n$");
    }
}

TEST(HostFunctionTableDeathTest, RowWithoutARuntimeIsFatal) {
    EXPECT_EXIT(ResolveHostFunction(RecordOf(HostFunction::HostClonePath)), testing::ExitedWithCode(1),
                "^Fatal Error: ZARVIKV\\.LIB was not called from a Zarvik process\\.\n$");
}

TEST(HostFunctionTable, BoundRowIsFatalOnceTheRuntimeHasGone) {
    EXPECT_EXIT(
        {
            runtimeModule = LoadModule(UNNAMED_RUNTIME);
            ResolveHostFunction(RecordOf(HostFunction::HostEmptyPath));
            runtimeModule = nullptr;
            ResolveHostFunction(RecordOf(HostFunction::HostEmptyPath));
        },
        testing::ExitedWithCode(1), "^Fatal Error: ZARVIKV\\.LIB was not called from a Zarvik process\\.\n$");
}

TEST(HostFunctionTable, RowIsBoundAnewWhenAnotherModuleAnswers) {
    EXPECT_IN_CHILD([] {
        void* const first = LoadModule(UNNAMED_RUNTIME);
        void* const second = LoadModule(STAND_IN_RUNTIME);
        HostFunctionRecord record{nullptr, nullptr, "HostNewHandleClear"};
        runtimeModule = first;
        ResolveHostFunction(record);
        const qn::dsc::osdep::CodePointer functionOfFirst = record.function;
        const bool wasFirst = record.module == first && functionOfFirst != nullptr;
        runtimeModule = second;
        ResolveHostFunction(record);
        return wasFirst && record.module == second && record.function != nullptr && record.function != functionOfFirst;
    });
}

TEST(HostFunctionTable, FunctionOfAModuleThatNoLongerAnswersIsNotKept) {
    EXPECT_EXIT(
        {
            runtimeModule = LoadModule(UNNAMED_RUNTIME);
            ResolveHostFunction(RecordOf(HostFunction::HostEmptyPath));
            runtimeModule = LoadModule(POOR_RUNTIME);
            ResolveHostFunction(RecordOf(HostFunction::HostEmptyPath));
        },
        testing::ExitedWithCode(1), "could not locate \"HostEmptyPath\"\\.");
}

}  // namespace
}  // namespace zkhw
