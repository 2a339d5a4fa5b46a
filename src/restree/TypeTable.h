#pragma once

// How types are related: a table from type name to the types that it is based on. Names are compared with Compare.
// A table owns its records; records point at each other within one table only.

#include <memory>
#include <string_view>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "restree/HashedKey.h"

namespace zkhw {

using qn::dsc::String;

struct TypeRecord {
    explicit TypeRecord(HashedKey name) : name(name.text), nameHash(name.hash) {}

    // True if the name ends in "List" in any letter case, or if one of the bases is a list type.
    // Children of a list type keep their order unless they say otherwise.
    bool IsListType() const;

    // True if this is `typeName` or has it among its bases, at any distance.
    bool IsA(std::u16string_view typeName) const;

    String name;
    uint8_t nameHash;                      // HashKey of the name.
    std::vector<const TypeRecord*> bases;  // In the order in which they were added; may repeat.
};

class TypeTable {
  public:
    TypeTable() = default;
    TypeTable(const TypeTable&) = delete;
    TypeTable& operator=(const TypeTable&) = delete;

    // Makes sure that there is a record for `type` and adds `base` to its bases if `base` is a type of the table.
    // An unknown or empty `base` is dropped. Records that were found before may be gone.
    void AddTypeRelation(std::u16string_view type, std::u16string_view base);

    // The record of `type`, or null. Lives until the next AddTypeRelation on this table, or its end. Linear: a table
    // holds a handful of types.
    const TypeRecord* Find(HashedKey type) const;

    // A table of its own with the same relations. A tree has a copy for each of its targets, and hardly any is ever
    // changed: the copies of a table share their records until then, so all but the first cost no more than a pointer.
    std::unique_ptr<TypeTable> Copy() const;

  private:
    using Records = std::vector<std::unique_ptr<TypeRecord>>;

    static TypeRecord* FindIn(const Records& records, HashedKey type);

    void CopyRecord(const TypeRecord& record);
    void StopSharing();

    // Null: no records. Not to be changed while others hold it.
    std::shared_ptr<Records> records;
    // What copies are made of; null before the first copy and after a change.
    mutable std::shared_ptr<Records> recordsOfCopies;
};

}  // namespace zkhw
