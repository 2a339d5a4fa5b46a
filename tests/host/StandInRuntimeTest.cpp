#include "host/StandInRuntime.h"

#include "host/HostTest.h"
#include "hostbridge/HostFunctions.h"

// What other tests rely on.

namespace zkhw {
namespace {

using StandInRuntimeTest = HostTest;

TEST_F(StandInRuntimeTest, BlocksMoveAtEveryCallAndHandlesStay) {
    HostHandle handle = HostNewHandleClear(4);
    HostHandle other = HostNewHandleClear(4);
    (*handle)[0] = 'x';
    char* const before = *handle;
    EXPECT_EQ(HostSetHandleSizeClear(other, 5), 0);
    EXPECT_NE(*handle, before);
    EXPECT_EQ((*handle)[0], 'x');
    HostDisposeHandle(handle);
    HostDisposeHandle(other);
}

TEST_F(StandInRuntimeTest, OthersStayWhereTheyAreIfToldSo) {
    host.movesAllBlocks = false;
    HostHandle handle = HostNewHandleClear(4);
    HostHandle other = HostNewHandleClear(4);
    char* const before = *handle;
    char* const otherBefore = *other;
    EXPECT_EQ(HostSetHandleSizeClear(other, 5), 0);
    EXPECT_EQ(*handle, before);
    EXPECT_NE(*other, otherBefore);
    HostDisposeHandle(handle);
    HostDisposeHandle(other);
}

TEST_F(StandInRuntimeTest, FaultsAreCountedFromWhereTheyAreSet) {
    HostHandle handle = HostNewHandleClear(4);
    host.Fail("HostSetHandleSizeClear", 7, 2);
    EXPECT_EQ(HostSetHandleSizeClear(handle, 5), 0);
    EXPECT_EQ(HostSetHandleSizeClear(handle, 6), 7);
    EXPECT_EQ(host.blockSizes.at(handle), 5u);
    EXPECT_EQ(HostSetHandleSizeClear(handle, 6), 0);
    EXPECT_EQ(host.Count("HostSetHandleSizeClear"), 3u);
    HostDisposeHandle(handle);
}

TEST_F(StandInRuntimeTest, ResetForgetsAllButWhatIsAlive) {
    HostHandle handle = HostNewHandleClear(4);
    HostPathReference path = HostEmptyPath(nullptr);
    host.language = "Japanese";
    host.Fail("HostDisposeHandle", 7);
    host.Reset();
    EXPECT_EQ(host.language, "English");
    EXPECT_TRUE(host.calls.empty());
    EXPECT_EQ(host.LiveHandleCount(), 1u);
    EXPECT_EQ(host.LivePathCount(), 1u);
    EXPECT_EQ(HostDisposeHandle(handle), 0);
    HostDestroyPath(path);
}

using StandInRuntimeDeathTest = HostTest;

TEST_F(StandInRuntimeDeathTest, HandleThatHasGoneEndsTheProcess) {
    HostHandle handle = HostNewHandleClear(4);
    HostDisposeHandle(handle);
    EXPECT_DEATH(HostDisposeHandle(handle), "stand-in run-time: HostDisposeHandle: no handle of this run-time");
}

TEST_F(StandInRuntimeDeathTest, PathThatHasGoneEndsTheProcess) {
    HostPathReference path = HostEmptyPath(nullptr);
    HostDestroyPath(path);
    EXPECT_DEATH(HostDestroyPath(path), "stand-in run-time: HostDestroyPath: no path of this run-time");
}

TEST_F(StandInRuntimeDeathTest, FunctionThatNobodyMayCallEndsTheProcess) {
    EXPECT_DEATH(reinterpret_cast<void (*)()>(qn::dsc::osdep::FindInModule(module, "HostCopyFile"))(),
                 "stand-in run-time: HostCopyFile: called");
}

}  // namespace
}  // namespace zkhw
