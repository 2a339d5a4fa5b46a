#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>

#include "qn/dsc/osdep/CodePage932_linux.h"
#include "qn/dsc/osdep/NativeText.h"
#include "qn/dsc/osdep/WideToAnsi.h"
#include "qn/dsc/osdep/_GetCodePageID.h"

namespace qn::dsc::osdep {

namespace {

// The number of bytes; with null `bytes` they are only counted.
size_t Convert(std::u16string_view source, uint32_t codePage, char* bytes, size_t capacity) {
    if (codePage == japaneseCodePage) {
        return UnitsToCodePage932(source, bytes, capacity);
    }
    if (codePage == defaultCodePage) {
        return UnitsToNative(source, bytes);
    }
    if (bytes != nullptr) {
        std::transform(source.begin(), source.end(), bytes,
                       [](char16_t unit) { return unit < 0x80 ? static_cast<char>(unit) : '?'; });
    }
    return source.size();
}

}  // namespace

char* WideToAnsi(const char16_t* begin, const char16_t* end, const char* locale) {
    const std::u16string_view source(begin, static_cast<size_t>(std::find(begin, end, u'\0') - begin));
    if (source.empty()) {
        return new char[1]();
    }
    const uint32_t codePage = GetCodePageID(locale);
    const size_t count = Convert(source, codePage, nullptr, 0);
    std::unique_ptr<char[]> bytes(new char[count + 1]);
    Convert(source, codePage, bytes.get(), count);
    bytes[count] = 0;
    return bytes.release();
}

}  // namespace qn::dsc::osdep
