#include "restree/ReservationList.h"

#include <algorithm>
#include <array>
#include <bit>
#include <map>
#include <new>
#include <utility>

#include "qn/dsc/osdep/Compare.h"

namespace zkhw {

using qn::dsc::osdep::Compare;
using qn::dsc::osdep::Equal;

namespace {

constexpr std::u16string_view assignment = u":=";

struct Letter {
    ReservationFlags flag;
    char16_t unit;
};
constexpr Letter letters[] = {{ReserveExclusive, u'!'}, {ReserveWrite, u'w'}, {ReserveRead, u'r'}};

size_t LetterCount(uint32_t mode) {
    return static_cast<size_t>(std::popcount(mode & (ReserveExclusive | ReserveWrite | ReserveRead)));
}

std::u16string_view Letters(uint32_t mode, std::array<char16_t, std::size(letters)>& units) {
    size_t count = 0;
    for (const Letter& letter : letters) {
        if ((mode & letter.flag) != 0) {
            units[count++] = letter.unit;
        }
    }
    return {units.data(), count};
}

size_t PieceLength(const Reservation& record) {
    return record.owner.Length() + assignment.size() + LetterCount(record.mode);
}

String Piece(const Reservation& record, bool isFirst) {
    std::array<char16_t, std::size(letters)> units;
    return String::Concat(
        {isFirst ? std::u16string_view() : u",", record.owner.View(), assignment, Letters(record.mode, units)});
}

struct OwnerOrder {
    bool operator()(std::u16string_view a, std::u16string_view b) const { return Compare(a, b) < 0; }
};

}  // namespace

// Records move up when one before them goes, so the index knows them by the number of their arrival.
struct ReservationList::Index {
    void Count(uint32_t mode, uint32_t step) noexcept {
        for (; mode != 0; mode &= mode - 1) {
            flagCounts[static_cast<size_t>(std::countr_zero(mode))] += step;
        }
    }
    void Add(const Reservation& record) {
        arrivals.reserve(arrivals.size() == arrivals.capacity() ? arrivals.size() * 2 + 1 : 0);
        byOwner.emplace(record.owner.View(), nextArrival);
        arrivals.push_back(nextArrival++);
        Count(record.mode, 1);
    }

    // The texts are those of the records, whose buffers stay where they are when the records move.
    std::map<std::u16string_view, uint64_t, OwnerOrder> byOwner;
    std::vector<uint64_t> arrivals;  // Of each record, in the order of the list; ascending.
    uint64_t nextArrival = 0;
    std::array<uint32_t, 32> flagCounts{};  // How many records have each flag.
};

ReservationList::ReservationList() = default;
ReservationList::~ReservationList() = default;

uint32_t ReservationList::Flags() const {
    uint32_t flags = 0;
    if (index) {
        for (uint32_t bit = 0; bit < index->flagCounts.size(); ++bit) {
            flags |= index->flagCounts[bit] != 0 ? 1U << bit : 0;
        }
        return flags;
    }
    for (const Reservation& record : records) {
        flags |= record.mode;
    }
    return flags;
}

size_t ReservationList::Find(std::u16string_view owner) {
    if (!index && records.size() <= shortLimit) {
        const auto found = std::find_if(records.begin(), records.end(), [owner](const Reservation& record) {
            return Equal(record.owner.View(), owner);
        });
        return found == records.end() ? nowhere : static_cast<size_t>(found - records.begin());
    }
    if (!index) {
        auto made = std::make_unique<Index>();
        for (const Reservation& record : records) {
            made->Add(record);
        }
        index = std::move(made);
    }
    const auto found = index->byOwner.find(owner);
    if (found == index->byOwner.end()) {
        return nowhere;
    }
    const auto& arrivals = index->arrivals;
    return static_cast<size_t>(std::lower_bound(arrivals.begin(), arrivals.end(), found->second) - arrivals.begin());
}

// --- Changes ---

void ReservationList::NoteChange(Edit made) noexcept {
    edit = made;
    ++changes;
}

void ReservationList::Append(Reservation&& record) {
    if (records.size() == records.capacity()) {
        records.reserve(records.size() * 2 + 1);
    }
    if (index) {
        index->Add(record);
    }
    records.push_back(std::move(record));
    NoteChange({Edit::AddLast});
}

void ReservationList::SetMode(size_t at, uint32_t mode) noexcept {
    Reservation& record = records[at];
    if (index) {
        index->Count(record.mode, UINT32_MAX);
        index->Count(mode, 1);
    }
    const size_t oldLetters = LetterCount(record.mode);
    record.mode = mode;
    NoteChange({Edit::Modes, OffsetOf(at) + record.owner.Length() + assignment.size(), oldLetters, at});
}

Reservation ReservationList::Erase(size_t at) noexcept {
    if (index) {
        try {
            index->byOwner.erase(records[at].owner.View());
            index->arrivals.erase(index->arrivals.begin() + static_cast<std::ptrdiff_t>(at));
            index->Count(records[at].mode, UINT32_MAX);
        } catch (const std::bad_alloc&) {
            index.reset();
        }
    }
    // The comma before the record goes too; the first record has it behind.
    const size_t offset = at == 0 ? 0 : OffsetOf(at) - 1;
    const size_t length = PieceLength(records[at]) + 1;
    Reservation record = std::move(records[at]);
    records.erase(records.begin() + static_cast<std::ptrdiff_t>(at));
    NoteChange({Edit::Remove, offset, length});
    return record;
}

void ReservationList::PutBack(size_t at, Reservation&& record) noexcept {
    index.reset();
    // There is room: the record stood here.
    records.insert(records.begin() + static_cast<std::ptrdiff_t>(at), std::move(record));
    NoteChange({Edit::Anything});
}

std::vector<Reservation> ReservationList::Exchange(std::vector<Reservation>&& others) noexcept {
    index.reset();
    NoteChange({Edit::Anything});
    return std::exchange(records, std::move(others));
}

// --- The text ---

// Where the record's owner begins.
size_t ReservationList::OffsetOf(size_t at) const {
    size_t offset = at;
    for (size_t i = 0; i < at; ++i) {
        offset += PieceLength(records[i]);
    }
    return offset;
}

String ReservationList::Text() const {
    String text;
    if (const size_t length = records.empty() ? 0 : OffsetOf(records.size()) - 1; length <= INT32_MAX) {
        text.Reserve(static_cast<uint32_t>(length));
    }
    std::array<char16_t, std::size(letters)> units;
    for (const Reservation& record : records) {
        if (&record != records.data()) {
            text.Append(u",");
        }
        text.Append(record.owner);
        text.Append(assignment);
        text.Append(Letters(record.mode, units));
    }
    return text;
}

// Does to the text of the records as they were what the last change did to them.
void ReservationList::EditText(String& text) const {
    const auto offset = static_cast<uint32_t>(edit.offset);
    const auto count = static_cast<uint32_t>(edit.count);
    if (edit.kind == Edit::AddLast) {
        text.Append(Piece(records.back(), records.size() == 1));
    } else if (edit.kind == Edit::Remove) {
        text.Erase(offset, count, true);
    } else {
        std::array<char16_t, std::size(letters)> units;
        const std::u16string_view whole = text.View();
        text = String::Concat(
            {whole.substr(0, offset), Letters(records[edit.at].mode, units), whole.substr(offset + count)});
    }
}

void ReservationList::WriteTo(NodeEntry& entry) {
    const bool isEditable =
        edit.kind != Edit::Anything && written == &entry && entry.IsTextMarked() && changes == changesWritten + 1;
    if (isEditable) {
        EditText(entry.EditText());
    } else {
        entry.SetText(Text().View());
    }
    NoteWritten(entry);
}

void ReservationList::NoteWritten(NodeEntry& entry) noexcept {
    entry.MarkText();
    written = &entry;
    changesWritten = changes;
}

}  // namespace zkhw
