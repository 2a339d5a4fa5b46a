#pragma once

// A key to look for, with what rules out nearly all entries that have another one.

#include <concepts>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <type_traits>

namespace zkhw {

namespace detail {

uint8_t HashKeyAtRunTime(std::u16string_view key);

// What LoadUnits gives while a literal is compiled.
constexpr uint64_t JoinUnits(const char16_t* units) {
    return units[0] | uint64_t{units[1]} << 16 | uint64_t{units[2]} << 32 | uint64_t{units[3]} << 48;
}

// Takes four units at a step, the last ones once more where they don't fill one.
template <typename LoadUnits>
constexpr uint8_t HashKeyBy(std::u16string_view key, LoadUnits loadUnits) {
    uint64_t hash = key.size() + 1;
    bool isPlain = true;
    const auto mix = [&](uint64_t word) {
        // Each unit lies from "." to "~": the borrow of a lesser one and the carry of a greater one both show.
        const uint64_t outside = (word - 0x002E002E002E002E) | (word + 0x0001000100010001);
        isPlain = isPlain && (outside & 0xFF80FF80FF80FF80) == 0;
        // Letters of either case get the same bits.
        hash = (hash ^ (word | 0x0020002000200020)) * 0x9E3779B97F4A7C15;
    };
    if (key.size() >= 4) {
        for (size_t at = 0; at + 4 < key.size(); at += 4) {
            mix(loadUnits(key.data() + at));
        }
        mix(loadUnits(key.data() + key.size() - 4));
    } else {
        for (const char16_t unit : key) {
            mix(unit * uint64_t{0x0001000100010001});
        }
    }
    const auto top = static_cast<uint8_t>(hash >> 56);
    return !isPlain ? uint8_t{0} : top == 0 ? uint8_t{1} : top;
}

}  // namespace detail

// Equal for keys that are equal under Compare and plain: of units from "." to "~", as most keys are. 0 for any other
// key, which may be equal to a plain one of any hash. Plain keys compare without the user's collation and without
// memory. Linear in the key.
constexpr uint8_t HashKey(std::u16string_view key) {
    if (std::is_constant_evaluated()) {
        return detail::HashKeyBy(key, detail::JoinUnits);
    }
    return detail::HashKeyAtRunTime(key);
}

struct HashedKey {
    template <typename Text>
    requires(std::convertible_to<const Text&, std::u16string_view> && !std::is_array_v<Text>)  //
        constexpr HashedKey(const Text& text)
        : text(text), hash(HashKey(this->text)) {}

    // A literal, whose hash costs nothing.
    template <size_t Size>
    consteval HashedKey(const char16_t (&literal)[Size]) : text(literal, Size - 1), hash(HashKey(text)) {}

    constexpr HashedKey(std::u16string_view text, uint8_t hash) : text(text), hash(hash) {}

    // False if a key of the hash `other` can't be equal to this one. What isn't plain may equal anything.
    constexpr bool MayEqual(uint8_t other) const { return other == hash || other == 0 || hash == 0; }

    std::u16string_view text;
    uint8_t hash;
};

}  // namespace zkhw
