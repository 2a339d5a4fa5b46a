#pragma once

// Random cases for laws. Each case has a number of its own from which all of it follows, so that one that fails can be
// made again alone.

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include <gtest/gtest.h>

namespace zkhw {

class Random {
  public:
    explicit Random(uint64_t seed) : state(seed) {}

    // Steps through all numbers of 64 bits, and mixes each well (splitmix64).
    uint64_t Next() {
        uint64_t mixed = state += 0x9E3779B97F4A7C15;
        mixed = (mixed ^ mixed >> 30) * 0xBF58476D1CE4E5B9;
        mixed = (mixed ^ mixed >> 27) * 0x94D049BB133111EB;
        return mixed ^ mixed >> 31;
    }
    size_t Below(size_t bound) { return static_cast<size_t>(Next() % bound); }
    bool OneIn(size_t count) { return Below(count) == 0; }

    template <typename T, size_t Size>
    const T& Of(const T (&choices)[Size]) {
        return choices[Below(Size)];
    }

    // Up to `most` units out of `alphabet`.
    std::u16string Text(std::u16string_view alphabet, size_t most) {
        std::u16string text(Below(most + 1), u' ');
        for (char16_t& unit : text) {
            unit = alphabet[Below(alphabet.size())];
        }
        return text;
    }

  private:
    uint64_t state;
};

inline constexpr uint64_t caseCount = 10'000;

// Runs `check` with the numbers of all cases, up to the first that fails, and says which one that was.
template <typename Check>
void ForEachCase(uint64_t seed, Check check) {
    for (uint64_t number = 0; number < caseCount; ++number) {
        Random random(seed * caseCount + number);
        check(random);
        if (::testing::Test::HasFailure()) {
            ADD_FAILURE() << "in case " << number << " of seed " << seed << ": Random(" << seed * caseCount + number
                          << ")";
            return;
        }
    }
}

}  // namespace zkhw
