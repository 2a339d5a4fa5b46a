#pragma once

// The attributes of an element: a map from name to value, blind to letter case, in which the first of equal names
// stays. Kept as libexpat gave them, since most are looked at once or never.

#include <array>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/TextBuilder.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::TextBuilder;

class SoughtName;

// The attributes that the resource language knows, by the length of their names.
enum class AttributeName : uint8_t { Name, Next, Type, What, Names, Ordered, Replace, Localize, Prototype, XmlSpace };

class AttributeList {
  public:
    using Attribute = std::pair<String, String>;

    // Name and value by turns, then null, as libexpat gives them; null for none at all.
    void Assign(const char* const* attributes);
    void Clear();

    bool Has(AttributeName name) const { return ((present >> static_cast<uint32_t>(name)) & 1U) != 0; }

    // The value of an attribute that is there.
    String Value(AttributeName name) const;

    // True if the attribute is there and its value equals `word`, or is a true word, by Compare.
    bool Is(AttributeName name, std::u16string_view word) const { return Has(name) && IsValue(name, word); }
    bool IsTrue(AttributeName name) const { return Has(name) && IsValueTrue(name); }

    // Where the attribute `name` stands, the first of equal ones; linear. And the value there.
    using Place = uint32_t;
    static constexpr Place nowhere = 0xFFFFFFFF;
    Place Find(const SoughtName& name) const;
    void AppendValueAt(Place place, TextBuilder& target) const;

    // Hands name and place of each to `take`, in document order; equal names all the same.
    template <typename Take>
    void ForEach(Take take) const {
        for (size_t place = 0; place < items.size(); ++place) {
            take(WideName(items[place]), static_cast<Place>(place));
        }
    }

    // All of them in the order of their names. Costs a sort.
    std::vector<Attribute> InOrder() const;

  private:
    struct Item {
        uint32_t name;  // Offsets into `text`, of NUL-terminated texts; the next item's name is at `end`.
        uint32_t value;
        uint32_t end;
        bool hasPlainName;
    };
    static constexpr size_t knownCount = 10;

    std::string_view NameOf(const Item& item) const { return {text.data() + item.name, item.value - item.name - 1}; }
    std::string_view ValueOf(const Item& item) const { return {text.data() + item.value, item.end - item.value - 1}; }
    std::string_view ValueOf(AttributeName name) const { return ValueOf(items[known[static_cast<size_t>(name)]]); }
    String WideName(const Item& item) const;
    bool IsValue(AttributeName name, std::u16string_view word) const;
    bool IsValueTrue(AttributeName name) const;
    void Note(const Item& item);

    std::string text;
    std::vector<Item> items;                      // In document order; equal names stand here all the same.
    uint32_t present = 0;                         // A bit for each AttributeName that is there.
    std::array<uint32_t, knownCount> known = {};  // Where each that is there stands in `items`.
};

}  // namespace zkhw
