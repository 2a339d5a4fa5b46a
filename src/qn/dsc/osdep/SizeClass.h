#pragma once

// The size classes of task memory: steps of 16 bytes up to 512, then four steps for each doubling up to 32 KB.

#include <bit>
#include <cstddef>
#include <cstdint>

namespace qn::dsc::osdep {

// Blocks above this many bytes belong to no class.
constexpr size_t maximumClassedSize = 32768;

// Up to this many bytes the classes are multiples of 16 bytes.
constexpr size_t maximumFineSize = 512;

// Classes 1 to sizeClassCount - 1 are blocks; 0 means "no class".
constexpr uint32_t sizeClassCount = 57;

// The smallest class whose blocks hold `size` bytes; `size` is at most maximumClassedSize. 0 bytes are held by class 1.
constexpr uint32_t SizeClassOf(size_t size) {
    if (size <= maximumFineSize) {
        return size == 0 ? 1 : static_cast<uint32_t>((size + 15) / 16);
    }
    // 513 to 640 bytes: the doubling 0, quarter 0. bit_width(512) is 10.
    const uint32_t doubling = static_cast<uint32_t>(std::bit_width(size - 1)) - 10;
    const uint32_t quarter = static_cast<uint32_t>((size - 1) >> (doubling + 7)) - 4;
    return 33 + 4 * doubling + quarter;
}

// The bytes in a block of the class, 1 to sizeClassCount - 1.
constexpr size_t SizeOfClass(uint32_t sizeClass) {
    if (sizeClass <= 32) {
        return size_t{16} * sizeClass;
    }
    const uint32_t doubling = (sizeClass - 33) / 4;
    const uint32_t quarter = (sizeClass - 33) % 4;
    return size_t{5 + quarter} << (doubling + 7);
}

// Whether a block that was made for `oldSize` bytes is of another class than one for `newSize`, which is more. Blocks
// above the greatest class always are.
constexpr bool NeedsGreaterClass(size_t oldSize, size_t newSize) {
    if (newSize > maximumClassedSize) {
        return true;
    }
    return oldSize <= maximumClassedSize && SizeClassOf(newSize) > SizeClassOf(oldSize);
}

static_assert(SizeClassOf(512) == 32 && SizeClassOf(513) == 33 && SizeClassOf(640) == 33 && SizeClassOf(641) == 34);
static_assert(SizeClassOf(maximumClassedSize) == sizeClassCount - 1);
static_assert(SizeOfClass(33) == 640 && SizeOfClass(36) == 1024 && SizeOfClass(56) == maximumClassedSize);

}  // namespace qn::dsc::osdep
