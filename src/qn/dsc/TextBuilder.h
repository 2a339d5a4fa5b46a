#pragma once

// A text that is put together piece by piece and then becomes a String of its exact size. Up to 256 units no memory is
// asked for on the way.

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string_view>
#include <utility>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/Utf8ToWide.h"

namespace qn::dsc {

class TextBuilder {
  public:
    TextBuilder() = default;
    TextBuilder(const TextBuilder&) = delete;
    TextBuilder& operator=(const TextBuilder&) = delete;

    // `part` is no part of this text. Throws bad_alloc; then the text is as it was. Linear in all that is appended.
    void Append(std::u16string_view part) {
        if (part.size() > capacity - size) [[unlikely]] {
            Grow(part.size());
        }
        if (!part.empty()) {
            std::memcpy(units + size, part.data(), part.size() * sizeof(char16_t));
            size += part.size();
        }
    }
    void Append(char16_t unit) {
        if (size == capacity) [[unlikely]] {
            Grow(1);
        }
        units[size++] = unit;
    }

    // Appends text of ASCII, one unit for each byte.
    void AppendAscii(std::string_view part) {
        if (part.size() > capacity - size) [[unlikely]] {
            Grow(part.size());
        }
        WidenAscii(part.data(), part.size(), units + size);
        size += part.size();
    }

    // Appends what `bytes` of UTF-8 stand for, by the rules of Utf8ToWide.h. False, and the text is as it was, if they
    // are not such text.
    bool AppendUtf8(std::string_view bytes) {
        if (bytes.size() > capacity - size) [[unlikely]] {
            Grow(bytes.size());
        }
        size_t count = bytes.size();
        if (!WidenAscii(bytes.data(), bytes.size(), units + size)) [[unlikely]] {
            count = MeasureUtf8(bytes.data(), bytes.size());
            if (count == SIZE_MAX) {
                return false;
            }
            DecodeUtf8(bytes.data(), bytes.size(), units + size, count);
        }
        size += count;
        return true;
    }

    bool IsEmpty() const { return size == 0; }

    // Good until the next change.
    std::u16string_view View() const { return {units, size}; }

    // Throws bad_alloc, and OutOfRange for what no String can hold.
    String Text() const { return String(View()); }

  private:
    void Grow(size_t count) {
        const size_t newCapacity = 2 * (size + count);
        auto room = std::make_unique_for_overwrite<char16_t[]>(newCapacity);
        std::memcpy(room.get(), units, size * sizeof(char16_t));
        longRoom = std::move(room);
        units = longRoom.get();
        capacity = newCapacity;
    }

    std::array<char16_t, 256> shortRoom;  // Not filled beforehand: that would cost more than most texts do.
    std::unique_ptr<char16_t[]> longRoom;
    char16_t* units = shortRoom.data();
    size_t size = 0;
    size_t capacity = shortRoom.size();
};

}  // namespace qn::dsc
