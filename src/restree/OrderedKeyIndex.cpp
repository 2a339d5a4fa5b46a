#include "restree/OrderedKeyIndex.h"

#include <algorithm>
#include <utility>

#include "qn/dsc/osdep/Compare.h"

namespace zkhw {

using qn::dsc::osdep::asciiWeights;
using qn::dsc::osdep::Compare;

namespace {

constexpr size_t leastSlots = 128;

// False if the key isn't ASCII. Else keys that are equal under Compare get the same hash: units without a weight have
// no part in it.
bool HashAscii(std::u16string_view key, uint32_t& hash) {
    uint32_t mixed = 0;
    uint32_t seen = 0;
    for (const char16_t unit : key) {
        seen |= unit;
        const uint32_t weight = asciiWeights[unit & 0x7FU];
        mixed = weight == 0 ? mixed : (mixed ^ weight) * 0x01000193U;
    }
    hash = mixed ^ (mixed >> 15);
    return seen < 0x80;
}

}  // namespace

OrderedKeyIndex::OrderedKeyIndex(const EntryPieces& list) : list(list), slots(leastSlots) {
    for (EntryPosition position = list.Begin(); !position.IsEnd(); position = list.Next(position)) {
        AddToSlots(list.At(position), true);
    }
}

NodeEntry* OrderedKeyIndex::Find(std::u16string_view key) {
    uint32_t hash = 0;
    if (!hasForeignKeys && HashAscii(key, hash)) {
        return slots[FindSlot(hash, key)].entry;
    }
    RequireSorted();
    const EntryPosition position = LowerBound(key);
    if (position.IsEnd()) {
        return nullptr;
    }
    NodeEntry* entry = sorted->At(position);
    return Compare(entry->Key(), key) == 0 ? entry : nullptr;
}

void OrderedKeyIndex::Add(NodeEntry* entry, bool atEnd) {
    if (sorted.has_value()) {
        AddSorted(entry, atEnd);
    }
    AddToSlots(entry, atEnd);
}

void OrderedKeyIndex::Remove(const NodeEntry* entry) {
    // The table first: it may have to ask for the entry that follows.
    RemoveFromSlots(entry);
    if (sorted.has_value()) {
        sorted->Erase(PlaceOf(entry));
    }
}

bool OrderedKeyIndex::StandsBefore(const NodeEntry& left, const NodeEntry& right) const {
    const EntryPosition leftPosition = list.Locate(&left);
    const EntryPosition rightPosition = list.Locate(&right);
    return leftPosition.piece != rightPosition.piece ? leftPosition.piece < rightPosition.piece
                                                     : leftPosition.slot < rightPosition.slot;
}

// --- The table of first entries ---

// The slot of the key, or the empty one where it belongs.
size_t OrderedKeyIndex::FindSlot(uint32_t hash, std::u16string_view key) const {
    size_t slot = HomeOf(hash);
    while (slots[slot].entry != nullptr && (slots[slot].hash != hash || Compare(slots[slot].entry->Key(), key) != 0)) {
        slot = (slot + 1) & (slots.size() - 1);
    }
    return slot;
}

void OrderedKeyIndex::AddToSlots(NodeEntry* entry, bool atEnd) {
    const std::u16string_view key = entry->Key();
    uint32_t hash = 0;
    if (hasForeignKeys || !HashAscii(key, hash)) {
        hasForeignKeys = true;
        slots = {};
        return;
    }
    Slot& slot = slots[FindSlot(hash, key)];
    if (slot.entry == nullptr) {
        slot = {entry, hash, false};
        ++slotsTaken;
        if (4 * slotsTaken > 3 * slots.size()) {
            Enlarge();
        }
        return;
    }
    slot.isRepeated = true;
    if (!atEnd && StandsBefore(*entry, *slot.entry)) {
        slot.entry = entry;
    }
}

void OrderedKeyIndex::Enlarge() {
    std::vector<Slot> old(2 * slots.size());
    old.swap(slots);
    for (const Slot& taken : old) {
        if (taken.entry != nullptr) {
            size_t slot = HomeOf(taken.hash);
            while (slots[slot].entry != nullptr) {
                slot = (slot + 1) & (slots.size() - 1);
            }
            slots[slot] = taken;
        }
    }
}

void OrderedKeyIndex::RemoveFromSlots(const NodeEntry* entry) {
    uint32_t hash = 0;
    if (hasForeignKeys || !HashAscii(entry->Key(), hash)) {
        return;
    }
    const size_t slot = FindSlot(hash, entry->Key());
    if (slots[slot].entry != entry) {
        return;
    }
    if (slots[slot].isRepeated) {
        RequireSorted();
        const EntryPosition next = sorted->Next(PlaceOf(entry));
        if (!next.IsEnd() && Compare(sorted->At(next)->Key(), entry->Key()) == 0) {
            slots[slot].entry = sorted->At(next);
            return;
        }
    }
    EraseSlot(slot);
}

// Moves up what a search would no longer get to past the gap.
void OrderedKeyIndex::EraseSlot(size_t gap) {
    const size_t mask = slots.size() - 1;
    for (size_t slot = (gap + 1) & mask; slots[slot].entry != nullptr; slot = (slot + 1) & mask) {
        const size_t distance = (slot - HomeOf(slots[slot].hash)) & mask;
        if (distance >= ((slot - gap) & mask)) {
            slots[gap] = slots[slot];
            gap = slot;
        }
    }
    slots[gap] = {};
    --slotsTaken;
}

// --- All entries, sorted ---

void OrderedKeyIndex::RequireSorted() {
    if (sorted.has_value()) {
        return;
    }
    std::vector<NodeEntry*> entries;
    for (EntryPosition position = list.Begin(); !position.IsEnd(); position = list.Next(position)) {
        entries.push_back(list.At(position));
    }
    std::stable_sort(entries.begin(), entries.end(), [](const NodeEntry* left, const NodeEntry* right) {
        return Compare(left->Key(), right->Key()) < 0;
    });
    sorted.emplace(false);
    try {
        for (NodeEntry* entry : entries) {
            sorted->Insert({}, entry);
        }
    } catch (...) {
        sorted.reset();
        throw;
    }
}

EntryPosition OrderedKeyIndex::LowerBound(std::u16string_view key) const {
    return sorted->PartitionPoint([&](const NodeEntry& entry) { return Compare(entry.Key(), key) < 0; });
}

void OrderedKeyIndex::AddSorted(NodeEntry* entry, bool atEnd) {
    const std::u16string_view key = entry->Key();
    sorted->Insert(sorted->PartitionPoint([&](const NodeEntry& other) {
        const int order = Compare(other.Key(), key);
        return order < 0 || (order == 0 && (atEnd || StandsBefore(other, *entry)));
    }),
                   entry);
}

EntryPosition OrderedKeyIndex::PlaceOf(const NodeEntry* entry) const {
    const std::u16string_view key = entry->Key();
    return sorted->PartitionPoint([&](const NodeEntry& other) {
        const int order = Compare(other.Key(), key);
        return order < 0 || (order == 0 && &other != entry && StandsBefore(other, *entry));
    });
}

}  // namespace zkhw
