#pragma once

// The part of Compare that every platform shares: what ASCII decides by itself, and the second step. Pure text, no
// library behind it.

#include <cstdint>
#include <string_view>

namespace qn::dsc::osdep {

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

}  // namespace qn::dsc::osdep
