#include <gtest/gtest.h>

#include <thread>

#include "interfaces/CqnCS.h"

namespace PartBin {
namespace {

TEST(SyncObject, SetFlagGivesTheValueBack) {
    CqnCS section;
    EXPECT_EQ(section.SetFlag(7), 7);
    EXPECT_EQ(section.SetFlag(255), 255);
    EXPECT_EQ(section.SetFlag(0), 0);
}

TEST(SyncObject, LockGivesTrueAndMayNest) {
    CqnCS section;
    EXPECT_TRUE(section.Lock());
    EXPECT_TRUE(section.Lock());
    section.Unlock();
    section.Unlock();
}

TEST(SyncObject, LockKeepsASecondThreadOut) {
    CqnCS section;
    int64_t sum = 0;
    const auto work = [&section, &sum] {
        for (int i = 0; i < 50'000; ++i) {
            section.Lock();
            sum += 1;
            section.Unlock();
        }
    };
    std::thread first(work);
    std::thread second(work);
    first.join();
    second.join();
    EXPECT_EQ(sum, 100'000);
}

// The table is a contract: destructor, SetFlag, Lock, Unlock. The platform's destructor takes two places.
TEST(SyncObject, OperationsStandInTheirOrderBehindTheDestructor) {
    CqnCS section;
    CqnSyncObject* const object = &section;
    void** const table = *reinterpret_cast<void***>(object);
    EXPECT_EQ(reinterpret_cast<uint8_t (*)(void*, uint8_t)>(table[2])(object, 9), 9);
    EXPECT_TRUE(reinterpret_cast<bool (*)(void*)>(table[3])(object));
    bool wasEntered = false;
    std::thread other([object, &wasEntered] {
        object->Lock();
        wasEntered = true;
        object->Unlock();
    });
    EXPECT_FALSE(wasEntered);
    reinterpret_cast<bool (*)(void*)>(table[4])(object);
    other.join();
    EXPECT_TRUE(wasEntered);
}

}  // namespace
}  // namespace PartBin
