#include "restree/EntryList.h"

#include <algorithm>
#include <memory>
#include <new>

#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/TaskMemory.h"
#include "restree/OrderedKeyIndex.h"

namespace zkhw {

using qn::dsc::osdep::Compare;
using qn::dsc::osdep::TaskMemAlloc;
using qn::dsc::osdep::TaskMemFree;

struct EntryList::LongForm {
    EntryPieces pieces{true};
    std::unique_ptr<OrderedKeyIndex> index;  // Ordered lists only; null until the first search.
};

EntryList::~EntryList() {
    VisitUnordered([](NodeEntry* entry) { NodeEntry::Release(entry); });
    ReleaseContainer();
}

void EntryList::ReleaseContainer() noexcept {
    if (IsLong()) {
        delete longForm;
    } else {
        TaskMemFree(items);
    }
    items = nullptr;
    count = 0;
    capacity = 0;
    form = Form::Array;
}

void EntryList::Reset(bool newOrdered) noexcept {
    if (IsLong()) {
        for (EntryPosition position = Begin(); !position.IsEnd(); position = Next(position)) {
            At(position)->pieceNumber = 0;
        }
    }
    ReleaseContainer();
    ordered = newOrdered;
}

EntryPosition EntryList::Last() const {
    if (IsLong()) {
        return longForm->pieces.Last();
    }
    Settle();
    return count == 0 ? EntryPosition{} : EntryPosition{0, count - 1};
}

EntryPosition EntryList::NextInPieces(EntryPosition position) const {
    return longForm->pieces.Next(position);
}

NodeEntry* EntryList::AtInPieces(EntryPosition position) const {
    return longForm->pieces.At(position);
}

uint32_t EntryList::IndexOf(EntryPosition position) const {
    if (position.IsEnd()) {
        return count;
    }
    return IsLong() ? longForm->pieces.IndexOf(position) : position.slot;
}

EntryPosition EntryList::AtIndex(uint32_t index) const {
    if (IsLong()) {
        return longForm->pieces.AtIndex(index);
    }
    Settle();
    return index < count ? EntryPosition{0, index} : EntryPosition{};
}

EntryPosition EntryList::Locate(const NodeEntry* entry) const {
    if (IsLong()) {
        return longForm->pieces.Locate(entry);
    }
    Settle();
    return {0, static_cast<uint32_t>(std::find(items, items + count, entry) - items)};
}

bool EntryList::IsValid(EntryPosition position) const {
    return IsLong() ? longForm->pieces.IsValid(position) : !position.IsEnd() && position.slot < count;
}

EntryPosition EntryList::FollowingMoved(EntryPosition position, const NodeEntry* entry) const {
    Settle();
    const bool isValid = IsValid(position);
    if (isValid && At(position) == entry) {
        return Next(position);
    }
    if (IsLong()) {
        if (EntryPieces::IsMarked(entry)) {
            return Next(Locate(entry));
        }
    } else if (const EntryPosition place = Locate(entry); place.slot < count) {
        return Next(place);
    }
    return isValid ? position : EntryPosition{};
}

NodeEntry* EntryList::Find(HashedKey key) const {
    if (!IsLong()) {
        return FindInArray(key);
    }
    return ordered ? FindInIndex(key.text) : SearchSorted(key.text).entry;
}

NodeEntry* EntryList::FindInArray(HashedKey key) const {
    for (uint32_t i = 0; i < count; ++i) {
        if (key.MayEqual(items[i]->KeyHash()) && Compare(items[i]->Key(), key.text) == 0) {
            return items[i];
        }
    }
    return nullptr;
}

// The same in an array of plain keys. False, and nothing is known, if there is another one.
bool EntryList::FindPlain(HashedKey key, NodeEntry*& entry) const {
    entry = nullptr;
    for (uint32_t i = 0; i < count; ++i) {
        const uint8_t hash = items[i]->KeyHash();
        if (hash == 0) {
            return false;
        }
        if (hash == key.hash && entry == nullptr && Compare(items[i]->Key(), key.text) == 0) {
            entry = items[i];
        }
    }
    return key.hash != 0;
}

// With plain keys nothing can fail. Stable, and quick where little is out of order.
void EntryList::SortArray() const noexcept {
    for (uint32_t i = 1; i < count; ++i) {
        NodeEntry* entry = items[i];
        uint32_t slot = i;
        for (; slot != 0 && Compare(entry->Key(), items[slot - 1]->Key()) < 0; --slot) {
            items[slot] = items[slot - 1];
        }
        items[slot] = entry;
    }
    form = Form::Array;
}

NodeEntry* EntryList::FindInIndex(std::u16string_view key) const {
    if (!longForm->index) {
        longForm->index = std::make_unique<OrderedKeyIndex>(longForm->pieces);
    }
    return longForm->index->Find(key);
}

EntryList::Place EntryList::FindPlace(HashedKey key) const {
    if (count == 0) {
        return {{}, nullptr};
    }
    if (NodeEntry* entry = nullptr; !IsLong() && FindPlain(key, entry)) {
        return {EntryPosition::Unsettled(), entry};
    }
    // Copies and caches come in order.
    if (Compare(At(Last())->Key(), key.text) < 0) {
        return {{}, nullptr};
    }
    return SearchSorted(key.text);
}

EntryList::Place EntryList::SearchSorted(std::u16string_view key) const {
    if (IsLong()) {
        const EntryPieces& pieces = longForm->pieces;
        const EntryPosition position =
            pieces.PartitionPoint([&](const NodeEntry& entry) { return Compare(entry.Key(), key) < 0; });
        const bool found = !position.IsEnd() && Compare(pieces.At(position)->Key(), key) == 0;
        return {position, found ? pieces.At(position) : nullptr};
    }
    Settle();
    uint32_t low = 0;
    uint32_t high = count;
    while (low < high) {
        const uint32_t middle = low + (high - low) / 2;
        const int order = Compare(items[middle]->Key(), key);
        if (order == 0) {
            return {{0, middle}, items[middle]};
        }
        if (order < 0) {
            low = middle + 1;
        } else {
            high = middle;
        }
    }
    return {low < count ? EntryPosition{0, low} : EntryPosition{}, nullptr};
}

void EntryList::Reserve(uint32_t size) {
    if (!IsLong() && size > capacity && size <= shortLimit) {
        GrowArray(size);
    }
}

void EntryList::GrowArray(uint32_t size) {
    auto* grown = static_cast<NodeEntry**>(TaskMemAlloc(size * sizeof(NodeEntry*)));
    if (grown == nullptr) {
        throw std::bad_alloc();
    }
    if (items != nullptr) {
        std::copy(items, items + count, grown);
        TaskMemFree(static_cast<void*>(items));
    }
    items = grown;
    capacity = static_cast<uint8_t>(size);
}

void EntryList::InsertInArray(uint32_t slot, NodeEntry* entry) {
    if (count == capacity) {
        // Most nodes have fewer than eight entries. Copies know their size beforehand (Reserve).
        GrowArray(capacity + (capacity < 16 ? 4U : 8U));
    }
    std::copy_backward(items + slot, items + count, items + count + 1);
    items[slot] = entry;
    ++count;
}

void EntryList::MakeLong() {
    Settle();
    auto grown = std::make_unique<LongForm>();
    for (uint32_t i = 0; i < count; ++i) {
        grown->pieces.Insert({}, items[i]);
    }
    TaskMemFree(static_cast<void*>(items));
    longForm = grown.release();
    capacity = 0;
    form = Form::Long;
}

EntryPosition EntryList::InsertAnywhere(EntryPosition position, NodeEntry* entry) {
    if (!IsLong()) {
        const uint32_t slot = position.IsEnd() ? count : position.slot;
        if (count < shortLimit) {
            InsertInArray(slot, entry);
            NoteInsertion(position);
            return {0, slot};
        }
        MakeLong();
        if (!ordered && position == EntryPosition::Unsettled()) {
            position = SearchSorted(entry->Key()).position;
        } else {
            position = slot == count ? EntryPosition{} : longForm->pieces.AtIndex(slot);
        }
    }
    const bool atEnd = position.IsEnd();
    const EntryPosition place = longForm->pieces.Insert(position, entry);
    if (longForm->index) {
        AddToIndex(entry, atEnd);
    }
    ++count;
    return place;
}

EntryPosition EntryList::Detach(EntryPosition position) noexcept {
    if (!IsLong()) {
        std::copy(items + position.slot + 1, items + count, items + position.slot);
        --count;
        return position.slot < count ? position : EntryPosition{};
    }
    if (longForm->index) {
        RemoveFromIndex(longForm->pieces.At(position));
    }
    --count;
    const EntryPosition next = longForm->pieces.Erase(position);
    if (count == 0) {
        ReleaseContainer();
    }
    return next;
}

void EntryList::AssignKey(NodeEntry* entry, String&& key) noexcept {
    const bool isIndexed = IsLong() && longForm->index;
    if (isIndexed) {
        RemoveFromIndex(entry);
    }
    const uint8_t hash = HashKey(key.View());
    entry->SwapKey(key, hash);
    if (isIndexed && longForm->index) {
        AddToIndex(entry, false);
    }
}

void EntryList::AddToIndex(NodeEntry* entry, bool atEnd) noexcept {
    try {
        longForm->index->Add(entry, atEnd);
    } catch (...) {
        longForm->index.reset();  // It is built anew when next asked for.
    }
}

void EntryList::RemoveFromIndex(const NodeEntry* entry) noexcept {
    try {
        longForm->index->Remove(entry);
    } catch (...) {
        longForm->index.reset();
    }
}

void EntryList::NoteVariables(const NodeEntry* entry) noexcept {
    if (!IsLong()) {
        return;
    }
    if (entry == nullptr) {
        longForm->pieces.SetAllMayHoldVariables();
    } else {
        longForm->pieces.SetMayHoldVariables(entry);
    }
}

EntryPosition EntryList::SkipWithoutVariables(EntryPosition position) const {
    if (IsLong()) {
        while (!position.IsEnd() && !longForm->pieces.MayHoldVariables(position.piece)) {
            position = longForm->pieces.NextPiece(position.piece);
        }
    }
    return position;
}

void EntryList::ForgetVariables(EntryPosition position) noexcept {
    if (IsLong()) {
        longForm->pieces.SetMayHoldVariables(position.piece, false);
    }
}

void EntryList::DropIndex() noexcept {
    if (IsLong()) {
        longForm->index.reset();
    }
}

}  // namespace zkhw
