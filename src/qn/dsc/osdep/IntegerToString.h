#pragma once

// Integers as text.

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

#include "qn/dsc/StringBase.h"

namespace qn::dsc::osdep {

// The digits of `value` in `radix`, 2 to 36, with capital letters for digits above 9: "0" for 0, no leading zeros.
// exception::UnableToConvert for any other radix.
String IntegerToString(uint32_t value, uint32_t radix);

// The same, with a "-" in front of a negative value in radix 10. In any other radix a negative value is written as its
// 32-bit pattern: -1 is "FFFFFFFF" in radix 16.
String IntegerToString(int32_t value, uint32_t radix);

// What IntegerToString gives for `value` in radix 10, without memory for it.
class DecimalText {
  public:
    explicit DecimalText(int32_t value) {
        // The negation wraps round, so that the least value too has its magnitude.
        uint32_t rest = value < 0 ? 0U - static_cast<uint32_t>(value) : static_cast<uint32_t>(value);
        do {
            units[--first] = static_cast<char16_t>(u'0' + rest % 10);
            rest /= 10;
        } while (rest != 0);
        if (value < 0) {
            units[--first] = u'-';
        }
    }

    // Good while the object lives.
    std::u16string_view View() const { return {units.data() + first, size - first}; }

  private:
    static constexpr size_t size = 11;  // A sign and ten digits.

    std::array<char16_t, size> units;
    size_t first = size;
};

}  // namespace qn::dsc::osdep
