#pragma once

// A key to look for, with what rules out nearly all entries that have another one.

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>
#include <type_traits>

namespace zkhw {

namespace detail {

// Four units as one number, the first in its lowest 16 bits.
constexpr uint64_t LoadUnits(const char16_t* units) {
    uint64_t word = 0;
    if (std::is_constant_evaluated()) {
        for (size_t i = 0; i < 4; ++i) {
            word |= uint64_t{units[i]} << (16 * i);
        }
    } else {
        std::memcpy(&word, units, sizeof(word));
    }
    return word;
}

// Whether each unit lies from "." to "~": the borrow of a lesser one and the carry of a greater one both show.
constexpr bool IsPlain(uint64_t word) {
    return (((word - 0x002E002E002E002E) | (word + 0x0001000100010001)) & 0xFF80FF80FF80FF80) == 0;
}

constexpr uint64_t MixUnits(uint64_t hash, uint64_t word) {
    // Letters of either case get the same bits.
    return (hash ^ (word | 0x0020002000200020)) * 0x9E3779B97F4A7C15;
}

}  // namespace detail

// Equal for keys that are equal under Compare and plain: of units from "." to "~", as most keys are. 0 for any other
// key, which may be equal to a plain one of any hash. Plain keys compare without the user's collation and without
// memory. Takes four units at a step, the last ones once more where they don't fill one.
constexpr uint8_t HashKey(std::u16string_view key) {
    using detail::IsPlain;
    using detail::LoadUnits;
    using detail::MixUnits;
    uint64_t hash = key.size() + 1;
    if (key.size() >= 4) {
        for (size_t at = 0; at + 4 < key.size(); at += 4) {
            const uint64_t word = LoadUnits(key.data() + at);
            if (!IsPlain(word)) {
                return 0;
            }
            hash = MixUnits(hash, word);
        }
        const uint64_t word = LoadUnits(key.data() + key.size() - 4);
        if (!IsPlain(word)) {
            return 0;
        }
        hash = MixUnits(hash, word);
    } else {
        for (const char16_t unit : key) {
            const uint64_t word = unit * uint64_t{0x0001000100010001};
            if (!IsPlain(word)) {
                return 0;
            }
            hash = MixUnits(hash, word);
        }
    }
    const auto top = static_cast<uint8_t>(hash >> 56);
    return top == 0 ? uint8_t{1} : top;
}

struct HashedKey {
    constexpr HashedKey(std::u16string_view text) : text(text), hash(HashKey(text)) {}
    constexpr HashedKey(const char16_t* text) : HashedKey(std::u16string_view(text)) {}
    constexpr HashedKey(std::u16string_view text, uint8_t hash) : text(text), hash(hash) {}

    std::u16string_view text;
    uint8_t hash;
};

}  // namespace zkhw
