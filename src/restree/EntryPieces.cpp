#include "restree/EntryPieces.h"

#include <algorithm>
#include <cstring>
#include <new>

#include "qn/dsc/osdep/TaskMemory.h"

namespace zkhw {

EntryPieces::~EntryPieces() {
    for (EntryPiece* piece : pieces) {
        qn::dsc::osdep::TaskMemFree(piece);
    }
}

EntryPosition EntryPieces::Last() const {
    if (pieces.empty()) {
        return {};
    }
    return {static_cast<uint32_t>(pieces.size() - 1), pieces.back()->count - 1};
}

EntryPosition EntryPieces::Next(EntryPosition position) const {
    // Pieces may have gone since the position was taken.
    if (position.piece >= pieces.size()) {
        return {};
    }
    if (++position.slot < pieces[position.piece]->count) {
        return position;
    }
    return NextPiece(position.piece);
}

uint32_t EntryPieces::IndexOf(EntryPosition position) const {
    uint32_t index = 0;
    const size_t whole = std::min<size_t>(position.piece, pieces.size());
    for (size_t i = 0; i < whole; ++i) {
        index += pieces[i]->count;
    }
    return index + position.slot;
}

EntryPosition EntryPieces::AtIndex(uint32_t index) const {
    for (const EntryPiece* piece : pieces) {
        if (index < piece->count) {
            return {piece->ordinal, index};
        }
        index -= piece->count;
    }
    return {};
}

EntryPosition EntryPieces::Locate(const NodeEntry* entry) const {
    const EntryPiece& piece = *numbered[entry->pieceNumber - 1];
    const auto* found = std::find(piece.items, piece.items + piece.count, entry);
    return {piece.ordinal, static_cast<uint32_t>(found - piece.items)};
}

EntryPiece* EntryPieces::AddPiece(uint32_t ordinal) {
    pieces.reserve(pieces.size() + 1 > pieces.capacity() ? pieces.capacity() * 2 + 8 : 0);
    const uint32_t number = marksEntries ? TakeNumber() : 0;
    void* memory = qn::dsc::osdep::TaskMemAlloc(sizeof(EntryPiece));
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    EntryPiece* piece = new (memory) EntryPiece;
    piece->number = number;
    if (number != 0) {
        numbered[number - 1] = piece;
    }
    pieces.insert(pieces.begin() + ordinal, piece);
    Renumber(ordinal);
    return piece;
}

// A number that no piece has; it stays free until a piece is put into its place.
uint32_t EntryPieces::TakeNumber() {
    auto place = numbered.end();
    if (numbered.size() > pieces.size()) {
        place = std::find(numbered.begin(), numbered.end(), nullptr);
    } else {
        place = numbered.insert(numbered.end(), nullptr);
    }
    return static_cast<uint32_t>(place - numbered.begin()) + 1;
}

void EntryPieces::Renumber(uint32_t from) noexcept {
    for (uint32_t i = from; i < pieces.size(); ++i) {
        pieces[i]->ordinal = i;
    }
}

void EntryPieces::Mark(EntryPiece& piece, uint32_t from) noexcept {
    if (marksEntries) {
        for (uint32_t i = from; i < piece.count; ++i) {
            piece.items[i]->pieceNumber = piece.number;
        }
    }
}

EntryPosition EntryPieces::Insert(EntryPosition position, NodeEntry* entry) {
    if (position.IsEnd()) {
        // Growth at the end fills each piece to the brim; only insertions in the midst split one.
        const bool room = !pieces.empty() && pieces.back()->count < EntryPiece::capacity;
        EntryPiece* piece = room ? pieces.back() : AddPiece(static_cast<uint32_t>(pieces.size()));
        piece->items[piece->count++] = entry;
        Mark(*piece, piece->count - 1);
        return {piece->ordinal, piece->count - 1};
    }
    EntryPiece* piece = pieces[position.piece];
    if (piece->count == EntryPiece::capacity) {
        constexpr uint32_t half = EntryPiece::capacity / 2;
        EntryPiece* upper = AddPiece(position.piece + 1);
        std::copy(piece->items + half, piece->items + piece->count, upper->items);
        upper->count = piece->count - half;
        piece->count = half;
        Mark(*upper, 0);
        if (position.slot > half) {
            position = {position.piece + 1, position.slot - half};
            piece = upper;
        }
    }
    std::copy_backward(piece->items + position.slot, piece->items + piece->count, piece->items + piece->count + 1);
    piece->items[position.slot] = entry;
    ++piece->count;
    if (marksEntries) {
        entry->pieceNumber = piece->number;
    }
    return position;
}

void EntryPieces::SetAllMayHoldVariables() {
    for (EntryPiece* piece : pieces) {
        piece->mayHoldVariables = true;
    }
}

EntryPosition EntryPieces::Erase(EntryPosition position) noexcept {
    EntryPiece* piece = pieces[position.piece];
    if (marksEntries) {
        piece->items[position.slot]->pieceNumber = 0;
    }
    std::copy(piece->items + position.slot + 1, piece->items + piece->count, piece->items + position.slot);
    --piece->count;
    if (piece->count == 0) {
        if (marksEntries) {
            numbered[piece->number - 1] = nullptr;
        }
        qn::dsc::osdep::TaskMemFree(piece);
        pieces.erase(pieces.begin() + position.piece);
        Renumber(position.piece);
        return position.piece < pieces.size() ? EntryPosition{position.piece, 0} : EntryPosition{};
    }
    if (position.slot < piece->count) {
        return position;
    }
    return NextPiece(position.piece);
}

}  // namespace zkhw
