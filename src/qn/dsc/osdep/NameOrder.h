#pragma once

// Letter case and order of file names where the system itself has none: names are the same, and are ordered, by their
// upper-cased UTF-16 units, as on an NTFS volume. No language has a part in it.

#include <string>
#include <string_view>

namespace qn::dsc::osdep {

// The simple upper case of one unit. Surrogates are their own, and no unit outside ASCII has an ASCII letter as its
// upper case (the dotless i and the long s have, in Unicode), so a name of ASCII alone only ever equals others of that
// kind.
char16_t UpperUnit(char16_t unit);

// Appends the upper case of `name`, which has as many units.
void AppendUpper(std::u16string_view name, std::u16string& upper);

// Whether all of `name` fits `pattern`: "*" stands for any units, none included, "?" for one unit, any other unit for
// itself. Both are upper-cased, for a match blind to letter case. At worst the product of the lengths.
bool MatchesPattern(std::u16string_view pattern, std::u16string_view name);

}  // namespace qn::dsc::osdep
