// The contract of task memory, for the allocator that was chosen and for all that can be (TASK_ALLOCATORS is the
// platform's list of them).

#include "qn/dsc/osdep/TaskMemory.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <random>
#include <thread>
#include <vector>

#include "qn/dsc/osdep/SizeClass.h"
#include "support/AllocationFaultScope.h"
#include TASK_ALLOCATORS

namespace qn::dsc::osdep {
namespace {

class ChosenAllocator {
  public:
    static void* Allocate(size_t size) { return TaskMemAlloc(size); }
    static void* Reallocate(void* block, size_t size) { return TaskMemRealloc(block, size); }
    static void Free(void* block) { TaskMemFree(block); }
};

template <class Allocator>
class TaskMemory : public testing::Test {};
TYPED_TEST_SUITE(TaskMemory, TaskAllocators<ChosenAllocator>);

constexpr size_t sampleSizes[] = {0,   1,   2,    15,   16,   17,    24,    100,   511,   512,    513,
                                  640, 641, 1024, 4096, 9000, 32767, 32768, 32769, 65536, 1000000};

void FillBlock(void* block, size_t size, unsigned seed) {
    std::memset(block, static_cast<int>(seed & 0xFFU), size);
}

bool HoldsFill(const void* block, size_t size, unsigned seed) {
    const auto* bytes = static_cast<const unsigned char*>(block);
    return std::all_of(bytes, bytes + size, [seed](unsigned char byte) { return byte == (seed & 0xFFU); });
}

TYPED_TEST(TaskMemory, BlocksOfEverySizeAreAlignedAndApart) {
    std::vector<void*> blocks;
    for (size_t index = 0; index < std::size(sampleSizes); ++index) {
        void* block = TypeParam::Allocate(sampleSizes[index]);
        ASSERT_NE(block, nullptr);
        const size_t alignment = sampleSizes[index] % 16 == 0 ? 16 : 8;
        EXPECT_EQ(reinterpret_cast<uintptr_t>(block) % alignment, 0U) << sampleSizes[index];
        FillBlock(block, sampleSizes[index], static_cast<unsigned>(index + 1));
        blocks.push_back(block);
    }
    for (size_t index = 0; index < blocks.size(); ++index) {
        EXPECT_TRUE(HoldsFill(blocks[index], sampleSizes[index], static_cast<unsigned>(index + 1)))
            << sampleSizes[index];
        TypeParam::Free(blocks[index]);
    }
}

TYPED_TEST(TaskMemory, ASizeOfZeroGivesBlocksOfTheirOwn) {
    void* first = TypeParam::Allocate(0);
    void* second = TypeParam::Allocate(0);
    EXPECT_NE(first, nullptr);
    EXPECT_NE(second, nullptr);
    EXPECT_NE(first, second);
    TypeParam::Free(first);
    TypeParam::Free(second);
}

TYPED_TEST(TaskMemory, FreeingNullDoesNothing) {
    TypeParam::Free(nullptr);
    void* block = TypeParam::Allocate(8);
    EXPECT_NE(block, nullptr);
    TypeParam::Free(block);
    TypeParam::Free(nullptr);
}

TYPED_TEST(TaskMemory, ReallocationKeepsWhatFits) {
    for (const size_t oldSize : sampleSizes) {
        for (const size_t newSize : sampleSizes) {
            if (newSize == 0) {
                continue;
            }
            void* block = TypeParam::Allocate(oldSize);
            ASSERT_NE(block, nullptr);
            FillBlock(block, oldSize, 0xA5);
            block = TypeParam::Reallocate(block, newSize);
            ASSERT_NE(block, nullptr);
            EXPECT_TRUE(HoldsFill(block, std::min(oldSize, newSize), 0xA5)) << oldSize << " to " << newSize;
            FillBlock(block, newSize, 0x5A);
            TypeParam::Free(block);
        }
    }
}

TYPED_TEST(TaskMemory, ReallocationOfNullAllocates) {
    void* block = TypeParam::Reallocate(nullptr, 40);
    ASSERT_NE(block, nullptr);
    FillBlock(block, 40, 1);
    TypeParam::Free(block);
}

TYPED_TEST(TaskMemory, ReallocationToZeroFreesAndGivesNull) {
    void* block = TypeParam::Allocate(40);
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(TypeParam::Reallocate(block, 0), nullptr);
}

TYPED_TEST(TaskMemory, AFailingAllocationGivesNull) {
    const support::AllocationFaultScope fault(2);
    void* first = TypeParam::Allocate(40);
    EXPECT_EQ(TypeParam::Allocate(40), nullptr);
    void* third = TypeParam::Allocate(40);
    EXPECT_NE(first, nullptr);
    EXPECT_NE(third, nullptr);
    TypeParam::Free(first);
    TypeParam::Free(third);
}

TYPED_TEST(TaskMemory, AFailingReallocationLeavesTheBlock) {
    for (const size_t newSize : {1000U, 32768U, 100000U}) {
        void* block = TypeParam::Allocate(40);
        ASSERT_NE(block, nullptr);
        FillBlock(block, 40, 0x77);
        {
            const support::AllocationFaultScope fault(1);
            EXPECT_EQ(TypeParam::Reallocate(block, newSize), nullptr);
        }
        EXPECT_TRUE(HoldsFill(block, 40, 0x77)) << newSize;
        TypeParam::Free(block);
    }
}

TYPED_TEST(TaskMemory, AFailingReallocationLeavesALargeBlock) {
    void* block = TypeParam::Allocate(50000);
    ASSERT_NE(block, nullptr);
    FillBlock(block, 50000, 0x77);
    {
        const support::AllocationFaultScope fault(1);
        EXPECT_EQ(TypeParam::Reallocate(block, 100000), nullptr);
    }
    EXPECT_TRUE(HoldsFill(block, 50000, 0x77));
    TypeParam::Free(block);
}

TYPED_TEST(TaskMemory, CountsAllocationsAndReallocationsToAGreaterClass) {
    const support::AllocationCounter counter;
    void* block = TypeParam::Allocate(41);  // class of 48 bytes
    EXPECT_EQ(counter.Count(), 1U);
    block = TypeParam::Reallocate(block, 48);
    EXPECT_EQ(counter.Count(), 1U);
    block = TypeParam::Reallocate(block, 100);
    EXPECT_EQ(counter.Count(), 2U);
    block = TypeParam::Reallocate(block, 10);
    EXPECT_EQ(counter.Count(), 2U);
    block = TypeParam::Reallocate(block, 40000);
    EXPECT_EQ(counter.Count(), 3U);
    block = TypeParam::Reallocate(block, 50000);
    EXPECT_EQ(counter.Count(), 4U);
    block = TypeParam::Reallocate(block, 100);
    EXPECT_EQ(counter.Count(), 4U);
    TypeParam::Free(block);
    EXPECT_EQ(counter.Count(), 4U);
}

TYPED_TEST(TaskMemory, BlocksMayBeFreedOnAnotherThread) {
    std::vector<void*> blocks;
    for (size_t size = 1; size < 3000; ++size) {
        void* block = TypeParam::Allocate(size);
        ASSERT_NE(block, nullptr);
        FillBlock(block, size, static_cast<unsigned>(size));
        blocks.push_back(block);
    }
    std::vector<size_t> damaged;
    std::thread([&blocks, &damaged] {
        for (size_t size = 1; size < 3000; ++size) {
            if (!HoldsFill(blocks[size - 1], size, static_cast<unsigned>(size))) {
                damaged.push_back(size);
            }
            TypeParam::Free(blocks[size - 1]);
        }
    }).join();
    EXPECT_EQ(damaged, std::vector<size_t>());
}

// Allocates, grows, shrinks and frees at random, and gives the number of blocks whose content was not as it was left.
template <class Allocator>
int DamagedBlocksOfRandomUse(unsigned seed) {
    struct Entry {
        void* block = nullptr;
        size_t size = 0;
        unsigned fill = 0;
    };
    std::mt19937 engine(seed);
    const auto random = [&engine] { return static_cast<unsigned>(engine()); };
    std::vector<Entry> entries(500);
    int damaged = 0;
    for (int step = 0; step < 30000; ++step) {
        Entry& entry = entries[random() % entries.size()];
        const size_t newSize = random() % 20 == 0 ? random() % 70000 + 1 : random() % 700 + 1;
        if (entry.block != nullptr && !HoldsFill(entry.block, entry.size, entry.fill)) {
            ++damaged;
        }
        const unsigned choice = random() % 3;
        if (entry.block == nullptr || choice == 0) {
            Allocator::Free(entry.block);
            entry.block = Allocator::Allocate(newSize);
        } else if (choice == 1) {
            entry.block = Allocator::Reallocate(entry.block, newSize);
            if (!HoldsFill(entry.block, std::min(entry.size, newSize), entry.fill)) {
                ++damaged;
            }
        } else {
            Allocator::Free(entry.block);
            entry = Entry();
            continue;
        }
        entry.size = newSize;
        entry.fill = random();
        FillBlock(entry.block, entry.size, entry.fill);
    }
    for (const Entry& entry : entries) {
        Allocator::Free(entry.block);
    }
    return damaged;
}

TYPED_TEST(TaskMemory, ThreadsDoNotDisturbEachOther) {
    std::vector<int> damaged(4, -1);
    std::vector<std::thread> threads;
    for (unsigned number = 0; number < damaged.size(); ++number) {
        threads.emplace_back([&damaged, number] { damaged[number] = DamagedBlocksOfRandomUse<TypeParam>(number + 1); });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_EQ(damaged, std::vector<int>(4, 0));
}

}  // namespace
}  // namespace qn::dsc::osdep
