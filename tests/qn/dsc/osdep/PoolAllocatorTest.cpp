#include "qn/dsc/osdep/PoolAllocator.h"

#include <gtest/gtest.h>

#include <atomic>
#include <cstdint>
#include <cstring>
#include <set>
#include <string>
#include <thread>
#include <vector>

#include "support/AllocationFaultScope.h"

namespace qn::dsc::osdep {
namespace {

std::vector<void*> AllocateMany(size_t count, size_t size) {
    std::vector<void*> blocks;
    for (size_t index = 0; index < count; ++index) {
        blocks.push_back(PoolAllocator::Allocate(size));
    }
    return blocks;
}

void FreeAll(const std::vector<void*>& blocks) {
    for (void* block : blocks) {
        PoolAllocator::Free(block);
    }
}

TEST(PoolAllocator, ReallocationWithinTheClassKeepsThePlace) {
    struct {
        size_t from;
        size_t to;
    } const rows[] = {{1, 8},   {8, 1},     {9, 16},    {16, 9},    {17, 24},
                      {25, 32}, {500, 512}, {513, 640}, {700, 768}, {28673, 32768}};
    for (const auto& row : rows) {
        void* block = PoolAllocator::Allocate(row.from);
        void* same = PoolAllocator::Reallocate(block, row.to);
        EXPECT_EQ(same, block) << row.from << " to " << row.to;
        PoolAllocator::Free(same);
    }
}

TEST(PoolAllocator, ReallocationToASmallerClassGivesTheMemoryBack) {
    void* block = PoolAllocator::Allocate(400);
    void* smaller = PoolAllocator::Reallocate(block, 100);
    EXPECT_NE(smaller, block);
    // What was freed last is taken first.
    void* next = PoolAllocator::Allocate(400);
    EXPECT_EQ(next, block);
    PoolAllocator::Free(smaller);
    PoolAllocator::Free(next);
}

TEST(PoolAllocator, WhatWasFreedLastIsTakenFirst) {
    void* first = PoolAllocator::Allocate(200);
    void* second = PoolAllocator::Allocate(200);
    PoolAllocator::Free(first);
    PoolAllocator::Free(second);
    EXPECT_EQ(PoolAllocator::Allocate(200), second);
    EXPECT_EQ(PoolAllocator::Allocate(200), first);
    PoolAllocator::Free(first);
    PoolAllocator::Free(second);
}

TEST(PoolAllocator, CountsReallocationsFromTheFirstByteOfTheNextClassOn) {
    const support::AllocationCounter counter;
    void* block = PoolAllocator::Allocate(41);
    block = PoolAllocator::Reallocate(block, 48);
    EXPECT_EQ(counter.Count(), 1U);
    block = PoolAllocator::Reallocate(block, 49);
    EXPECT_EQ(counter.Count(), 2U);
    PoolAllocator::Free(block);
}

TEST(PoolAllocator, BlocksHaveNoHeaders) {
    constexpr size_t count = 50000;
    constexpr size_t size = 48;
    const std::vector<void*> blocks = AllocateMany(count, size);
    std::set<uintptr_t> pages;
    for (void* block : blocks) {
        pages.insert(reinterpret_cast<uintptr_t>(block) / 4096);
    }
    // A hundredth more for the ends of spans and what earlier blocks have left apart.
    EXPECT_LE(pages.size(), count * size / 4096 * 101 / 100 + 20);
    FreeAll(blocks);
}

TEST(PoolAllocator, BlocksOfTheGreatestClassFillTheirSpans) {
    const std::vector<void*> blocks = AllocateMany(300, 32768);
    std::set<void*> distinct(blocks.begin(), blocks.end());
    EXPECT_EQ(distinct.size(), blocks.size());
    for (void* block : blocks) {
        ASSERT_NE(block, nullptr);
        std::memset(block, 0xCC, 32768);
    }
    FreeAll(blocks);
}

TEST(PoolAllocator, BlocksFreedByAThreadThatEndedAreTakenAgain) {
    // A size that no other test has, so that no other free block of the class is about.
    constexpr size_t size = 7000;
    const std::vector<void*> blocks = AllocateMany(200, size);
    const std::set<void*> known(blocks.begin(), blocks.end());
    std::thread([&blocks] { FreeAll(blocks); }).join();
    size_t again = 0;
    const std::vector<void*> next = AllocateMany(200, size);
    for (void* block : next) {
        again += known.count(block);
    }
    // The rest of the last span may come first.
    EXPECT_GE(again, 190U);
    FreeAll(next);
}

// One thread allocates `count` blocks in each of 40 rounds, another frees them: how many there are in all.
size_t BlocksThatPassBetweenThreads(size_t size, size_t count) {
    std::set<void*> known;
    std::vector<void*> handed;
    std::atomic<int> turn = 0;
    constexpr int rounds = 40;
    std::thread freeing([&handed, &turn] {
        for (int round = 0; round < rounds; ++round) {
            turn.wait(2 * round);
            FreeAll(handed);
            turn = 2 * round + 2;
            turn.notify_one();
        }
    });
    for (int round = 0; round < rounds; ++round) {
        handed = AllocateMany(count, size);
        known.insert(handed.begin(), handed.end());
        turn = 2 * round + 1;
        turn.notify_one();
        turn.wait(2 * round + 1);
    }
    freeing.join();
    return known.size();
}

TEST(PoolAllocator, AThreadThatOnlyAllocatesLivesOnWhatAnotherFrees) {
    // One round's blocks, a list that is still with the other thread, and the rests of spans; not 200,000.
    EXPECT_LE(BlocksThatPassBetweenThreads(480, 5000), 6000U);
}

TEST(PoolAllocator, AThreadLivesOnTheSmallestBlocksThatAnotherFrees) {
    // Lists of 8,192 blocks, joined into one and taken in halves; not 1,600,000 blocks.
    EXPECT_LE(BlocksThatPassBetweenThreads(8, 40000), 60000U);
}

class AllocatesWhenItDies {
  public:
    AllocatesWhenItDies() = default;
    AllocatesWhenItDies(const AllocatesWhenItDies&) = delete;
    AllocatesWhenItDies& operator=(const AllocatesWhenItDies&) = delete;
    ~AllocatesWhenItDies() {
        PoolAllocator::Free(early);
        void* block = PoolAllocator::Allocate(100);
        std::memset(block, 1, 100);
        block = PoolAllocator::Reallocate(block, 1000);
        PoolAllocator::Free(block);
        if (succeeded != nullptr) {
            *succeeded = block != nullptr;
        }
    }

    void* early = nullptr;
    bool* succeeded = nullptr;
};

TEST(PoolAllocator, ServesThreadLocalObjectsThatOutliveTheThreadsLists) {
    bool succeeded = false;
    std::thread([&succeeded] {
        // Made before the thread's first allocation, so destroyed after the thread has handed its lists over.
        static thread_local AllocatesWhenItDies object;
        object.succeeded = &succeeded;
        object.early = PoolAllocator::Allocate(50);
    }).join();
    EXPECT_TRUE(succeeded);
}

TEST(PoolAllocator, ManyThreadsThatEndLeaveNoMoreThanOne) {
    std::set<void*> known;
    for (int round = 0; round < 200; ++round) {
        std::thread([&known] {
            const std::vector<void*> blocks = AllocateMany(50, 432);
            known.insert(blocks.begin(), blocks.end());
            FreeAll(blocks);
        }).join();
    }
    EXPECT_LE(known.size(), 200U);
}

TEST(PoolAllocator, ALargeBlockThatShrinksBecomesAPooledOne) {
    auto* block = static_cast<char*>(PoolAllocator::Allocate(100000));
    std::memset(block, 'x', 100000);
    block = static_cast<char*>(PoolAllocator::Reallocate(block, 60));
    EXPECT_EQ(std::string(block, 60), std::string(60, 'x'));
    EXPECT_EQ(PoolAllocator::Reallocate(block, 64), block);
    PoolAllocator::Free(block);
}

}  // namespace
}  // namespace qn::dsc::osdep
