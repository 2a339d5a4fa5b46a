#pragma once

// Order and equality of texts, blind to letter case and by the user's language: the order of every sorted container,
// the equality of every key, keyword, type name and path.
// Any thread may call; there is no state but the user's collation, which is opened once, when it is first needed.

#include <cstddef>
#include <string_view>

#include "qn/dsc/osdep/Compare_ascii.h"

namespace qn::dsc::osdep {

// Whether the text ends at `index`, or goes on there with a unit that ASCII alone can judge: nothing that follows can
// then have a part in the weight of the unit before.
inline bool CountsOrEnds(std::u16string_view text, size_t index) {
    return index >= text.size() || (text[index] < 0x80 && asciiWeights[text[index]] != 0);
}

// Compare, where the first unit doesn't decide.
int CompareFromStart(std::u16string_view a, std::u16string_view b);

// -1, 0 or 1: `a` is before, equal to or behind `b`. A total preorder over all texts, unpaired surrogates and NUL units
// included, so it can order a container; 0 does not mean that the units are the same ("Foo", "foo").
//
// 1. Without their "-" and "'", and after simple case folding, the texts are compared by the user's collation at
//    secondary strength (letters and accents count; case and width do not). ASCII has one order in every locale: tab,
//    line feed, vertical tab, form feed, return, blank, ! " # $ % & ( ) * , . / : ; ? @ [ \ ] ^ _ ` { | } ~ + < = >,
//    digits, letters; the other control characters do not count.
// 2. Texts that are equal so far differ by their "-" and "'": at the first of these that does not stand behind as many
//    other units in both texts as the same mark does, the text whose mark has fewer units before it is the greater;
//    with equally many, "'" is before "-". The text whose marks end first is the lesser.
//
// This is the order on Linux, and that of CompareStringW with NORM_IGNORECASE as far as it has been compared (see
// docs/platforms.md). On Windows that call decides everything.
//
// Where a character outside ASCII must be compared and there is no usable collation, the texts count as equal.
// Linear in the texts up to the first difference; texts of ASCII alone never touch the collation library. Texts outside
// ASCII of more than 256 units are copied: std::bad_alloc if there is no memory for that.
inline int Compare(std::u16string_view a, std::u16string_view b) {
    // The first unit decides more often than not.
    if (hasAsciiOrder && !a.empty() && !b.empty() && (a[0] | b[0]) < 0x80) {
        const uint8_t weightOfA = asciiWeights[a[0]];
        const uint8_t weightOfB = asciiWeights[b[0]];
        if (weightOfA != weightOfB && weightOfA != 0 && weightOfB != 0 && CountsOrEnds(a, 1) && CountsOrEnds(b, 1)) {
            return weightOfA < weightOfB ? -1 : 1;
        }
    }
    return CompareFromStart(a, b);
}

// Whether Compare gives 0. Costs nothing for a text and itself.
inline bool Equal(std::u16string_view a, std::u16string_view b) {
    return (a.size() == b.size() && a.data() == b.data()) || Compare(a, b) == 0;
}

}  // namespace qn::dsc::osdep
