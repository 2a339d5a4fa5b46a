#include <pthread.h>

#include <cstddef>

#include <gtest/gtest.h>

#include "support/SmallStack.h"

namespace qn::dsc::osdep {

namespace {

constexpr size_t stackSize = 256 * 1024;

void* CallWork(void* work) {
    (*static_cast<const std::function<void()>*>(work))();
    return nullptr;
}

}  // namespace

void RunOnSmallStack(const std::function<void()>& work) {
    pthread_attr_t attributes;
    ASSERT_EQ(pthread_attr_init(&attributes), 0);
    ASSERT_EQ(pthread_attr_setstacksize(&attributes, stackSize), 0);
    pthread_t thread;
    void* argument = const_cast<std::function<void()>*>(&work);
    const int error = pthread_create(&thread, &attributes, &CallWork, argument);
    pthread_attr_destroy(&attributes);
    ASSERT_EQ(error, 0);
    ASSERT_EQ(pthread_join(thread, nullptr), 0);
}

uint32_t FoldersBeyondTheSmallStack(uint32_t wanted) {
    return wanted;
}

}  // namespace qn::dsc::osdep
