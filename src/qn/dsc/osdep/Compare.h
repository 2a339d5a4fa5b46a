#pragma once

// Order and equality of texts, blind to letter case and by the user's language: the order of every sorted container,
// the equality of every key, keyword, type name and path.
// Any thread may call; there is no state but the user's collation, which is opened once, when it is first needed.

#include <string_view>

namespace qn::dsc::osdep {

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
// Where a character outside ASCII must be compared and there is no usable collation, the texts count as equal.
// Linear in the texts up to the first difference; texts of ASCII alone never touch the collation library. Texts outside
// ASCII of more than 256 units are copied: std::bad_alloc if there is no memory for that.
int Compare(std::u16string_view a, std::u16string_view b);

// Whether Compare gives 0. Costs nothing for a text and itself.
inline bool Equal(std::u16string_view a, std::u16string_view b) {
    return (a.size() == b.size() && a.data() == b.data()) || Compare(a, b) == 0;
}

}  // namespace qn::dsc::osdep
