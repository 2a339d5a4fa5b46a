// All of the order is the system's, ASCII included: its order of punctuation is not the same in every version of it,
// and an order that is partly ours and partly the system's would be none.

#include <windows.h>

#include <climits>

#include "qn/dsc/osdep/Compare_ascii.h"

namespace qn::dsc::osdep {

namespace {

// The system takes no null text, however short.
const char16_t* TextOf(std::u16string_view text) {
    return text.empty() ? u"" : text.data();
}

}  // namespace

int CompareCollated(std::u16string_view a, std::u16string_view b) {
    // The same units are equal in any order, and names that are looked for are often written as they stand.
    if (a == b || a.size() > INT_MAX || b.size() > INT_MAX) {
        return 0;
    }
    const int result = CompareStringW(LOCALE_USER_DEFAULT, NORM_IGNORECASE, TextOf(a), static_cast<int>(a.size()),
                                      TextOf(b), static_cast<int>(b.size()));
    return result == 0 ? 0 : result - CSTR_EQUAL;
}

}  // namespace qn::dsc::osdep
