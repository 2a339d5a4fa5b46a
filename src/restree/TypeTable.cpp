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

TypeRecord* TypeTable::FindIn(const Records& records, HashedKey type) {
    for (const std::unique_ptr<TypeRecord>& record : records) {
        if (type.MayEqual(record->nameHash) && Compare(record->name.View(), type.text) == 0) {
            return record.get();
        }
    }
    return nullptr;
}

void TypeTable::AddTypeRelation(std::u16string_view type, std::u16string_view base) {
    StopSharing();
    TypeRecord* found = FindIn(*records, type);
    if (found == nullptr) {
        records->push_back(std::make_unique<TypeRecord>(type));
        found = records->back().get();
    }
    // An empty base is none, also where there is a type without a name.
    if (const TypeRecord* baseRecord = base.empty() ? nullptr : Find(base)) {
        found->bases.push_back(baseRecord);
    }
}

const TypeRecord* TypeTable::Find(HashedKey type) const {
    return records == nullptr ? nullptr : FindIn(*records, type);
}

std::unique_ptr<TypeTable> TypeTable::Copy() const {
    auto copy = std::make_unique<TypeTable>();
    if (records != nullptr && recordsOfCopies == nullptr) {
        TypeTable first;
        for (const std::unique_ptr<TypeRecord>& record : *records) {
            first.CopyRecord(*record);
        }
        recordsOfCopies = std::move(first.records);
    }
    copy->records = recordsOfCopies;
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

// Gives the table records that nobody else holds, alike in every base.
void TypeTable::StopSharing() {
    recordsOfCopies = nullptr;
    if (records != nullptr && records.use_count() == 1) {
        return;
    }
    auto own = std::make_shared<Records>();
    if (records != nullptr) {
        for (const std::unique_ptr<TypeRecord>& record : *records) {
            own->push_back(std::make_unique<TypeRecord>(record->name.View()));
        }
        for (size_t i = 0; i < own->size(); ++i) {
            for (const TypeRecord* base : (*records)[i]->bases) {
                (*own)[i]->bases.push_back(FindIn(*own, base->name.View()));
            }
        }
    }
    records = std::move(own);
}

}  // namespace zkhw
