#include "qn/dsc/osdep/CodePage932_linux.h"

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <memory>
#include <new>

#include <unicode/ucnv.h>
#include <unicode/ucnv_cb.h>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/OSException.h"
#include "qn/dsc/osdep/SystemError.h"

namespace qn::dsc::osdep {

namespace {

struct ConverterCloser {
    void operator()(UConverter* converter) const { ucnv_close(converter); }
};
using Converter = std::unique_ptr<UConverter, ConverterCloser>;

// Stands for bytes without a character, as on Windows: the katakana middle dot.
constexpr char16_t defaultCharacter = u'\u30FB';

[[noreturn]] void ThrowRefused(UErrorCode error) {
    if (error == U_MEMORY_ALLOCATION_ERROR) {
        throw std::bad_alloc();
    }
    SetLastSystemError(error == U_FILE_ACCESS_ERROR ? systemErrorFileNotFound : systemErrorNoMapping);
    exception::ThrowAt(WinError(), "qn/dsc/osdep/CodePage932", __LINE__);
}

void RequireSuccess(UErrorCode error) {
    // A full buffer without room for a NUL is only a warning.
    if (U_FAILURE(error) && error != U_BUFFER_OVERFLOW_ERROR) {
        ThrowRefused(error);
    }
}

void WriteDefaultCharacter(const void*, UConverterToUnicodeArgs* arguments, const char*, int32_t,
                           UConverterCallbackReason reason, UErrorCode* error) {
    if (reason <= UCNV_IRREGULAR) {
        *error = U_ZERO_ERROR;
        ucnv_cbToUWriteUChars(arguments, &defaultCharacter, 1, 0, error);
    }
}

// ICU's table has three control characters in each other's places, an old habit of IBM's personal computers. None of
// their bytes is part of a pair, so they can be put right afterwards.
constexpr uint8_t controls[] = {0x1A, 0x1C, 0x7F};
constexpr uint8_t controlsOfTableUnits[] = {0x7F, 0x1A, 0x1C};
constexpr uint8_t controlsOfTableBytes[] = {0x1C, 0x7F, 0x1A};

template <typename Unit>
void PutControlsRight(Unit* units, size_t count, const uint8_t (&rightOnes)[3]) {
    for (size_t i = 0; i < count; ++i) {
        const auto* const found = std::find(std::begin(controls), std::end(controls), units[i]);
        if (found != std::end(controls)) {
            units[i] = static_cast<Unit>(rightOnes[found - controls]);
        }
    }
}

// A converter for one conversion: ICU keeps its tables, so that only the first one is expensive.
Converter Open() {
    UErrorCode error = U_ZERO_ERROR;
    Converter converter(ucnv_open("windows-932", &error));
    static constexpr char16_t questionMark[] = u"?";
    ucnv_setSubstString(converter.get(), questionMark, 1, &error);
    ucnv_setToUCallBack(converter.get(), WriteDefaultCharacter, nullptr, nullptr, nullptr, &error);
    RequireSuccess(error);
    // Characters that come near, such as the backslash for the yen sign.
    ucnv_setFallback(converter.get(), true);
    return converter;
}

// ICU counts in signed 32 bits.
int32_t CheckedCount(size_t count) {
    if (count > INT32_MAX) {
        SetLastSystemError(systemErrorInvalidParameter);
        exception::ThrowAt(WinError(), "qn/dsc/osdep/CodePage932", __LINE__);
    }
    return static_cast<int32_t>(count);
}

int32_t Capacity(size_t capacity) {
    return static_cast<int32_t>(std::min<size_t>(capacity, INT32_MAX));
}

}  // namespace

size_t CodePage932ToUnits(std::string_view bytes, char16_t* units, size_t capacity) {
    const int32_t count = CheckedCount(bytes.size());
    const Converter converter = Open();
    UErrorCode error = U_ZERO_ERROR;
    const int32_t written = ucnv_toUChars(converter.get(), units, Capacity(capacity), bytes.data(), count, &error);
    RequireSuccess(error);
    PutControlsRight(units, std::min(static_cast<size_t>(written), capacity), controlsOfTableUnits);
    return static_cast<size_t>(written);
}

size_t UnitsToCodePage932(std::u16string_view text, char* bytes, size_t capacity) {
    const int32_t count = CheckedCount(text.size());
    const Converter converter = Open();
    UErrorCode error = U_ZERO_ERROR;
    const int32_t written = ucnv_fromUChars(converter.get(), bytes, Capacity(capacity), text.data(), count, &error);
    RequireSuccess(error);
    PutControlsRight(bytes, std::min(static_cast<size_t>(written), capacity), controlsOfTableBytes);
    return static_cast<size_t>(written);
}

}  // namespace qn::dsc::osdep
