#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>

#include "qn/dsc/osdep/AnsiToWide.h"
#include "qn/dsc/osdep/CodePage932_linux.h"
#include "qn/dsc/osdep/NativeText.h"
#include "qn/dsc/osdep/_GetCodePageID.h"

namespace qn::dsc::osdep {

namespace {

// The number of units; with null `units` they are only counted.
size_t Convert(std::string_view source, uint32_t codePage, char16_t* units, size_t capacity) {
    if (codePage == japaneseCodePage) {
        return CodePage932ToUnits(source, units, capacity);
    }
    if (codePage == defaultCodePage) {
        return NativeToUnits(source, units);
    }
    if (units != nullptr) {
        std::transform(source.begin(), source.end(), units,
                       [](char byte) { return static_cast<char16_t>(byte & 0x7F); });
    }
    return source.size();
}

}  // namespace

char16_t* AnsiToWide(const char* begin, const char* end, const char* locale) {
    const std::string_view source(begin, static_cast<size_t>(std::find(begin, end, '\0') - begin));
    if (source.empty()) {
        return new char16_t[1]();
    }
    const uint32_t codePage = GetCodePageID(locale);
    const size_t count = Convert(source, codePage, nullptr, 0);
    std::unique_ptr<char16_t[]> units(new char16_t[count + 1]);
    Convert(source, codePage, units.get(), count);
    units[count] = 0;
    return units.release();
}

}  // namespace qn::dsc::osdep
