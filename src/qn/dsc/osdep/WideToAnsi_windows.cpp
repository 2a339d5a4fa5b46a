#include <windows.h>

#include <algorithm>
#include <climits>
#include <cstddef>
#include <memory>
#include <string_view>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/OSException.h"
#include "qn/dsc/osdep/SystemError.h"
#include "qn/dsc/osdep/WideToAnsi.h"
#include "qn/dsc/osdep/_GetCodePageID.h"

namespace qn::dsc::osdep {

namespace {

// The number of bytes; with null `bytes` and a capacity of 0 they are only counted.
int Convert(std::u16string_view source, uint32_t codePage, char* bytes, int capacity) {
    const int result = WideCharToMultiByte(codePage, 0, source.data(), static_cast<int>(source.size()), bytes, capacity,
                                           nullptr, nullptr);
    if (result == 0) {
        exception::ThrowAt(WinError(), "qn/dsc/osdep/WideToAnsi", __LINE__);
    }
    return result;
}

}  // namespace

char* WideToAnsi(const char16_t* begin, const char16_t* end, const char* locale) {
    const std::u16string_view source(begin, static_cast<size_t>(std::find(begin, end, u'\0') - begin));
    if (source.empty()) {
        return new char[1]();
    }
    const uint32_t codePage = GetCodePageID(locale);
    if (source.size() > INT_MAX) {
        SetLastSystemError(systemErrorInvalidParameter);
        exception::ThrowAt(WinError(), "qn/dsc/osdep/WideToAnsi", __LINE__);
    }
    const int count = Convert(source, codePage, nullptr, 0);
    std::unique_ptr<char[]> bytes(new char[static_cast<size_t>(count) + 1]);
    Convert(source, codePage, bytes.get(), count);
    bytes[static_cast<size_t>(count)] = 0;
    return bytes.release();
}

}  // namespace qn::dsc::osdep
