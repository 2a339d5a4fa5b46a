#pragma once

// How types are related: a map from type name to the types that it is based on. Names are compared with Compare.
// A table owns its records; records point at each other within one table only.

#include <map>
#include <memory>
#include <string_view>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/TextArgument.h"

namespace zkhw {

using qn::dsc::String;

struct TypeRecord {
    explicit TypeRecord(std::u16string_view name) : name(name) {}

    // True if the name ends in "List" in any letter case, or if one of the bases is a list type.
    // Children of a list type keep their order unless they say otherwise.
    bool IsListType() const;

    // True if this is `typeName` or has it among its bases, at any distance.
    bool IsA(std::u16string_view typeName) const;

    String name;
    std::vector<const TypeRecord*> bases;  // In the order in which they were added; may repeat.
};

class TypeTable {
  public:
    TypeTable() = default;
    TypeTable(const TypeTable&) = delete;
    TypeTable& operator=(const TypeTable&) = delete;

    // Makes sure that there is a record for `type` and adds `base` to its bases if `base` is a type of the table.
    // An unknown or empty `base` is dropped.
    void AddTypeRelation(std::u16string_view type, std::u16string_view base);

    // The record of `type`, or null.
    const TypeRecord* Find(std::u16string_view type) const;

    // A table of its own with the same relations.
    std::unique_ptr<TypeTable> Copy() const;

  private:
    struct NameOrder {
        using is_transparent = void;
        bool operator()(qn::dsc::TextArgument left, qn::dsc::TextArgument right) const;
    };

    void CopyRecord(const TypeRecord& record);

    std::map<String, std::unique_ptr<TypeRecord>, NameOrder> records;
};

}  // namespace zkhw
