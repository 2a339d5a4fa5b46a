#pragma once

// A name that is looked for among texts as libexpat gave them.

#include <array>
#include <cstddef>
#include <string_view>

#include "qn/dsc/osdep/Compare.h"
#include "restree/Utf8Text.h"

namespace zkhw {

// Whether the text is of ASCII without control characters. Two such texts are equal by Compare if they are so letter by
// letter: hyphens and apostrophes too count in an equality.
inline bool IsPlain(std::string_view text) {
    bool isPlain = true;
    for (const char byte : text) {
        isPlain &= byte >= ' ' && byte <= '~';
    }
    return isPlain;
}

class SoughtName {
  public:
    // `name` outlives the object.
    explicit SoughtName(std::u16string_view name) : name(name), isPlain(name.size() <= lowerCase.size()) {
        for (size_t i = 0; i < name.size() && isPlain; ++i) {
            isPlain = name[i] >= u' ' && name[i] <= u'~';
            lowerCase[i] = LowerAscii(static_cast<char>(name[i]));
        }
    }

    // Whether Compare finds it equal to `text`. Most questions are about plain texts of another length.
    bool Equals(std::string_view text, bool textIsPlain) const {
        if (isPlain && textIsPlain) [[likely]] {
            return EqualsWord(text, {lowerCase.data(), name.size()});
        }
        return qn::dsc::osdep::Equal(Widen(text).View(), name);
    }

    std::u16string_view View() const { return name; }

  private:
    std::u16string_view name;
    std::array<char, 64> lowerCase;  // The name as ASCII, if it is plain.
    bool isPlain;                    // Longer names count as not plain.
};

}  // namespace zkhw
