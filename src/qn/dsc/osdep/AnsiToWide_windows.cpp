#include <windows.h>

#include <algorithm>
#include <climits>
#include <cstddef>
#include <memory>
#include <string_view>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/AnsiToWide.h"
#include "qn/dsc/osdep/OSException.h"
#include "qn/dsc/osdep/SystemError.h"
#include "qn/dsc/osdep/_GetCodePageID.h"

namespace qn::dsc::osdep {

namespace {

// The number of units; with null `units` and a capacity of 0 they are only counted.
int Convert(std::string_view source, uint32_t codePage, char16_t* units, int capacity) {
    const int result =
        MultiByteToWideChar(codePage, 0, source.data(), static_cast<int>(source.size()), units, capacity);
    if (result == 0) {
        exception::ThrowAt(WinError(), "qn/dsc/osdep/AnsiToWide", __LINE__);
    }
    return result;
}

}  // namespace

char16_t* AnsiToWide(const char* begin, const char* end, const char* locale) {
    const std::string_view source(begin, static_cast<size_t>(std::find(begin, end, '\0') - begin));
    if (source.empty()) {
        return new char16_t[1]();
    }
    const uint32_t codePage = GetCodePageID(locale);
    if (source.size() > INT_MAX) {
        SetLastSystemError(systemErrorInvalidParameter);
        exception::ThrowAt(WinError(), "qn/dsc/osdep/AnsiToWide", __LINE__);
    }
    const int count = Convert(source, codePage, nullptr, 0);
    std::unique_ptr<char16_t[]> units(new char16_t[static_cast<size_t>(count) + 1]);
    Convert(source, codePage, units.get(), count);
    units[static_cast<size_t>(count)] = 0;
    return units.release();
}

}  // namespace qn::dsc::osdep
