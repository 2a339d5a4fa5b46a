#pragma once

// The size classes of task memory: steps of 8 bytes up to 128, where nearly all blocks of a tree lie, of 16 bytes
// up to 512, then four steps for each doubling up to 32 KB. Blocks of a class that is a multiple of 16 are aligned to
// 16 bytes, the others to 8.

#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>

namespace qn::dsc::osdep {

// Blocks above this many bytes belong to no class.
constexpr size_t maximumClassedSize = 32768;

// Up to this many bytes the classes are found in a table.
constexpr size_t maximumFineSize = 512;

// Classes 1 to sizeClassCount - 1 are blocks; 0 means "no class".
constexpr uint32_t sizeClassCount = 65;

namespace detail {

constexpr uint32_t lastStepOf8 = 16;   // The class of 128 bytes.
constexpr uint32_t lastStepOf16 = 40;  // The class of 512 bytes.

}  // namespace detail

// The bytes in a block of the class, 1 to sizeClassCount - 1.
constexpr size_t SizeOfClass(uint32_t sizeClass) {
    if (sizeClass <= detail::lastStepOf8) {
        return size_t{8} * sizeClass;
    }
    if (sizeClass <= detail::lastStepOf16) {
        return 128 + size_t{16} * (sizeClass - detail::lastStepOf8);
    }
    const uint32_t doubling = (sizeClass - detail::lastStepOf16 - 1) / 4;
    const uint32_t quarter = (sizeClass - detail::lastStepOf16 - 1) % 4;
    return size_t{5 + quarter} << (doubling + 7);
}

namespace detail {

// The class of each size up to maximumFineSize, in units of 8 bytes, rounded up.
constexpr auto fineClasses = [] {
    std::array<uint8_t, maximumFineSize / 8 + 1> classes{};
    uint8_t sizeClass = 1;
    for (size_t units = 0; units < classes.size(); ++units) {
        sizeClass = static_cast<uint8_t>(sizeClass + (SizeOfClass(sizeClass) < units * 8 ? 1 : 0));
        classes[units] = sizeClass;
    }
    return classes;
}();

}  // namespace detail

// The smallest class whose blocks hold `size` bytes; `size` is at most maximumClassedSize. 0 bytes are held by class 1.
constexpr uint32_t SizeClassOf(size_t size) {
    if (size <= maximumFineSize) {
        return detail::fineClasses[(size + 7) / 8];
    }
    // 513 to 640 bytes: the doubling 0, quarter 0. bit_width(512) is 10.
    const uint32_t doubling = static_cast<uint32_t>(std::bit_width(size - 1)) - 10;
    const uint32_t quarter = static_cast<uint32_t>((size - 1) >> (doubling + 7)) - 4;
    return detail::lastStepOf16 + 1 + 4 * doubling + quarter;
}

// Whether a block that was made for `oldSize` bytes is of another class than one for `newSize`, which is more. Blocks
// above the greatest class always are.
constexpr bool NeedsGreaterClass(size_t oldSize, size_t newSize) {
    if (newSize > maximumClassedSize) {
        return true;
    }
    return oldSize <= maximumClassedSize && SizeClassOf(newSize) > SizeClassOf(oldSize);
}

static_assert(SizeClassOf(512) == 40 && SizeClassOf(513) == 41 && SizeClassOf(640) == 41 && SizeClassOf(641) == 42);
static_assert(SizeClassOf(maximumClassedSize) == sizeClassCount - 1);
static_assert(SizeOfClass(41) == 640 && SizeOfClass(44) == 1024 && SizeOfClass(64) == maximumClassedSize);

}  // namespace qn::dsc::osdep
