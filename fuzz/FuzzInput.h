#pragma once

// What the fuzz targets share: the input taken apart into numbers and texts, and the end of a run that broke a law.

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>

namespace fuzz {

// Ends the process, and with it the input, as a finding if `holds` is false.
inline void Require(bool holds, const char* law) {
    if (!holds) {
        std::fprintf(stderr, "broken law: %s\n", law);
        std::abort();
    }
}

// Reads the bytes of one input from the front. What is asked for behind the end is 0 or empty.
class Input {
  public:
    Input(const uint8_t* data, size_t size) : cursor(data), end(data + size) {}

    bool IsEmpty() const { return cursor == end; }
    size_t Left() const { return static_cast<size_t>(end - cursor); }

    uint8_t TakeByte() { return IsEmpty() ? uint8_t{0} : *cursor++; }
    uint32_t TakeNumber() {
        uint32_t value = 0;
        for (int i = 0; i < 4; ++i) {
            value = value << 8 | TakeByte();
        }
        return value;
    }

    // The bytes up to the next line feed, which is dropped, or to the end of the input.
    std::string TakeLine() {
        const uint8_t* const lineEnd = std::find(cursor, end, uint8_t{'\n'});
        std::string line(cursor, lineEnd);
        cursor = lineEnd == end ? end : lineEnd + 1;
        return line;
    }

    // The same as wide text. A byte is the unit of that value, so that a text reads well in a seed; one from 0xF8 on
    // announces a unit of two bytes, so that every unit can occur.
    std::u16string TakeText() {
        const std::string line = TakeLine();
        std::u16string text;
        for (size_t i = 0; i < line.size(); ++i) {
            const auto byte = static_cast<uint8_t>(line[i]);
            if (byte >= 0xF8 && i + 2 < line.size()) {
                const auto high = static_cast<uint8_t>(line[i + 1]);
                const auto low = static_cast<uint8_t>(line[i + 2]);
                text.push_back(static_cast<char16_t>(high << 8 | low));
                i += 2;
            } else {
                text.push_back(byte);
            }
        }
        return text;
    }

    std::string TakeRest() {
        std::string rest(reinterpret_cast<const char*>(cursor), Left());
        cursor = end;
        return rest;
    }

  private:
    const uint8_t* cursor;
    const uint8_t* end;
};

}  // namespace fuzz
