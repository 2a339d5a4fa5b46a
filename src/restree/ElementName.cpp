#include "restree/ElementName.h"

#include "qn/dsc/Utf8ToWide.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/TextList.h"
#include "restree/Utf8Text.h"

namespace zkhw {

using qn::dsc::osdep::Equal;

void ElementName::Assign(std::string_view name) {
    if (room.size() < name.size()) {
        room.resize(name.size());
    }
    if (qn::dsc::WidenAscii(name.data(), name.size(), room.data())) {
        length = name.size();
        meanings = MeaningOfAscii(name);
        return;
    }
    const size_t count = qn::dsc::MeasureUtf8(name.data(), name.size());
    length = count == SIZE_MAX ? 0 : count;
    qn::dsc::DecodeUtf8(name.data(), name.size(), room.data(), length);
    meanings = MeaningsByCompare();
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
    const std::u16string_view text = Text();
    uint32_t found = Equal(text, u":Link") ? Link : None;
    found |= Equal(text, u":Include") ? Include : None;
    found |= Equal(text, u"Reserves") ? Reserves : None;
    found |= EndsWith(text, u"Path") || EndsWith(text, u"Dir") ? PathOrDir : None;
    found |= EndsWith(text, u"List") ? List : None;
    return static_cast<uint8_t>(found);
}

}  // namespace zkhw
