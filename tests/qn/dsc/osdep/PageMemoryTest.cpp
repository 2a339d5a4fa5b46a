#include "qn/dsc/osdep/PageMemory.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>

namespace qn::dsc::osdep {
namespace {

TEST(MapPages, GivesAlignedZeroes) {
    constexpr size_t size = size_t{1} << 20;
    for (int round = 0; round < 5; ++round) {
        auto* pages = static_cast<unsigned char*>(MapPages(size, size));
        ASSERT_NE(pages, nullptr);
        EXPECT_EQ(reinterpret_cast<uintptr_t>(pages) % size, 0U);
        EXPECT_EQ(pages[0], 0);
        EXPECT_EQ(pages[size - 1], 0);
        std::memset(pages, 0xFF, size);
    }
}

TEST(MapPages, GivesAGreaterAlignmentThanItsSize) {
    constexpr size_t alignment = size_t{1} << 23;
    for (int round = 0; round < 3; ++round) {
        auto* pages = static_cast<unsigned char*>(MapPages(4096, alignment));
        ASSERT_NE(pages, nullptr);
        EXPECT_EQ(reinterpret_cast<uintptr_t>(pages) % alignment, 0U);
        pages[4095] = 1;
    }
}

TEST(MapPages, GivesNullForMoreThanThereIs) {
    EXPECT_EQ(MapPages(size_t{1} << 62, size_t{1} << 20), nullptr);
    EXPECT_EQ(MapPages(SIZE_MAX - 4095, size_t{1} << 20), nullptr);
}

}  // namespace
}  // namespace qn::dsc::osdep
