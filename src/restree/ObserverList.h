#pragma once

// Who hears of a node's changes: the records in order of registration. Internal to the node's implementation.
//
// A record keeps its place while notices are under way; what is removed meanwhile is only marked, and what is added
// waits at the end. Registering, removing and the search for a record are logarithmic: beyond a few records they are
// indexed, and the places of removed ones are closed up many at a time.

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <vector>

namespace zkhw {

class ResTreeNode;
class ResTreeNodeChangeObserver;

struct ObserverRecord {
    enum State : uint8_t {
        Active = 0,
        Removed = 1,  // Removed during a dispatch, or waiting for its place to be closed up: skipped.
        Added = 2,    // Added during a dispatch: skipped by it, and active from its end on.
    };

    ResTreeNodeChangeObserver* observer;  // Not owned, but see DeleteWithNode.
    ResTreeNode* chained;                 // The observer itself if it is a node that watches this one, else null.
    uint64_t serial;                      // Ascends in the order of registration; unique in its list.
    int32_t context;                      // Handed back at each call.
    uint32_t mask;                        // ChangeFlags that make a call.
    uint32_t watchSlot;                   // Where `chained` notes that it watches; without meaning if that is null.
    State state;
};

// How many observer records there are in the process. While there are none, nodes come and go without notices.
class ObserverCount {
  public:
    static bool IsZero() noexcept;
    static void Add(size_t count) noexcept;
    static void Subtract(size_t count) noexcept;
};

class ObserverList {
  public:
    // Stands for any context in a search.
    static constexpr int32_t anyContext = -1;

    ObserverList() noexcept;
    ~ObserverList();
    ObserverList(const ObserverList&) = delete;
    ObserverList& operator=(const ObserverList&) = delete;

    // True if there is no record, not even a marked one.
    bool IsEmpty() const { return records.empty(); }

    // The records by place, marked ones included. Removals outside of a dispatch, and sweeps, move them.
    size_t Size() const { return records.size(); }
    ObserverRecord& At(size_t place) { return records[place]; }

    // The record with this serial, which must be there.
    ObserverRecord& WithSerial(uint64_t serial) { return records[PlaceOf(serial)]; }

    // The first matching record that is active, or that is not removed; null if there is none.
    ObserverRecord* FindActive(const ResTreeNodeChangeObserver* observer, int32_t context);
    ObserverRecord* FindPresent(const ResTreeNodeChangeObserver* observer, int32_t context);

    // True if an active record holds one of `mask`. Bits that are no ChangeFlags are looked at as one: then true also
    // if a record holds another of those. Takes the same time for any number.
    bool HasActive(uint32_t mask) const noexcept;

    // The next active record at `place` or behind it that holds one of `mask`; `place` is then behind it. Null if there
    // is none.
    const ObserverRecord* NextActive(size_t& place, uint32_t mask) const noexcept;

    // A new record at the end; active, or added if notices are under way. Throws bad_alloc, and nothing has changed.
    ObserverRecord& Append(ResTreeNodeChangeObserver* observer, int32_t context, uint32_t mask, ResTreeNode* chained);

    void SetMask(ObserverRecord& record, uint32_t mask) noexcept;

    // Takes a record out, one that is not removed yet. While notices are under way it keeps its place, marked.
    void Remove(ObserverRecord& record) noexcept;

    // Its records stay, without an observer. For an observer that goes together with the list.
    void ForgetObserver(const ResTreeNodeChangeObserver* observer) noexcept;

    // Notices are under way: places stay as they are.
    void SetNotifying(bool isNotifying) noexcept { notifying = isNotifying; }

    // At the end of a dispatch: what was removed in it goes, and what was added in it becomes active.
    void Sweep() noexcept;

  private:
    struct Index;

    // Up to so many records the list is searched from the front.
    static constexpr size_t shortLimit = 16;
    static constexpr size_t flagCount = 11;
    static constexpr uint32_t Counted(uint32_t mask) noexcept;

    size_t PlaceOf(uint64_t serial) const noexcept;
    ObserverRecord* Find(const ResTreeNodeChangeObserver* observer, int32_t context, bool onlyActive);
    void BuildIndex() noexcept;
    void CountFlags(uint32_t mask, bool isMore) noexcept;
    void CloseUp() noexcept;
    void CloseUpIfWorthwhile() noexcept;

    std::vector<ObserverRecord> records;
    std::unique_ptr<Index> index;  // Null while the list is short, and if there was no memory for one.
    uint64_t nextSerial = 0;
    size_t firstAdded = 0;     // No record in front of this place is in the state Added.
    uint32_t markedCount = 0;  // Removed during a dispatch that has not been swept.
    uint32_t emptyCount = 0;   // Removed otherwise, and the place is still to be closed up.
    // How many active records hold each flag, and how many a bit that is none.
    std::array<uint32_t, flagCount + 1> active = {};
    bool notifying = false;
};

}  // namespace zkhw
