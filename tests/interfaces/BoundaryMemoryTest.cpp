#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>

#include "interfaces/BoundaryText.h"
#include "interfaces/support/HostMemory.h"
#include "support/AllocationFaultScope.h"
#include "support/ProcessEnd.h"
#include "zkfpga/memory.h"

namespace zkhw {
namespace {

uint32_t ByteLengthInFront(BSTR string) {
    uint32_t length = 0;
    std::memcpy(&length, reinterpret_cast<const char*>(string) - sizeof length, sizeof length);
    return length;
}

TEST(BoundaryString, HasItsByteLengthInFrontAndANulBehind) {
    auto* const string = SysAllocString(In(u"abc"));
    EXPECT_EQ(ByteLengthInFront(string), 6U);
    EXPECT_EQ(std::memcmp(string, u"abc", 8), 0);
    EXPECT_EQ(SysStringLen(string), 3U);
    SysFreeString(string);
}

TEST(BoundaryString, OfAnEmptyTextIsABlockOfItsOwn) {
    auto* const string = SysAllocString(In(u""));
    ASSERT_NE(string, nullptr);
    EXPECT_EQ(ByteLengthInFront(string), 0U);
    EXPECT_EQ(string[0], 0);
    EXPECT_EQ(SysStringLen(string), 0U);
    SysFreeString(string);
}

TEST(BoundaryString, OfNullIsNull) {
    EXPECT_EQ(SysAllocString(nullptr), nullptr);
    EXPECT_EQ(SysStringLen(nullptr), 0U);
}

TEST(BoundaryString, OfALengthKeepsNulUnits) {
    auto* const string = SysAllocStringLen(In(u"a\0b\0"), 4);
    EXPECT_EQ(ByteLengthInFront(string), 8U);
    EXPECT_EQ(SysStringLen(string), 4U);
    EXPECT_EQ(std::memcmp(string, u"a\0b\0", 10), 0);
    SysFreeString(string);
}

TEST(BoundaryString, TakesNoMoreUnitsThanAskedFor) {
    auto* const string = SysAllocStringLen(In(u"abcdef"), 2);
    EXPECT_EQ(std::memcmp(string, u"ab", 6), 0);
    SysFreeString(string);
}

TEST(BoundaryString, WithoutATextHasRoomForItsUnitsAndANul) {
    auto* const string = SysAllocStringLen(nullptr, 3);
    ASSERT_NE(string, nullptr);
    EXPECT_EQ(SysStringLen(string), 3U);
    EXPECT_EQ(string[3], 0);
    string[0] = string[1] = string[2] = 'x';
    EXPECT_EQ(TakeText(string), "xxx");
}

TEST(BoundaryString, LongerThanItsLengthCanTellIsNull) {
    // 0x80000000 units are one byte more than 32 bits can count.
    EXPECT_EQ(SysAllocStringLen(nullptr, 0x80000000U), nullptr);
    EXPECT_EQ(SysAllocStringLen(nullptr, 0xFFFFFFFFU), nullptr);
}

// On Windows the boundary's memory is the system's: it can't be made to fail, and doesn't trap.
TEST(BoundaryString, IsNullWithoutMemoryAsOnlyLinuxOwnsTheMemory) {
    const support::AllocationFaultScope fault(1, true);
    EXPECT_EQ(SysAllocString(In(u"abc")), nullptr);
    EXPECT_EQ(SysAllocStringLen(nullptr, 3), nullptr);
}

TEST(BoundaryString, FreeingNullDoesNothing) {
    SysFreeString(nullptr);
    CoTaskMemFree(nullptr);
}

TEST(BoundaryString, FreeingWhatIsNoStringTrapsAsOnlyLinuxOwnsTheMemory) {
    // Inside of a block, so that what stands in front of the pointer may be read.
    auto* const block = static_cast<char*>(CoTaskMemAlloc(64));
    std::memset(block, 0, 64);
    auto* const string = reinterpret_cast<BSTR>(block + 16);
    EXPECT_EXIT(SysFreeString(string), qn::dsc::osdep::EndsByTrap, "");
    EXPECT_EXIT(SysStringLen(string), qn::dsc::osdep::EndsByTrap, "");
    CoTaskMemFree(block);
}

TEST(BoundaryTaskMemory, BlocksAreAlignedAndOfTheirOwn) {
    void* const first = CoTaskMemAlloc(1);
    void* const second = CoTaskMemAlloc(0);
    ASSERT_NE(first, nullptr);
    ASSERT_NE(second, nullptr);
    EXPECT_NE(first, second);
    EXPECT_EQ(reinterpret_cast<uintptr_t>(first) % 16, 0U);
    EXPECT_EQ(reinterpret_cast<uintptr_t>(second) % 16, 0U);
    CoTaskMemFree(first);
    CoTaskMemFree(second);
}

TEST(BoundaryTaskMemory, EmptyBlocksAreAlignedTo16Bytes) {
    // Two in a row, since one of any two neighbours of 8 bytes is aligned.
    for (void* const block :
         {CoTaskMemAlloc(0), CoTaskMemAlloc(0), CoTaskMemRealloc(nullptr, 0), CoTaskMemRealloc(nullptr, 0)}) {
        ASSERT_NE(block, nullptr);
        EXPECT_EQ(reinterpret_cast<uintptr_t>(block) % 16, 0U);
        CoTaskMemFree(block);
    }
}

TEST(BoundaryTaskMemory, BlocksOfEverySizeAreAlignedTo16Bytes) {
    std::vector<void*> blocks;
    for (size_t size = 1; size <= 200; ++size) {
        blocks.push_back(CoTaskMemAlloc(size));
        EXPECT_EQ(reinterpret_cast<uintptr_t>(blocks.back()) % 16, 0U) << size;
    }
    for (size_t index = 0; index < blocks.size(); ++index) {
        blocks[index] = CoTaskMemRealloc(blocks[index], index + 24);
        EXPECT_EQ(reinterpret_cast<uintptr_t>(blocks[index]) % 16, 0U) << index;
        CoTaskMemFree(blocks[index]);
    }
}

TEST(BoundaryTaskMemory, ASizeThatCannotBeRoundedUpGivesNull) {
    EXPECT_EQ(CoTaskMemAlloc(SIZE_MAX), nullptr);
    void* const block = CoTaskMemAlloc(10);
    EXPECT_EQ(CoTaskMemRealloc(block, SIZE_MAX), nullptr);
    CoTaskMemFree(block);
}

TEST(BoundaryTaskMemory, ReallocKeepsWhatFits) {
    auto* block = static_cast<char*>(CoTaskMemRealloc(nullptr, 4));
    std::memcpy(block, "abcd", 4);
    block = static_cast<char*>(CoTaskMemRealloc(block, 100'000));
    EXPECT_EQ(std::memcmp(block, "abcd", 4), 0);
    block = static_cast<char*>(CoTaskMemRealloc(block, 2));
    EXPECT_EQ(std::memcmp(block, "ab", 2), 0);
    EXPECT_EQ(CoTaskMemRealloc(block, 0), nullptr);
}

TEST(BoundaryTaskMemory, AFailedReallocLeavesTheBlockAsOnlyLinuxOwnsTheMemory) {
    auto* const block = static_cast<char*>(CoTaskMemAlloc(4));
    std::memcpy(block, "abcd", 4);
    {
        const support::AllocationFaultScope fault(1, true);
        EXPECT_EQ(CoTaskMemRealloc(block, 100'000), nullptr);
        EXPECT_EQ(CoTaskMemAlloc(1), nullptr);
    }
    EXPECT_EQ(std::memcmp(block, "abcd", 4), 0);
    CoTaskMemFree(block);
}

}  // namespace
}  // namespace zkhw
