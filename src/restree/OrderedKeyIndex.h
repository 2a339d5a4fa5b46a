#pragma once

// Finds the first entry of a key in a long ordered list without a walk.
//
// As long as all keys are ASCII a hash table of the first entries answers: reading a file asks once for each child
// whether its name is there, and hardly ever it is. What the table can't know, which entry follows the first one of its
// key, and keys that only the user's collation can judge, is left to a second index, all entries sorted by key and
// then by their place in the list. It is built when it is first needed and kept from then on. With it alone a list of
// 400 children cost 2,400 instructions a child, with the table some 300.

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "restree/EntryPieces.h"

namespace zkhw {

class OrderedKeyIndex {
  public:
    // Indexes the whole of `list`, which must outlive the index. Throws bad_alloc.
    explicit OrderedKeyIndex(const EntryPieces& list);

    // The first entry of this key, or null. Throws bad_alloc when the second index is needed and can't be built.
    NodeEntry* Find(std::u16string_view key);

    // `entry` has just been put into the list. `atEnd`: nothing stands behind it there. Throws bad_alloc; then the
    // index is fit only for being released. So with Remove.
    void Add(NodeEntry* entry, bool atEnd);

    // `entry` is about to leave the list, or to change its key.
    void Remove(const NodeEntry* entry);

  private:
    // The first entry of a key.
    struct Slot {
        NodeEntry* entry = nullptr;
        uint32_t hash = 0;
        bool isRepeated = false;  // There are, or have been, further entries of the key.
    };

    bool StandsBefore(const NodeEntry& left, const NodeEntry& right) const;

    size_t HomeOf(uint32_t hash) const { return hash & (slots.size() - 1); }
    size_t FindSlot(uint32_t hash, std::u16string_view key) const;
    void AddToSlots(NodeEntry* entry, bool atEnd);
    void RemoveFromSlots(const NodeEntry* entry);
    void EraseSlot(size_t slot);
    void Enlarge();

    void RequireSorted();
    EntryPosition LowerBound(std::u16string_view key) const;
    void AddSorted(NodeEntry* entry, bool atEnd);
    EntryPosition PlaceOf(const NodeEntry* entry) const;

    const EntryPieces& list;
    std::vector<Slot> slots;  // A power of two, at most three quarters taken; empty from the first foreign key on.
    size_t slotsTaken = 0;
    bool hasForeignKeys = false;  // Keys that aren't ASCII.
    std::optional<EntryPieces> sorted;
};

}  // namespace zkhw
