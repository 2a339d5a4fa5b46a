#include <windows.h>

#include <gtest/gtest.h>

#include "support/SmallStack.h"

namespace qn::dsc::osdep {

namespace {

constexpr SIZE_T stackSize = 256 * 1024;

DWORD WINAPI CallWork(void* work) {
    (*static_cast<const std::function<void()>*>(work))();
    return 0;
}

}  // namespace

void RunOnSmallStack(const std::function<void()>& work) {
    void* argument = const_cast<std::function<void()>*>(&work);
    // What is reserved is all that the stack ever gets.
    const HANDLE thread =
        CreateThread(nullptr, stackSize, &CallWork, argument, STACK_SIZE_PARAM_IS_A_RESERVATION, nullptr);
    ASSERT_NE(thread, nullptr) << GetLastError();
    ASSERT_EQ(WaitForSingleObject(thread, INFINITE), WAIT_OBJECT_0);
    CloseHandle(thread);
}

}  // namespace qn::dsc::osdep
