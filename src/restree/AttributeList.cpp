#include "restree/AttributeList.h"

#include <algorithm>

#include "qn/dsc/osdep/Compare.h"
#include "restree/TextList.h"
#include "restree/Utf8Text.h"

namespace zkhw {

namespace {

struct KnownName {
    std::string_view lowerCase;
    std::u16string_view wide;
};

// In the order of AttributeName.
constexpr std::array<KnownName, 10> knownNames = {{{"name", u"name"},
                                                   {"names", u"names"},
                                                   {"prototype", u"prototype"},
                                                   {"type", u"type"},
                                                   {"ordered", u"ordered"},
                                                   {"replace", u"replace"},
                                                   {"next", u"next"},
                                                   {"localize", u"localize"},
                                                   {"xml:space", u"xml:space"},
                                                   {"what", u"what"}}};

// Equality under Compare of an ASCII name and any wide one.
bool EqualsWide(std::string_view name, std::u16string_view wide) {
    std::array<char16_t, 64> units;
    if (name.size() > units.size()) {
        return Widen(name) == wide;
    }
    std::copy(name.begin(), name.end(), units.begin());
    return qn::dsc::osdep::Equal({units.data(), name.size()}, wide);
}

}  // namespace

void AttributeList::Clear() {
    text.clear();
    items.clear();
    known.fill(absent);
}

void AttributeList::Assign(const char* const* attributes) {
    Clear();
    if (attributes == nullptr) {
        return;
    }
    for (; *attributes != nullptr; attributes += 2) {
        const std::string_view name = attributes[0];
        const std::string_view value = attributes[1];
        const Item item{static_cast<uint32_t>(text.size()), static_cast<uint32_t>(text.size() + name.size() + 1)};
        text.append(name).push_back('\0');
        text.append(value).push_back('\0');
        items.push_back(item);
        Note(name, item.value);
    }
}

// The first of equal names stays.
void AttributeList::Note(std::string_view name, uint32_t value) {
    if (IsAscii(name)) {
        for (size_t i = 0; i < knownCount; ++i) {
            if (EqualsWord(name, knownNames[i].lowerCase)) {
                known[i] = std::min(known[i], value);
                return;
            }
        }
        return;
    }
    const String wide = Widen(name);
    for (size_t i = 0; i < knownCount; ++i) {
        if (wide == knownNames[i].wide) {
            known[i] = std::min(known[i], value);
            return;
        }
    }
}

String AttributeList::Value(AttributeName name) const {
    return Widen(TextAt(known[static_cast<size_t>(name)]));
}

AttributeList::Place AttributeList::Find(std::u16string_view name) const {
    for (const Item& item : items) {
        const std::string_view candidate = TextAt(item.name);
        if (IsAscii(candidate) ? EqualsWide(candidate, name) : Widen(candidate) == name) {
            return item.value;
        }
    }
    return nowhere;
}

String AttributeList::NameOf(const Item& item) const {
    return Widen(TextAt(item.name));
}

String AttributeList::ValueAt(Place place) const {
    return Widen(TextAt(place));
}

bool AttributeList::Is(AttributeName name, std::u16string_view word) const {
    return Has(name) && Value(name) == word;
}

bool AttributeList::IsTrue(AttributeName name) const {
    return Has(name) && ParseBool(Value(name));
}

std::vector<AttributeList::Attribute> AttributeList::InOrder() const {
    std::vector<Attribute> ordered;
    ordered.reserve(items.size());
    for (const Item& item : items) {
        ordered.emplace_back(NameOf(item), Widen(TextAt(item.value)));
    }
    std::stable_sort(ordered.begin(), ordered.end(),
                     [](const Attribute& left, const Attribute& right) { return left.first < right.first; });
    const auto repeated =
        std::unique(ordered.begin(), ordered.end(),
                    [](const Attribute& left, const Attribute& right) { return left.first == right.first; });
    ordered.erase(repeated, ordered.end());
    return ordered;
}

}  // namespace zkhw
