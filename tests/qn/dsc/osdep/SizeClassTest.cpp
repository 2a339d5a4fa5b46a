#include "qn/dsc/osdep/SizeClass.h"

#include <gtest/gtest.h>

namespace qn::dsc::osdep {
namespace {

TEST(SizeClass, HoldsEverySizeInTheSmallestClassThatDoes) {
    for (size_t size = 1; size <= maximumClassedSize; ++size) {
        const uint32_t sizeClass = SizeClassOf(size);
        ASSERT_GE(SizeOfClass(sizeClass), size);
        ASSERT_TRUE(sizeClass == 1 || SizeOfClass(sizeClass - 1) < size) << size;
    }
}

TEST(SizeClass, HoldsNothingInTheFirstClass) {
    EXPECT_EQ(SizeClassOf(0), 1U);
}

TEST(SizeClass, StepsBy8BytesUpTo128) {
    for (uint32_t sizeClass = 1; sizeClass <= 16; ++sizeClass) {
        EXPECT_EQ(SizeOfClass(sizeClass), 8U * sizeClass);
    }
}

TEST(SizeClass, StepsBy16BytesFrom128To512) {
    for (uint32_t step = 0; step <= 24; ++step) {
        EXPECT_EQ(SizeOfClass(16 + step), 128U + 16U * step);
    }
}

TEST(SizeClass, DoublesInFourStepsAbove512) {
    constexpr size_t expected[] = {640, 768, 896, 1024, 1280, 1536, 1792, 2048, 2560};
    for (uint32_t step = 0; step < 9; ++step) {
        EXPECT_EQ(SizeOfClass(41 + step), expected[step]);
    }
    EXPECT_EQ(SizeOfClass(sizeClassCount - 1), 32768U);
}

TEST(SizeClass, KeepsTheAlignment) {
    for (uint32_t sizeClass = 1; sizeClass < sizeClassCount; ++sizeClass) {
        EXPECT_EQ(SizeOfClass(sizeClass) % 8, 0U) << sizeClass;
    }
    for (size_t size = 16; size <= maximumClassedSize; size += 16) {
        EXPECT_EQ(SizeOfClass(SizeClassOf(size)) % 16, 0U) << size;
    }
}

}  // namespace
}  // namespace qn::dsc::osdep
