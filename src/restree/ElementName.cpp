#include "restree/ElementName.h"

#include "restree/TextList.h"
#include "restree/Utf8Text.h"

namespace zkhw {

void ElementName::Assign(std::string_view name) {
    WidenInto(name, text);
    // Only a text of ASCII has a unit for each byte.
    const bool isAscii = text.Length() == name.size();
    meanings = isAscii ? uint8_t{MeaningOfAscii(name)} : MeaningsByCompare();
}

// Hyphens and apostrophes count in an equality of ASCII texts, so letter by letter is enough here. The last letter
// leaves one word at most.
ElementName::Meaning ElementName::MeaningOfAscii(std::string_view name) {
    switch (name.empty() ? '\0' : LowerAscii(name.back())) {
        case 'k':
            return EqualsWord(name, ":link") ? Link : None;
        case 'e':
            return EqualsWord(name, ":include") ? Include : None;
        case 's':
            return EqualsWord(name, "reserves") ? Reserves : None;
        case 'h':
            return EndsWithWord(name, "path") ? PathOrDir : None;
        case 'r':
            return EndsWithWord(name, "dir") ? PathOrDir : None;
        case 't':
            return EndsWithWord(name, "list") ? List : None;
        default:
            return None;
    }
}

// Other scripts have letters that equal ASCII ones but for their width, and signs that count for nothing.
uint8_t ElementName::MeaningsByCompare() const {
    uint32_t found = text == u":Link" ? Link : None;
    found |= text == u":Include" ? Include : None;
    found |= text == u"Reserves" ? Reserves : None;
    found |= EndsWith(text.View(), u"Path") || EndsWith(text.View(), u"Dir") ? PathOrDir : None;
    found |= EndsWith(text.View(), u"List") ? List : None;
    return static_cast<uint8_t>(found);
}

}  // namespace zkhw
