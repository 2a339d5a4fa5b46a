#include "qn/dsc/osdep/NameOrder.h"

#include <unicode/uchar.h>

namespace qn::dsc::osdep {

char16_t UpperUnit(char16_t unit) {
    if (unit < 0x80) {
        return unit >= u'a' && unit <= u'z' ? static_cast<char16_t>(unit - u'a' + u'A') : unit;
    }
    const UChar32 upper = u_toupper(unit);
    return upper < 0x80 || upper > 0xFFFF ? unit : static_cast<char16_t>(upper);
}

void AppendUpper(std::u16string_view name, std::u16string& upper) {
    const size_t start = upper.size();
    upper.append(name);
    for (size_t i = start; i < upper.size(); ++i) {
        upper[i] = UpperUnit(upper[i]);
    }
}

bool MatchesPattern(std::u16string_view pattern, std::u16string_view name) {
    size_t atPattern = 0;
    size_t atName = 0;
    // Where to go on if a unit doesn't fit: behind the last "*", which then takes one unit more.
    size_t behindStar = std::u16string_view::npos;
    size_t starEnd = 0;
    while (atName < name.size()) {
        if (atPattern < pattern.size() && pattern[atPattern] == u'*') {
            behindStar = ++atPattern;
            starEnd = atName;
        } else if (atPattern < pattern.size() && (pattern[atPattern] == u'?' || pattern[atPattern] == name[atName])) {
            ++atPattern;
            ++atName;
        } else if (behindStar != std::u16string_view::npos) {
            atPattern = behindStar;
            atName = ++starEnd;
        } else {
            return false;
        }
    }
    while (atPattern < pattern.size() && pattern[atPattern] == u'*') {
        ++atPattern;
    }
    return atPattern == pattern.size();
}

}  // namespace qn::dsc::osdep
