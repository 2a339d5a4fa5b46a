#include "qn/dsc/WideToUtf8.h"

#include <emmintrin.h>

#include <cstring>
#include <memory>

#include "qn/dsc/exception/Exception.h"

namespace qn::dsc {

namespace {

constexpr const char* moduleName = "qn/dsc/WideToUtf8";

size_t EncodedLength(char16_t unit) {
    return unit < 0x80 ? 1 : unit < 0x800 ? 2 : 3;
}

__m128i Load8(const char16_t* units) {
    return _mm_loadu_si128(reinterpret_cast<const __m128i*>(units));
}

bool AreAscii(__m128i units) {
    const __m128i high = _mm_and_si128(units, _mm_set1_epi16(static_cast<int16_t>(0xFF80)));
    return _mm_movemask_epi8(_mm_cmpeq_epi16(high, _mm_setzero_si128())) == 0xFFFF;
}

char Byte(uint32_t value) {
    return static_cast<char>(static_cast<unsigned char>(value));
}

void EncodeUnit(char16_t unit, char* target) {
    switch (EncodedLength(unit)) {
        case 1:
            target[0] = Byte(unit);
            return;
        case 2:
            target[0] = Byte(0xC0U | unit >> 6);
            target[1] = Byte(0x80U | (unit & 0x3FU));
            return;
        default:
            target[0] = Byte(0xE0U | unit >> 12);
            target[1] = Byte(0x80U | (unit >> 6 & 0x3FU));
            target[2] = Byte(0x80U | (unit & 0x3FU));
            return;
    }
}

}  // namespace

uint32_t MeasureAsUtf8(const char16_t* begin, const char16_t* end, uint32_t limit) {
    uint32_t length = 0;
    while (begin != end) {
        if (end - begin >= 8 && limit - length >= 8 && AreAscii(Load8(begin))) {
            begin += 8;
            length += 8;
            continue;
        }
        const size_t step = EncodedLength(*begin);
        if (step > limit - length) {
            break;
        }
        length += static_cast<uint32_t>(step);
        ++begin;
    }
    return length;
}

const char16_t* EncodeUtf8(const char16_t* begin, const char16_t* end, char* target, size_t capacity) {
    while (begin != end) {
        if (end - begin >= 8 && capacity >= 8) {
            const __m128i units = Load8(begin);
            if (AreAscii(units)) {
                _mm_storel_epi64(reinterpret_cast<__m128i*>(target), _mm_packus_epi16(units, units));
                begin += 8;
                target += 8;
                capacity -= 8;
                continue;
            }
        }
        const size_t step = EncodedLength(*begin);
        if (step > capacity) {
            break;
        }
        EncodeUnit(*begin, target);
        ++begin;
        target += step;
        capacity -= step;
    }
    return begin;
}

char* WideToUtf8(const char16_t* begin, const char16_t* end, uint32_t* resultLength, uint32_t limit) {
    if (begin == nullptr) {
        end = nullptr;
    }
    const uint32_t length = MeasureAsUtf8(begin, end, limit);
    std::unique_ptr<char[]> result(new char[size_t{length} + 1]);
    if (EncodeUtf8(begin, end, result.get(), length) != end) {
        exception::ThrowAt(exception::BufferOverflow(), moduleName, __LINE__);
    }
    result[length] = 0;
    if (resultLength != nullptr) {
        *resultLength = length;
    }
    return result.release();
}

}  // namespace qn::dsc
