#include "qn/dsc/osdep/NativeText.h"

#include <cstdint>

namespace qn::dsc::osdep {

namespace {

constexpr char32_t firstSurrogate = 0xD800;
constexpr char32_t firstLowSurrogate = 0xDC00;
constexpr char32_t lastSurrogate = 0xDFFF;
constexpr char32_t firstBeyondUnits = 0x10000;
constexpr char32_t lastCharacter = 0x10FFFF;

bool IsHighSurrogate(char16_t unit) {
    return unit >= firstSurrogate && unit < firstLowSurrogate;
}

bool IsLowSurrogate(char16_t unit) {
    return unit >= firstLowSurrogate && unit <= lastSurrogate;
}

uint8_t ByteAt(std::string_view bytes, size_t index) {
    return static_cast<uint8_t>(bytes[index]);
}

// The length of the sequence that the lead byte promises; 0 for a byte that leads none.
size_t PromisedLength(uint8_t lead) {
    if (lead < 0x80) {
        return 1;
    }
    if (lead < 0xC2) {
        return 0;
    }
    if (lead < 0xE0) {
        return 2;
    }
    if (lead < 0xF0) {
        return 3;
    }
    return lead < 0xF5 ? 4 : 0;
}

// The character at the start of `bytes`, which isn't empty, and the length of its sequence; a length of 0 where no
// valid sequence starts.
size_t DecodeOne(std::string_view bytes, char32_t& character) {
    static constexpr uint8_t leadBits[] = {0, 0x7F, 0x1F, 0x0F, 0x07};
    static constexpr char32_t leastOfLength[] = {0, 0, 0x80, 0x800, firstBeyondUnits};
    const size_t length = PromisedLength(ByteAt(bytes, 0));
    if (length == 0 || length > bytes.size()) {
        return 0;
    }
    character = ByteAt(bytes, 0) & leadBits[length];
    for (size_t i = 1; i < length; ++i) {
        const uint8_t next = ByteAt(bytes, i);
        if ((next & 0xC0) != 0x80) {
            return 0;
        }
        character = (character << 6) | (next & 0x3Fu);
    }
    const bool isSurrogate = character >= firstSurrogate && character <= lastSurrogate;
    return character < leastOfLength[length] || character > lastCharacter || isSurrogate ? 0 : length;
}

// Writes, or only counts.
template <typename Unit>
class Sink {
  public:
    explicit Sink(Unit* destination) : output(destination) {}

    void Put(char32_t unit) {
        if (output != nullptr) {
            output[count] = static_cast<Unit>(unit);
        }
        ++count;
    }

    size_t Count() const { return count; }

  private:
    Unit* output;
    size_t count = 0;
};

void EncodeOne(char32_t character, Sink<char>& sink) {
    if (character < 0x80) {
        sink.Put(character);
        return;
    }
    if (character < 0x800) {
        sink.Put(0xC0 | (character >> 6));
    } else {
        if (character < firstBeyondUnits) {
            sink.Put(0xE0 | (character >> 12));
        } else {
            sink.Put(0xF0 | (character >> 18));
            sink.Put(0x80 | ((character >> 12) & 0x3F));
        }
        sink.Put(0x80 | ((character >> 6) & 0x3F));
    }
    sink.Put(0x80 | (character & 0x3F));
}

}  // namespace

size_t NativeToUnits(std::string_view bytes, char16_t* units) {
    Sink<char16_t> sink(units);
    size_t at = 0;
    while (at < bytes.size()) {
        char32_t character = ByteAt(bytes, at);
        if (character < 0x80) {
            sink.Put(character);
            ++at;
            continue;
        }
        const size_t length = DecodeOne(bytes.substr(at), character);
        if (length == 0) {
            sink.Put(firstLowSurrogate + ByteAt(bytes, at));
            ++at;
            continue;
        }
        if (character < firstBeyondUnits) {
            sink.Put(character);
        } else {
            sink.Put(firstSurrogate + ((character - firstBeyondUnits) >> 10));
            sink.Put(firstLowSurrogate + ((character - firstBeyondUnits) & 0x3FF));
        }
        at += length;
    }
    return sink.Count();
}

size_t UnitsToNative(std::u16string_view text, char* bytes) {
    Sink<char> sink(bytes);
    for (size_t at = 0; at < text.size(); ++at) {
        const char16_t unit = text[at];
        if (unit < firstSurrogate || unit > lastSurrogate) {
            EncodeOne(unit, sink);
        } else if (IsHighSurrogate(unit) && at + 1 < text.size() && IsLowSurrogate(text[at + 1])) {
            const char32_t high = unit - firstSurrogate;
            const char32_t low = text[at + 1] - firstLowSurrogate;
            EncodeOne(firstBeyondUnits + (high << 10) + low, sink);
            ++at;
        } else if (unit >= 0xDC80 && unit <= 0xDCFF) {
            sink.Put(unit - firstLowSurrogate);
        } else {
            sink.Put('?');
        }
    }
    return sink.Count();
}

}  // namespace qn::dsc::osdep
