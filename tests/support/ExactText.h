#pragma once

// Texts for expectations. == of String is blind to letter case; tests that mean the very units compare these.

#include <cstdint>
#include <cstdio>
#include <string>
#include <string_view>
#include <vector>

#include "qn/dsc/StringBase.h"

namespace qn::dsc {

// ASCII as it is, any other unit, and NUL, as its four hexadecimal digits in braces: "{00E9}".
inline std::string ExactText(std::u16string_view text) {
    std::string exact;
    for (const char16_t unit : text) {
        if (unit != 0 && unit < 0x80) {
            exact.push_back(static_cast<char>(unit));
        } else {
            char number[8];
            std::snprintf(number, sizeof number, "{%04X}", static_cast<unsigned>(unit));
            exact += number;
        }
    }
    return exact;
}

inline std::string ExactText(const String& text) {
    return ExactText(text.View());
}

inline std::vector<std::string> ExactTexts(const std::vector<String>& texts) {
    std::vector<std::string> exact;
    exact.reserve(texts.size());
    for (const String& text : texts) {
        exact.push_back(ExactText(text));
    }
    return exact;
}

}  // namespace qn::dsc
