#include "qn/dsc/osdep/StringToInteger.h"

#include <algorithm>
#include <cstddef>
#include <string_view>

#include "qn/dsc/exception/Exception.h"

namespace qn::dsc::osdep {

namespace {

[[noreturn]] void ThrowUnable(int32_t line) {
    exception::ThrowAt(exception::UnableToConvert(), "qn/dsc/osdep/StringToInteger", line);
}

constexpr uint32_t noDigit = 0xFFFFFFFF;

// Not below any radix for a unit that is neither a digit nor a letter of ASCII.
uint32_t DigitValue(char16_t unit) {
    if (unit >= u'0' && unit <= u'9') {
        return static_cast<uint32_t>(unit - u'0');
    }
    if (unit >= u'a' && unit <= u'z') {
        return static_cast<uint32_t>(unit - u'a' + 10);
    }
    if (unit >= u'A' && unit <= u'Z') {
        return static_cast<uint32_t>(unit - u'A' + 10);
    }
    return noDigit;
}

void SkipIf(std::u16string_view& text, char16_t unit, bool& skipped) {
    skipped = !text.empty() && text.front() == unit;
    if (skipped) {
        text.remove_prefix(1);
    }
}

bool HasHexadecimalPrefix(std::u16string_view text) {
    return text.size() >= 3 && text[0] == u'0' && (text[1] == u'x' || text[1] == u'X');
}

}  // namespace

uint32_t StringToInteger(TextArgument text, uint32_t radix, bool& negative) {
    if (radix < 2 || radix > 36) {
        ThrowUnable(__LINE__);
    }
    std::u16string_view rest = text.View();
    rest.remove_prefix(std::min(rest.find_first_not_of(u" \t\r\n"), rest.size()));
    SkipIf(rest, u'-', negative);
    bool hasPlus;
    SkipIf(rest, u'+', hasPlus);
    if (radix == 16 && HasHexadecimalPrefix(rest)) {
        rest.remove_prefix(2);
    }
    uint32_t result = 0;
    for (char16_t unit : rest) {
        const uint32_t digit = DigitValue(unit);
        if (digit >= radix) {
            break;
        }
        const uint32_t product = result * radix;
        if (product < result) {
            ThrowUnable(__LINE__);
        }
        result = product + digit;
    }
    return result;
}

int32_t StringToInteger(TextArgument text, uint32_t radix) {
    bool negative;
    const uint32_t magnitude = StringToInteger(text, radix, negative);
    return static_cast<int32_t>(negative && radix == 10 ? 0u - magnitude : magnitude);
}

}  // namespace qn::dsc::osdep
