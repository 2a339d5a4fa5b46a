#pragma once

// Text as libexpat gives it: UTF-8, widened once it is known what it is for. Four-byte sequences are not supported in
// this system; a text that holds one counts as empty.

#include <algorithm>
#include <string_view>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/Utf8ToWide.h"

namespace zkhw {

inline bool IsAscii(std::string_view text) {
    return qn::dsc::IsAscii(text.data(), text.size());
}

// True if libexpat's text can be widened. It has been checked to be UTF-8 already, so only the lead byte of a
// four-byte sequence is refused.
inline bool IsWidenable(std::string_view text) {
    return IsAscii(text) ||
           std::none_of(text.begin(), text.end(), [](char byte) { return static_cast<unsigned char>(byte) >= 0xF0; });
}

// Makes `wide` the wide form; empty if the text is refused.
inline void WidenInto(std::string_view text, qn::dsc::String& wide) {
    if (!qn::dsc::String::TryFromUtf8(text.data(), static_cast<uint32_t>(text.size()), wide)) {
        wide = qn::dsc::String();
    }
}

inline qn::dsc::String Widen(std::string_view text) {
    qn::dsc::String wide = qn::dsc::String::WithoutBuffer();
    WidenInto(text, wide);
    return wide;
}

constexpr char LowerAscii(char unit) {
    return unit >= 'A' && unit <= 'Z' ? static_cast<char>(unit + ('a' - 'A')) : unit;
}

// Equality of an ASCII text and an ASCII word in lower case, blind to letter case.
inline bool EqualsWord(std::string_view text, std::string_view word) {
    return text.size() == word.size() && std::equal(text.begin(), text.end(), word.begin(),
                                                    [](char left, char right) { return LowerAscii(left) == right; });
}

inline bool EndsWithWord(std::string_view text, std::string_view word) {
    return text.size() >= word.size() && EqualsWord(text.substr(text.size() - word.size()), word);
}

}  // namespace zkhw
