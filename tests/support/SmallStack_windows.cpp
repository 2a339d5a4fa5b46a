#include <windows.h>

#include <algorithm>

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

uint32_t FoldersBeyondTheSmallStack(uint32_t wanted) {
    // Recursion would have what the search finds in every frame. Wine goes through a path name by name at each call, so
    // that 2,000 folders take many minutes.
    return std::min(wanted, static_cast<uint32_t>(stackSize / sizeof(WIN32_FIND_DATAW)) + 8);
}

}  // namespace qn::dsc::osdep
