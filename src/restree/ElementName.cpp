#include "restree/ElementName.h"

#include "restree/TextList.h"
#include "restree/Utf8Text.h"

namespace zkhw {

void ElementName::Assign(std::string_view name) {
    // Not assigned at a stroke: std::string allows for a part of itself there, which took a third of the time.
    text.clear();
    if (IsAscii(name)) {
        text.append(name);
        ClassifyAscii();
    } else {
        if (IsWidenable(name)) {
            text.append(name);
        }
        ClassifyByCompare();
    }
}

qn::dsc::String ElementName::Wide() const {
    return Widen(text);
}

// Hyphens and apostrophes count in an equality of ASCII texts, so letter by letter is enough here. The last letter
// leaves one word at most.
void ElementName::ClassifyAscii() {
    isLink = false;
    isInclude = false;
    isReserves = false;
    endsInPathOrDir = false;
    endsInList = false;
    switch (text.empty() ? '\0' : LowerAscii(text.back())) {
        case 'k':
            isLink = EqualsWord(text, ":link");
            break;
        case 'e':
            isInclude = EqualsWord(text, ":include");
            break;
        case 's':
            isReserves = EqualsWord(text, "reserves");
            break;
        case 'h':
            endsInPathOrDir = EndsWithWord(text, "path");
            break;
        case 'r':
            endsInPathOrDir = EndsWithWord(text, "dir");
            break;
        case 't':
            endsInList = EndsWithWord(text, "list");
            break;
        default:
            break;
    }
}

// Other scripts have letters that equal ASCII ones but for their width, and signs that count for nothing.
void ElementName::ClassifyByCompare() {
    const qn::dsc::String wide = Wide();
    isLink = wide == u":Link";
    isInclude = wide == u":Include";
    isReserves = wide == u"Reserves";
    endsInPathOrDir = EndsWith(wide.View(), u"Path") || EndsWith(wide.View(), u"Dir");
    endsInList = EndsWith(wide.View(), u"List");
}

}  // namespace zkhw
