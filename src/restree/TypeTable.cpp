#include "restree/TypeTable.h"

#include <algorithm>

#include "qn/dsc/osdep/Compare.h"
#include "restree/TextList.h"

namespace zkhw {

using qn::dsc::osdep::Compare;

// The walks over bases recurse: a table holds a handful of types, a few levels deep, and none of them comes from
// the resource files.

bool TypeRecord::IsListType() const {
    return EndsWith(name.View(), u"List") ||
           std::any_of(bases.begin(), bases.end(), [](const TypeRecord* base) { return base->IsListType(); });
}

bool TypeRecord::IsA(std::u16string_view typeName) const {
    return Compare(name.View(), typeName) == 0 ||
           std::any_of(bases.begin(), bases.end(), [&](const TypeRecord* base) { return base->IsA(typeName); });
}

bool TypeTable::NameOrder::operator()(qn::dsc::TextArgument left, qn::dsc::TextArgument right) const {
    return Compare(left.View(), right.View()) < 0;
}

void TypeTable::AddTypeRelation(std::u16string_view type, std::u16string_view base) {
    auto found = records.find(type);
    if (found == records.end()) {
        found = records.emplace(String(type), std::make_unique<TypeRecord>(type)).first;
    }
    // An empty base is none, also where there is a type without a name.
    if (const TypeRecord* baseRecord = base.empty() ? nullptr : Find(base)) {
        found->second->bases.push_back(baseRecord);
    }
}

const TypeRecord* TypeTable::Find(std::u16string_view type) const {
    const auto found = records.find(type);
    return found == records.end() ? nullptr : found->second.get();
}

std::unique_ptr<TypeTable> TypeTable::Copy() const {
    auto copy = std::make_unique<TypeTable>();
    for (const auto& [name, record] : records) {
        copy->CopyRecord(*record);
    }
    return copy;
}

void TypeTable::CopyRecord(const TypeRecord& record) {
    if (record.bases.empty()) {
        AddTypeRelation(record.name.View(), {});
    }
    for (const TypeRecord* base : record.bases) {
        // A base has to be there before a type that refers to it. A record that is reached twice gets its bases
        // twice, which changes no answer.
        CopyRecord(*base);
        AddTypeRelation(record.name.View(), base->name.View());
    }
}

}  // namespace zkhw
