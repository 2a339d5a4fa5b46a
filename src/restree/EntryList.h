#pragma once

// The one collection of a node's entries, in either form: in order of insertion, equal keys allowed, or sorted by
// key with each key once. Keys are compared with Compare, so blind to letter case.
//
// A short list is one array, searched from the front by the hashes of its keys. A sorted one of plain keys
// (HashedKey.h) takes new entries at its end and is put into order when its order is first asked for: most nodes of a
// tree are read, filled and looked into, and never walked.
//
// A long list stands in pieces; if it is ordered, an index of its keys is built at the first
// search and kept from then on, so that no search is linear in a long list.
//
// The list owns its entries. Positions are invalidated by any insertion or removal; entries stay where they are.

#include <cstdint>
#include <string_view>

#include "restree/EntryPieces.h"
#include "restree/HashedKey.h"
#include "restree/NodeEntry.h"

namespace zkhw {

class EntryList {
  public:
    explicit EntryList(bool ordered) noexcept : ordered(ordered) {}
    ~EntryList();  // Releases texts and containers. Child entries must be gone.
    EntryList(const EntryList&) = delete;
    EntryList& operator=(const EntryList&) = delete;

    bool IsOrdered() const { return ordered; }

    // Drops the container and makes an empty one of the given form. Entries that are left are forgotten.
    void Reset(bool newOrdered) noexcept;

    uint32_t Size() const { return count; }
    bool IsEmpty() const { return count == 0; }

    EntryPosition Begin() const {
        Settle();
        return count == 0 ? EntryPosition{} : EntryPosition{0, 0};
    }
    static EntryPosition End() { return {}; }
    EntryPosition Last() const;
    EntryPosition Next(EntryPosition position) const {
        if (!IsLong()) {
            return ++position.slot < count ? position : EntryPosition{};
        }
        return NextInPieces(position);
    }
    NodeEntry* At(EntryPosition position) const { return IsLong() ? AtInPieces(position) : items[position.slot]; }

    // The entry's place counted from the front; the end counts as Size().
    uint32_t IndexOf(EntryPosition position) const;
    EntryPosition AtIndex(uint32_t index) const;

    // Where an entry of this list stands.
    EntryPosition Locate(const NodeEntry* entry) const;

    // The position behind `entry`, which stood at `position` before the list may have changed. If the entry has left
    // the list, what has moved up to its position; the end if there is nothing. Linear in the length of one piece
    // where the list did change.
    EntryPosition Following(EntryPosition position, const NodeEntry* entry) const {
        const bool isUnmoved = form == Form::Array && position.slot < count && items[position.slot] == entry;
        return isUnmoved ? Next(position) : FollowingMoved(position, entry);
    }

    // The entry with this key, the first one in an ordered list; null if there is none. Throws bad_alloc when the
    // index of a long ordered list can't be built.
    NodeEntry* Find(HashedKey key) const;

    // In a sorted list, the entry with this key, or where to insert one.
    struct Place {
        EntryPosition position;  // Good for Insert alone, and only if there is no entry.
        NodeEntry* entry;        // The entry that has the key already, or null.
    };
    Place FindPlace(HashedKey key) const;

    // Calls `visit` for each entry as they lie in memory, which need not be their order.
    template <typename Visit>
    void VisitUnordered(Visit visit) const;

    // Makes room for `size` entries in all, if that is a short list. Throws bad_alloc.
    void Reserve(uint32_t size);

    // Stores `entry` in front of `position`. A sorted list takes the position as it stands: it must be what FindPlace
    // gave. Throws bad_alloc; then nothing has changed and `entry` is still the caller's.
    EntryPosition Insert(EntryPosition position, NodeEntry* entry) {
        // Nearly always: at the end of a short list with room. Long lists have no capacity.
        if (position.IsEnd() && count < capacity) {
            NoteInsertion(position);
            items[count] = entry;
            return {0, count++};
        }
        return InsertAnywhere(position, entry);
    }

    // Takes an entry out without releasing it; gives the position of the one that followed it.
    EntryPosition Detach(EntryPosition position) noexcept;

    // Swaps the key of an entry of an ordered list, or of one that has been taken out of a sorted list, for `key`. Only
    // behind NodeEntry::OwnKey.
    void AssignKey(NodeEntry* entry, String&& key) noexcept;

    // Where "#{" may stand in the texts of the entries, or below them: a long list notes it for each of its pieces, so
    // that a walk over many entries finds the few that have any.

    // Notes it for the piece of an entry of this list, and for all if that is null.
    void NoteVariables(const NodeEntry* entry) noexcept;
    // Whether it makes a difference which entry is given to NoteVariables.
    bool TellsVariablesApart() const { return IsLong(); }
    // `position`, or where the next piece begins that may hold any. The end if there is none.
    EntryPosition SkipWithoutVariables(EntryPosition position) const;
    // Ends the note for the piece that `position` is in.
    void ForgetVariables(EntryPosition position) noexcept;

    // Forgets the index of the keys. Worth doing ahead of a removal of very many entries.
    void DropIndex() noexcept;

  private:
    struct LongForm;

    enum class Form : uint8_t {
        Array,     // In its order.
        Unsorted,  // An array of plain keys, whose order nobody has asked for yet.
        Long,
    };

    // Up to this many entries the list is one array, searched in place.
    static constexpr uint32_t shortLimit = 32;

    EntryPosition NextInPieces(EntryPosition position) const;
    NodeEntry* AtInPieces(EntryPosition position) const;
    EntryPosition FollowingMoved(EntryPosition position, const NodeEntry* entry) const;
    bool IsValid(EntryPosition position) const;
    NodeEntry* FindInIndex(std::u16string_view key) const;
    bool IsLong() const { return form == Form::Long; }
    void Settle() const {
        if (form == Form::Unsorted) {
            SortArray();
        }
    }
    void SortArray() const noexcept;
    // Has to hear of each entry that comes into an array.
    void NoteInsertion(EntryPosition position) {
        if (!ordered && position == EntryPosition::Unsettled()) {
            form = Form::Unsorted;
        }
    }
    NodeEntry* FindInArray(HashedKey key) const;
    bool FindPlain(HashedKey key, NodeEntry*& entry) const;
    Place SearchSorted(std::u16string_view key) const;
    EntryPosition InsertAnywhere(EntryPosition position, NodeEntry* entry);
    void GrowArray(uint32_t size);
    void InsertInArray(uint32_t slot, NodeEntry* entry);
    void AddToIndex(NodeEntry* entry, bool atEnd) noexcept;
    void RemoveFromIndex(const NodeEntry* entry) noexcept;
    void MakeLong();
    void ReleaseContainer() noexcept;

    union {
        NodeEntry** items = nullptr;
        LongForm* longForm;
    };
    uint32_t count = 0;
    uint8_t capacity = 0;  // Of `items`; 0 in the long form.
    mutable Form form = Form::Array;
    bool ordered;
    // One byte is left, for what a node has to note (ResTreeNode.h).
};

template <typename Visit>
void EntryList::VisitUnordered(Visit visit) const {
    if (IsLong()) {
        for (EntryPosition position = Begin(); !position.IsEnd(); position = Next(position)) {
            visit(At(position));
        }
        return;
    }
    for (uint32_t i = 0; i < count; ++i) {
        visit(items[i]);
    }
}

}  // namespace zkhw
