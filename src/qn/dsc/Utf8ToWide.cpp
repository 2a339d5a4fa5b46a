#include "qn/dsc/Utf8ToWide.h"

#include <emmintrin.h>

#include <cstring>
#include <memory>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/exception/Exception.h"

namespace qn::dsc {

namespace {

constexpr const char* moduleName = "qn/dsc/Utf8ToWide";
constexpr uint64_t topBitsOf8 = 0x8080808080808080U;
constexpr uint32_t topBitsOf4 = 0x80808080U;

template <typename Word>
Word Load(const char* bytes) {
    Word word;
    std::memcpy(&word, bytes, sizeof(word));
    return word;
}

__m128i Load16(const char* bytes) {
    return _mm_loadu_si128(reinterpret_cast<const __m128i*>(bytes));
}

// Write 8 or 4 units, one for each byte, and give the bytes.
__m128i Widen8(const char* bytes, char16_t* target) {
    const __m128i narrow = _mm_loadl_epi64(reinterpret_cast<const __m128i*>(bytes));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(target), _mm_unpacklo_epi8(narrow, _mm_setzero_si128()));
    return narrow;
}

__m128i Widen4(const char* bytes, char16_t* target) {
    const __m128i narrow = _mm_cvtsi32_si128(Load<int32_t>(bytes));
    _mm_storel_epi64(reinterpret_cast<__m128i*>(target), _mm_unpacklo_epi8(narrow, _mm_setzero_si128()));
    return narrow;
}

bool IsAscii(__m128i bytes) {
    return _mm_movemask_epi8(bytes) == 0;
}

uint32_t ByteAt(const char* bytes) {
    return static_cast<unsigned char>(*bytes);
}

bool IsContinuation(uint32_t byte) {
    return (byte & 0xC0U) == 0x80;
}

// The bytes in the sequence at `bytes`, of which `left` remain, 1 at least; 0 if it is not well formed.
size_t SequenceLength(const char* bytes, size_t left) {
    const uint32_t lead = ByteAt(bytes);
    if (lead < 0x80) {
        return 1;
    }
    // Continuation bytes and the leads of overlong forms; leads of four bytes and more.
    if (lead < 0xC2 || lead >= 0xF0 || left < 2) {
        return 0;
    }
    const uint32_t second = ByteAt(bytes + 1);
    if (!IsContinuation(second)) {
        return 0;
    }
    if (lead < 0xE0) {
        return 2;
    }
    const bool isOverlong = lead == 0xE0 && second < 0xA0;
    return left >= 3 && !isOverlong && IsContinuation(ByteAt(bytes + 2)) ? 3 : 0;
}

char16_t DecodeSequence(const char* bytes, size_t length) {
    const uint32_t lead = ByteAt(bytes);
    switch (length) {
        case 1:
            return static_cast<char16_t>(lead);
        case 2:
            return static_cast<char16_t>((lead & 0x1FU) << 6 | (ByteAt(bytes + 1) & 0x3FU));
        default:
            return static_cast<char16_t>((lead & 0x0FU) << 12 | (ByteAt(bytes + 1) & 0x3FU) << 6 |
                                         (ByteAt(bytes + 2) & 0x3FU));
    }
}

}  // namespace

// In both, the last step goes back over bytes already seen, so that no loop over single bytes is needed.
bool IsAscii(const char* begin, size_t length) {
    if (length >= 16) {
        __m128i seen = Load16(begin + length - 16);
        for (size_t offset = 0; offset + 16 < length; offset += 16) {
            seen = _mm_or_si128(seen, Load16(begin + offset));
        }
        return IsAscii(seen);
    }
    if (length >= 8) {
        return ((Load<uint64_t>(begin) | Load<uint64_t>(begin + length - 8)) & topBitsOf8) == 0;
    }
    if (length >= 4) {
        return ((Load<uint32_t>(begin) | Load<uint32_t>(begin + length - 4)) & topBitsOf4) == 0;
    }
    uint32_t seen = 0;
    for (size_t offset = 0; offset < length; ++offset) {
        seen |= ByteAt(begin + offset);
    }
    return seen < 0x80;
}

bool WidenAscii(const char* begin, size_t length, char16_t* target) {
    if (length >= 8) {
        __m128i seen = Widen8(begin + length - 8, target + length - 8);
        for (size_t offset = 0; offset + 8 < length; offset += 8) {
            seen = _mm_or_si128(seen, Widen8(begin + offset, target + offset));
        }
        return IsAscii(seen);
    }
    if (length >= 4) {
        const __m128i first = Widen4(begin, target);
        return IsAscii(_mm_or_si128(first, Widen4(begin + length - 4, target + length - 4)));
    }
    uint32_t seen = 0;
    for (size_t offset = 0; offset < length; ++offset) {
        seen |= ByteAt(begin + offset);
        target[offset] = static_cast<char16_t>(ByteAt(begin + offset));
    }
    return seen < 0x80;
}

size_t MeasureUtf8(const char* begin, size_t length) {
    size_t count = 0;
    size_t offset = 0;
    while (offset < length) {
        if (length - offset >= 8 && (Load<uint64_t>(begin + offset) & topBitsOf8) == 0) {
            offset += 8;
            count += 8;
            continue;
        }
        const size_t step = SequenceLength(begin + offset, length - offset);
        if (step == 0) {
            return SIZE_MAX;
        }
        offset += step;
        ++count;
    }
    return count;
}

const char* DecodeUtf8(const char* begin, size_t length, char16_t* target, size_t capacity) {
    size_t offset = 0;
    size_t count = 0;
    while (offset < length && count < capacity) {
        if (length - offset >= 8 && capacity - count >= 8 && (Load<uint64_t>(begin + offset) & topBitsOf8) == 0) {
            Widen8(begin + offset, target + count);
            offset += 8;
            count += 8;
            continue;
        }
        const size_t step = SequenceLength(begin + offset, length - offset);
        if (step == 0) {
            break;
        }
        target[count] = DecodeSequence(begin + offset, step);
        offset += step;
        ++count;
    }
    return begin + offset;
}

char16_t* Utf8ToWide(const char* begin, uint32_t length, uint32_t* resultLength) {
    const size_t sourceLength = begin == nullptr ? 0 : length;
    const size_t count = MeasureUtf8(begin, sourceLength);
    if (count == SIZE_MAX) {
        exception::ThrowAt(exception::InvalidSequence(), moduleName, __LINE__);
    }
    std::unique_ptr<char16_t[]> result(new char16_t[count + 1]);
    if (DecodeUtf8(begin, sourceLength, result.get(), count) != begin + sourceLength) {
        exception::ThrowAt(exception::BufferOverflow(), moduleName, __LINE__);
    }
    result[count] = 0;
    if (resultLength != nullptr) {
        *resultLength = static_cast<uint32_t>(count);
    }
    return result.release();
}

// Here and not with the other operations: these are Utf8ToWide without the buffer in between.
template <>
bool StringBase<char16_t>::TryFromUtf8(const char* bytes, uint32_t length, String& text) {
    const size_t sourceLength = bytes == nullptr ? 0 : length;
    if (text.begin == nullptr) {
        // As nearly always: a place without a buffer, and ASCII. Other texts have fewer units than bytes.
        char16_t* block = AllocateUnits(sourceLength);
        size_t count = sourceLength;
        if (!WidenAscii(bytes, sourceLength, block)) {
            count = MeasureUtf8(bytes, sourceLength);
            if (count == SIZE_MAX) {
                osdep::TaskMemFree(block);
                return false;
            }
            DecodeUtf8(bytes, sourceLength, block, count);
            // A smaller block; if there is none to be had, the greater one does as well.
            void* smaller = osdep::TaskMemRealloc(block, (count + 1) * sizeof(char16_t));
            block = smaller == nullptr ? block : static_cast<char16_t*>(smaller);
        }
        text.SetFull(block, count);
        return true;
    }
    const size_t count = MeasureUtf8(bytes, sourceLength);
    if (count == SIZE_MAX) {
        return false;
    }
    if (!text.KeepsBuffer(count)) {
        char16_t* block = AllocateUnits(count);
        osdep::TaskMemFree(text.begin);
        text.begin = block;
        text.capacityEnd = block + count;
    }
    DecodeUtf8(bytes, sourceLength, text.begin, count);
    text.end = text.begin + count;
    *text.end = 0;
    return true;
}

template <>
String StringBase<char16_t>::FromUtf8(const char* bytes, uint32_t length) {
    String text = WithoutBuffer();
    if (!TryFromUtf8(bytes, length, text)) {
        exception::ThrowAt(exception::InvalidSequence(), moduleName, __LINE__);
    }
    return text;
}

}  // namespace qn::dsc
