#pragma once

// A long sequence of entry pointers, kept in pieces of bounded length, so that an insertion or removal anywhere
// moves no more than one piece. It owns its pieces, not the entries.

#include <cstdint>
#include <vector>

#include "restree/NodeEntry.h"

namespace zkhw {

// The place of an entry in a list. Any insertion or removal invalidates it, except that the end stays the end.
struct EntryPosition {
    static constexpr uint32_t endPiece = 0xFFFFFFFF;

    uint32_t piece = endPiece;
    uint32_t slot = 0;

    bool IsEnd() const { return piece == endPiece; }

    // The end, for an entry that is to be put into its order later.
    static EntryPosition Unsettled() { return {endPiece, 1}; }
    friend bool operator==(const EntryPosition&, const EntryPosition&) = default;
};

struct EntryPiece {
    // With the head this fills 1 KB, a size class of the node memory.
    static constexpr uint32_t capacity = 126;

    uint32_t ordinal = 0;  // Index of this piece in its sequence.
    uint32_t number = 0;   // By which its entries know it, from 1; it stays while pieces come and go before this one.
    uint32_t count = 0;    // 1 to capacity: an empty piece is dropped.
    // Whether "#{" may stand in the texts of its entries, or below them, as far as is noted (EntryList.h).
    bool mayHoldVariables = true;
    NodeEntry* items[capacity];
};

class EntryPieces {
  public:
    // With `marksEntries` each entry knows the piece that holds it; an entry may be in one such sequence only.
    explicit EntryPieces(bool marksEntries) : marksEntries(marksEntries) {}
    ~EntryPieces();
    EntryPieces(const EntryPieces&) = delete;
    EntryPieces& operator=(const EntryPieces&) = delete;

    EntryPosition Begin() const { return pieces.empty() ? EntryPosition{} : EntryPosition{0, 0}; }
    EntryPosition Last() const;
    EntryPosition Next(EntryPosition position) const;
    // Where the piece behind that at `piece` begins; the end if that is the last.
    EntryPosition NextPiece(uint32_t piece) const {
        return piece + 1 < pieces.size() ? EntryPosition{piece + 1, 0} : EntryPosition{};
    }
    NodeEntry* At(EntryPosition position) const { return pieces[position.piece]->items[position.slot]; }
    bool IsValid(EntryPosition position) const {
        return position.piece < pieces.size() && position.slot < pieces[position.piece]->count;
    }

    // Position to index and back: a walk over the pieces, not over the entries. An index behind the last is the end.
    uint32_t IndexOf(EntryPosition position) const;
    EntryPosition AtIndex(uint32_t index) const;

    // Whether `entry` is in a marking sequence.
    static bool IsMarked(const NodeEntry* entry) { return entry->pieceNumber != 0; }

    // Where `entry`, which must be in this marking sequence, stands.
    EntryPosition Locate(const NodeEntry* entry) const;

    // The first position for which `isBefore(entry)` is false, in a sequence partitioned by it.
    template <typename Predicate>
    EntryPosition PartitionPoint(Predicate isBefore) const;

    // Puts `entry` in front of `position`; gives where it now stands. Throws bad_alloc, and nothing has changed then.
    EntryPosition Insert(EntryPosition position, NodeEntry* entry);

    // Takes the entry out; gives the position of the one that followed it.
    EntryPosition Erase(EntryPosition position) noexcept;

    // What is noted of each piece; of a new one, and of one that was split off, that it may hold variables. By the
    // piece's place, and by an entry of this marking sequence.
    bool MayHoldVariables(uint32_t piece) const { return pieces[piece]->mayHoldVariables; }
    void SetMayHoldVariables(uint32_t piece, bool mayHold) { pieces[piece]->mayHoldVariables = mayHold; }
    void SetMayHoldVariables(const NodeEntry* entry) { numbered[entry->pieceNumber - 1]->mayHoldVariables = true; }
    void SetAllMayHoldVariables();

  private:
    EntryPiece* AddPiece(uint32_t ordinal);
    uint32_t TakeNumber();
    void Renumber(uint32_t from) noexcept;
    void Mark(EntryPiece& piece, uint32_t from) noexcept;

    std::vector<EntryPiece*> pieces;
    std::vector<EntryPiece*> numbered;  // By number - 1, null for a number that is free; only if entries are marked.
    bool marksEntries;
};

template <typename Predicate>
EntryPosition EntryPieces::PartitionPoint(Predicate isBefore) const {
    // The piece sought is the first whose last entry isn't before.
    uint32_t low = 0;
    uint32_t high = static_cast<uint32_t>(pieces.size());
    while (low < high) {
        const uint32_t middle = low + (high - low) / 2;
        const EntryPiece& piece = *pieces[middle];
        if (isBefore(*piece.items[piece.count - 1])) {
            low = middle + 1;
        } else {
            high = middle;
        }
    }
    if (low == pieces.size()) {
        return {};
    }
    const EntryPiece& piece = *pieces[low];
    uint32_t first = 0;
    uint32_t last = piece.count - 1;
    while (first < last) {
        const uint32_t middle = first + (last - first) / 2;
        if (isBefore(*piece.items[middle])) {
            first = middle + 1;
        } else {
            last = middle;
        }
    }
    return {low, first};
}

}  // namespace zkhw
