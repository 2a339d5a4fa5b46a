#include "qn/dsc/osdep/Compare_ascii.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstring>

#include "qn/dsc/osdep/Compare.h"

namespace qn::dsc::osdep {

namespace {

// The place of each ASCII unit in the order; the letters of either case share one. 0: the unit does not count in the
// first step ("-", "'" and the control characters without a place).
constexpr std::array<uint8_t, 0x80> MakeWeights() {
    std::array<uint8_t, 0x80> weights{};
    uint8_t next = 1;
    for (char16_t unit : std::u16string_view(u"\t\n\v\f\r ")) {
        weights[unit] = next++;
    }
    for (char16_t unit : asciiPunctuation) {
        weights[unit] = next++;
    }
    for (char16_t unit = u'0'; unit <= u'9'; ++unit) {
        weights[unit] = next++;
    }
    for (char16_t unit = u'a'; unit <= u'z'; ++unit) {
        weights[unit] = next;
        weights[unit - u'a' + u'A'] = next++;
    }
    return weights;
}

constexpr std::array<uint8_t, 0x80> weights = MakeWeights();

constexpr bool IsAscii(char16_t unit) {
    return unit < 0x80;
}

// Whether the first unit from `index` on that counts in the first step is outside ASCII: it may then be a mark that
// belongs to the unit before it (a combining accent), and some languages order the two as a letter of its own.
bool GoesOnOutsideAscii(std::u16string_view text, size_t index) {
    while (index < text.size() && IsAscii(text[index])) {
        if (weights[text[index]] != 0) {
            return false;
        }
        ++index;
    }
    return index < text.size();
}

// The answer for two ASCII units of different weights at `atA` and `atB`, with nothing that counts before them.
int Decide(std::u16string_view a, size_t atA, std::u16string_view b, size_t atB) {
    if (GoesOnOutsideAscii(a, atA + 1) || GoesOnOutsideAscii(b, atB + 1)) {
        return undecidedByAscii;
    }
    return weights[a[atA]] < weights[b[atB]] ? -1 : 1;
}

// The next unit from `index` on that counts in the first step.
size_t SkipUncounted(std::u16string_view text, size_t index) {
    while (index < text.size() && IsAscii(text[index]) && weights[text[index]] == 0) {
        ++index;
    }
    return index;
}

// CompareAscii for texts whose first units differ, at least one of them by a unit that does not count in the first
// step.
int CompareSkipping(std::u16string_view a, std::u16string_view b) {
    size_t atA = 0;
    size_t atB = 0;
    for (;; ++atA, ++atB) {
        atA = SkipUncounted(a, atA);
        atB = SkipUncounted(b, atB);
        const bool endOfA = atA == a.size();
        const bool endOfB = atB == b.size();
        if ((!endOfA && !IsAscii(a[atA])) || (!endOfB && !IsAscii(b[atB]))) {
            return undecidedByAscii;
        }
        if (endOfA || endOfB) {
            return endOfA && endOfB ? CompareMarks(a, b) : (endOfA ? -1 : 1);
        }
        if (weights[a[atA]] != weights[b[atB]]) {
            return Decide(a, atA, b, atB);
        }
    }
}

// The next "-" or "'" from `index` on, or the size.
size_t FindMark(std::u16string_view text, size_t index) {
    while (index < text.size() && text[index] != u'-' && text[index] != u'\'') {
        ++index;
    }
    return index;
}

// Whether the four units at `a` and at `b` are the same and all ASCII.
bool SameFourAscii(const char16_t* a, const char16_t* b) {
    uint64_t unitsOfA;
    uint64_t unitsOfB;
    std::memcpy(&unitsOfA, a, sizeof(unitsOfA));
    std::memcpy(&unitsOfB, b, sizeof(unitsOfB));
    return unitsOfA == unitsOfB && (unitsOfA & 0xFF80FF80FF80FF80u) == 0;
}

}  // namespace

int CompareAscii(std::u16string_view a, std::u16string_view b) {
    // Units that are the same, or that differ in letter case only, have no say in either step: whatever follows is
    // compared as if it stood at the front.
    const size_t common = std::min(a.size(), b.size());
    size_t at = 0;
    while (at < common) {
        const char16_t unitOfA = a[at];
        const char16_t unitOfB = b[at];
        if (!IsAscii(unitOfA) || !IsAscii(unitOfB)) {
            return undecidedByAscii;
        }
        const uint8_t weightOfA = weights[unitOfA];
        const uint8_t weightOfB = weights[unitOfB];
        if (weightOfA != weightOfB) {
            if (weightOfA == 0 || weightOfB == 0) {
                return CompareSkipping(a.substr(at), b.substr(at));
            }
            return Decide(a, at, b, at);
        }
        if (weightOfA == 0 && unitOfA != unitOfB) {
            return CompareSkipping(a.substr(at), b.substr(at));
        }
        ++at;
        while (at + 4 <= common && SameFourAscii(a.data() + at, b.data() + at)) {
            at += 4;
        }
    }
    return a.size() == b.size() ? 0 : CompareSkipping(a.substr(at), b.substr(at));
}

int CompareMarks(std::u16string_view a, std::u16string_view b) {
    size_t atA = 0;
    size_t atB = 0;
    // As many marks have been passed in `a` as in `b`, so their positions compare as the numbers of other units do.
    for (;; ++atA, ++atB) {
        atA = FindMark(a, atA);
        atB = FindMark(b, atB);
        const bool endOfA = atA == a.size();
        const bool endOfB = atB == b.size();
        if (endOfA || endOfB) {
            return endOfA && endOfB ? 0 : (endOfA ? -1 : 1);
        }
        if (atA != atB) {
            return atA < atB ? 1 : -1;
        }
        if (a[atA] != b[atB]) {
            return a[atA] == u'\'' ? -1 : 1;
        }
    }
}

int Compare(std::u16string_view a, std::u16string_view b) {
    const int decided = CompareAscii(a, b);
    return decided == undecidedByAscii ? CompareCollated(a, b) : decided;
}

}  // namespace qn::dsc::osdep
