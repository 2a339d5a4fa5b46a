#pragma once

// The part of Compare that every platform shares: what ASCII decides by itself, and the second step. Pure text, no
// library behind it.

#include <array>
#include <cstdint>
#include <string_view>

namespace qn::dsc::osdep {

// Whether ASCII has the one order that is written out here, so that it need not be asked of the platform.
#if defined(_WIN32)
inline constexpr bool hasAsciiOrder = false;
#else
inline constexpr bool hasAsciiOrder = true;
#endif

// What CompareAscii gives for texts that it cannot tell apart without the user's collation.
inline constexpr int undecidedByAscii = 2;

// Compare, as far as ASCII decides: -1, 0, 1, or undecidedByAscii if a unit outside ASCII has a part in the answer.
// Texts of ASCII alone are always decided. Linear up to the first difference.
int CompareAscii(std::u16string_view a, std::u16string_view b);

// The second step of Compare, for texts that the first step finds equal: -1, 0 or 1 by their "-" and "'". Linear.
int CompareMarks(std::u16string_view a, std::u16string_view b);

// Compare for texts that CompareAscii leaves undecided, by the platform's collation.
int CompareCollated(std::u16string_view a, std::u16string_view b);

// The punctuation of ASCII in its order; all of it stands behind the blank and before the digits. "-" and "'" are not
// among it, since they only count in the second step.
inline constexpr std::u16string_view asciiPunctuation = u"!\"#$%&()*,./:;?@[\\]^_`{|}~+<=>";

constexpr std::array<uint8_t, 0x80> MakeAsciiWeights() {
    std::array<uint8_t, 0x80> weights{};
    uint8_t next = 1;
    for (char16_t unit : std::u16string_view(u"\t\n\v\f\r ")) {
        weights[unit] = next++;
    }
    for (char16_t unit : asciiPunctuation) {
        weights[unit] = next++;
    }
    for (char16_t unit = u'0'; unit <= u'9'; ++unit) {
        weights[unit] = next++;
    }
    for (char16_t unit = u'a'; unit <= u'z'; ++unit) {
        weights[unit] = next;
        weights[unit - u'a' + u'A'] = next++;
    }
    return weights;
}

// The place of each ASCII unit in the order; the letters of either case share one. 0: the unit does not count in the
// first step ("-", "'" and the control characters without a place).
inline constexpr std::array<uint8_t, 0x80> asciiWeights = MakeAsciiWeights();

}  // namespace qn::dsc::osdep
