#include "restree/AttributeList.h"

#include <algorithm>
#include <cstring>

#include "restree/SoughtName.h"
#include "restree/TextList.h"
#include "restree/Utf8Text.h"

namespace zkhw {

namespace {

struct KnownName {
    std::string_view lowerCase;
    std::u16string_view wide;
};

// In the order of AttributeName, so that those of one length stand together.
constexpr std::array<KnownName, 10> knownNames = {{{"name", u"name"},
                                                   {"next", u"next"},
                                                   {"type", u"type"},
                                                   {"what", u"what"},
                                                   {"names", u"names"},
                                                   {"ordered", u"ordered"},
                                                   {"replace", u"replace"},
                                                   {"localize", u"localize"},
                                                   {"prototype", u"prototype"},
                                                   {"xml:space", u"xml:space"}}};

constexpr size_t longestKnownName = knownNames.back().lowerCase.size();

// By the length of a name, the first known name that is as long or longer.
constexpr auto firstOfLength = [] {
    std::array<size_t, longestKnownName + 2> first{};
    for (size_t length = 0; length < first.size(); ++length) {
        while (first[length] < knownNames.size() && knownNames[first[length]].lowerCase.size() < length) {
            ++first[length];
        }
    }
    return first;
}();

// Which of them is equal to an attribute's name; their number if none is.
size_t FindKnownName(std::string_view name, bool isPlain) {
    if (isPlain) {
        const size_t length = std::min(name.size(), longestKnownName + 1);
        for (size_t i = firstOfLength[length]; i < knownNames.size() && knownNames[i].lowerCase.size() == length; ++i) {
            // Nearly all are spelled so.
            if (name == knownNames[i].lowerCase || EqualsWord(name, knownNames[i].lowerCase)) {
                return i;
            }
        }
        return knownNames.size();
    }
    const String wide = Widen(name);
    size_t i = 0;
    while (i < knownNames.size() && !(wide == knownNames[i].wide)) {
        ++i;
    }
    return i;
}

}  // namespace

void AttributeList::Clear() {
    text.clear();
    items.clear();
    present = 0;
}

void AttributeList::Assign(const char* const* attributes) {
    Clear();
    if (attributes == nullptr) {
        return;
    }
    for (; *attributes != nullptr; attributes += 2) {
        Item item;
        item.name = static_cast<uint32_t>(text.size());
        // With the NULs behind them.
        text.append(attributes[0], std::strlen(attributes[0]) + 1);
        item.value = static_cast<uint32_t>(text.size());
        text.append(attributes[1], std::strlen(attributes[1]) + 1);
        item.end = static_cast<uint32_t>(text.size());
        // There are no control characters in a name.
        item.hasPlainName = IsAscii(NameOf(item));
        items.push_back(item);
        Note(item);
    }
}

// The first of equal names stays.
void AttributeList::Note(const Item& item) {
    const size_t name = FindKnownName(NameOf(item), item.hasPlainName);
    if (name < knownCount && ((present >> name) & 1U) == 0) {
        present |= 1U << name;
        known[name] = static_cast<uint32_t>(items.size() - 1);
    }
}

String AttributeList::Value(AttributeName name) const {
    return Widen(ValueOf(name));
}

AttributeList::Place AttributeList::Find(const SoughtName& name) const {
    for (size_t place = 0; place < items.size(); ++place) {
        if (name.Equals(NameOf(items[place]), items[place].hasPlainName)) {
            return static_cast<Place>(place);
        }
    }
    return nowhere;
}

void AttributeList::AppendValueAt(Place place, TextBuilder& target) const {
    const std::string_view value = ValueOf(items[place]);
    if (IsAscii(value)) {
        target.AppendAscii(value);
    } else {
        target.Append(Widen(value).View());
    }
}

String AttributeList::WideName(const Item& item) const {
    return Widen(NameOf(item));
}

bool AttributeList::IsValue(AttributeName name, std::u16string_view word) const {
    const std::string_view value = ValueOf(name);
    return SoughtName(word).Equals(value, IsPlain(value));
}

bool AttributeList::IsValueTrue(AttributeName name) const {
    const std::string_view value = ValueOf(name);
    return EqualsWord(value, "true") || ParseBool(Widen(value));
}

std::vector<AttributeList::Attribute> AttributeList::InOrder() const {
    std::vector<Attribute> ordered;
    ordered.reserve(items.size());
    for (const Item& item : items) {
        ordered.emplace_back(WideName(item), Widen(ValueOf(item)));
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
