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

}  // namespace qn::dsc::osdep
