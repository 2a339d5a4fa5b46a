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

namespace zkhw {

using qn::dsc::String;

// The attributes that the resource language knows.
enum class AttributeName : uint8_t { Name, Names, Prototype, Type, Ordered, Replace, Next, Localize, XmlSpace, What };

class AttributeList {
  public:
    using Attribute = std::pair<String, String>;

    // Name and value by turns, then null, as libexpat gives them; null for none at all.
    void Assign(const char* const* attributes);
    void Clear();

    bool IsEmpty() const { return items.empty(); }

    bool Has(AttributeName name) const { return known[static_cast<size_t>(name)] != absent; }

    // The value of an attribute that is there.
    String Value(AttributeName name) const;

    // True if the attribute is there and its value equals `word`, or is a true word, by Compare.
    bool Is(AttributeName name, std::u16string_view word) const;
    bool IsTrue(AttributeName name) const;

    // Where the attribute `name` stands, the first of equal ones; linear. And the value there.
    using Place = uint32_t;
    static constexpr Place nowhere = 0xFFFFFFFF;
    Place Find(std::u16string_view name) const;
    String ValueAt(Place place) const;

    // Hands name and place of each to `take`, in document order; equal names all the same.
    template <typename Take>
    void ForEach(Take take) const {
        for (const Item& item : items) {
            take(NameOf(item), item.value);
        }
    }

    // All of them in the order of their names. Costs a sort.
    std::vector<Attribute> InOrder() const;

  private:
    struct Item {
        uint32_t name;  // Offsets into `text`, of NUL-terminated texts.
        uint32_t value;
    };
    static constexpr uint32_t absent = 0xFFFFFFFF;
    static constexpr size_t knownCount = 10;

    std::string_view TextAt(uint32_t offset) const { return text.data() + offset; }
    String NameOf(const Item& item) const;
    void Note(std::string_view name, uint32_t value);

    std::string text;
    std::vector<Item> items;  // In document order; equal names stand here all the same.
    std::array<uint32_t, knownCount> known = {absent, absent, absent, absent, absent,
                                              absent, absent, absent, absent, absent};  // Offsets of their values.
};

}  // namespace zkhw
