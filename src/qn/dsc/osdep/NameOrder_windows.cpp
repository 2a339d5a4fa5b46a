#include <windows.h>

#include <climits>

#include "qn/dsc/osdep/NameOrder.h"

namespace qn::dsc::osdep {

char16_t UpperUnit(char16_t unit) {
    if (unit < 0x80) {
        return unit >= u'a' && unit <= u'z' ? static_cast<char16_t>(unit - u'a' + u'A') : unit;
    }
    // The locale without a language, and so by the same simple rule as the system's volumes.
    char16_t upper = unit;
    const int mapped = LCMapStringEx(u"", LCMAP_UPPERCASE, &unit, 1, &upper, 1, nullptr, nullptr, 0);
    return mapped != 1 || upper < 0x80 ? unit : upper;
}

void AppendUpper(std::u16string_view name, std::u16string& upper) {
    const size_t start = upper.size();
    upper.append(name);
    for (size_t i = start; i < upper.size(); ++i) {
        upper[i] = UpperUnit(upper[i]);
    }
}

}  // namespace qn::dsc::osdep
