#pragma once

// The reservations that one node holds, in order of arrival, each owner once, and the text that shows them. A node has
// few holders as a rule; when there are many, an index by owner is built at the first search and kept from then on.

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>
#include <vector>

#include "restree/NodeEntry.h"
#include "restree/Reservation.h"

namespace zkhw {

class ReservationList {
  public:
    static constexpr size_t nowhere = SIZE_MAX;

    ReservationList();
    ~ReservationList();
    ReservationList(const ReservationList&) = delete;
    ReservationList& operator=(const ReservationList&) = delete;

    const std::vector<Reservation>& Records() const { return records; }
    bool IsEmpty() const { return records.empty(); }

    // All modes in one set.
    uint32_t Flags() const;

    // Where the record of `owner` stands, or `nowhere`. Throws bad_alloc when the index can't be built, or long texts
    // outside ASCII can't be compared.
    size_t Find(std::u16string_view owner);

    // The owner must not be there. Throws bad_alloc; then nothing has changed.
    void Append(Reservation&& record);

    void SetMode(size_t at, uint32_t mode) noexcept;

    // Gives what was there. With PutBack it stands there again, if there was no other change in between.
    Reservation Erase(size_t at) noexcept;
    void PutBack(size_t at, Reservation&& record) noexcept;

    // Puts other records in the place of all, and gives those.
    std::vector<Reservation> Exchange(std::vector<Reservation>&& others) noexcept;

    // How often the records have changed. Wraps round.
    uint32_t ChangeCount() const { return changes; }

    // The records as "owner:=modes", joined by ",", with the modes as "!", "w", "r" in that order.
    String Text() const;

    // Makes the text of `entry` that of the records. If nothing else has written there since the last time and one
    // record has changed, it is edited in place. Throws bad_alloc, or OutOfRange for a text too long; then the text is
    // as it was.
    void WriteTo(NodeEntry& entry);

    // Notes that the text of `entry` is that of the records.
    void NoteWritten(NodeEntry& entry) noexcept;

  private:
    struct Index;

    // What the last change of the records does to their text.
    struct Edit {
        enum Kind : uint8_t {
            Anything,
            AddLast,  // The last record comes.
            Remove,   // `count` units at `offset` go.
            Modes,    // The same, and the modes of the record `at` come in their place.
        } kind;
        size_t offset = 0;
        size_t count = 0;
        size_t at = 0;
    };

    // Up to this many records are searched one by one.
    static constexpr size_t shortLimit = 16;

    void NoteChange(Edit made) noexcept;
    void EditText(String& text) const;
    size_t OffsetOf(size_t at) const;

    std::vector<Reservation> records;
    std::unique_ptr<Index> index;  // Null until a search among many records.
    Edit edit{Edit::Anything};
    uint32_t changes = 0;
    uint32_t changesWritten = 0;         // The count when the text was last written,
    const NodeEntry* written = nullptr;  // and where to; only compared.
};

}  // namespace zkhw
