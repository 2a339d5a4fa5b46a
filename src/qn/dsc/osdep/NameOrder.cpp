#include "qn/dsc/osdep/NameOrder.h"

namespace qn::dsc::osdep {

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
