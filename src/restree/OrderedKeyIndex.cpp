#include "restree/OrderedKeyIndex.h"

#include <algorithm>
#include <vector>

#include "qn/dsc/osdep/Compare.h"

namespace zkhw {

using qn::dsc::osdep::Compare;

OrderedKeyIndex::OrderedKeyIndex(const EntryPieces& list) : list(list) {
    std::vector<NodeEntry*> entries;
    for (EntryPosition position = list.Begin(); !position.IsEnd(); position = list.Next(position)) {
        entries.push_back(list.At(position));
    }
    std::stable_sort(entries.begin(), entries.end(), [](const NodeEntry* left, const NodeEntry* right) {
        return Compare(left->Key().View(), right->Key().View()) < 0;
    });
    for (NodeEntry* entry : entries) {
        sorted.Insert({}, entry);
    }
}

NodeEntry* OrderedKeyIndex::Find(std::u16string_view key) const {
    const EntryPosition position =
        sorted.PartitionPoint([&](const NodeEntry& entry) { return Compare(entry.Key().View(), key) < 0; });
    if (position.IsEnd()) {
        return nullptr;
    }
    NodeEntry* entry = sorted.At(position);
    return Compare(entry->Key().View(), key) == 0 ? entry : nullptr;
}

bool OrderedKeyIndex::StandsBefore(const NodeEntry& left, const NodeEntry& right) const {
    const EntryPosition leftPosition = list.Locate(&left);
    const EntryPosition rightPosition = list.Locate(&right);
    return leftPosition.piece != rightPosition.piece ? leftPosition.piece < rightPosition.piece
                                                     : leftPosition.slot < rightPosition.slot;
}

void OrderedKeyIndex::Add(NodeEntry* entry, bool atEnd) {
    const std::u16string_view key = entry->Key().View();
    sorted.Insert(sorted.PartitionPoint([&](const NodeEntry& other) {
        const int order = Compare(other.Key().View(), key);
        return order < 0 || (order == 0 && (atEnd || StandsBefore(other, *entry)));
    }),
                  entry);
}

void OrderedKeyIndex::Remove(const NodeEntry* entry) noexcept {
    const std::u16string_view key = entry->Key().View();
    sorted.Erase(sorted.PartitionPoint([&](const NodeEntry& other) {
        const int order = Compare(other.Key().View(), key);
        return order < 0 || (order == 0 && &other != entry && StandsBefore(other, *entry));
    }));
}

}  // namespace zkhw
