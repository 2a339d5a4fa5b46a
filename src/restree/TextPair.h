#pragma once

// Two texts in one block, behind their lengths: the head of a block that its owner has allocated with the room that it
// takes. A tree has such a block for nearly each entry and each node, where Strings would take twice the memory.

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

#include "qn/dsc/StringBase.h"

namespace zkhw {

class TextPair {
  public:
    // What `first` and `second` take in all. OutOfRange for a text that no String can hold.
    static size_t SizeFor(std::u16string_view first, std::u16string_view second) {
        if (first.size() > qn::dsc::String::npos || second.size() > qn::dsc::String::npos) [[unlikely]] {
            ThrowTooLong();
        }
        return sizeof(TextPair) + (first.size() + second.size()) * sizeof(char16_t);
    }

    // Where there is room for both.
    TextPair(std::u16string_view first, std::u16string_view second)
        : firstLength(static_cast<uint32_t>(first.size())), secondLength(static_cast<uint32_t>(second.size())) {
        CopyUnits(Units(), first);
        CopyUnits(Units() + firstLength, second);
    }
    TextPair(const TextPair&) = delete;
    TextPair& operator=(const TextPair&) = delete;

    // Good as long as the block.
    std::u16string_view First() const { return {Units(), firstLength}; }
    // Good until it is assigned.
    std::u16string_view Second() const { return {Units() + firstLength, secondLength}; }

    // Puts `text`, which may be a part of the second, in its place. False, and nothing happens, if it is longer.
    bool AssignSecond(std::u16string_view text) {
        if (text.size() > secondLength) {
            return false;
        }
        CopyUnits(Units() + firstLength, text);
        secondLength = static_cast<uint32_t>(text.size());
        return true;
    }

  private:
    [[noreturn]] static void ThrowTooLong();

    static void CopyUnits(char16_t* target, std::u16string_view units) {
        if (!units.empty()) {
            std::memmove(target, units.data(), units.size() * sizeof(char16_t));
        }
    }

    char16_t* Units() { return reinterpret_cast<char16_t*>(this + 1); }
    const char16_t* Units() const { return reinterpret_cast<const char16_t*>(this + 1); }

    uint32_t firstLength;
    uint32_t secondLength;
};

}  // namespace zkhw
