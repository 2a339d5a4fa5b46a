#include "restree/ObserverList.h"

#include <algorithm>
#include <atomic>
#include <new>
#include <set>
#include <tuple>
#include <utility>

#include "restree/ChangeFlags.h"

namespace zkhw {

namespace {

std::atomic<size_t> observerCount = 0;

bool IsMatch(const ObserverRecord& record, const ResTreeNodeChangeObserver* observer, int32_t context) {
    return record.observer == observer && (context == ObserverList::anyContext || record.context == context);
}

}  // namespace

bool ObserverCount::IsZero() noexcept {
    return observerCount.load(std::memory_order_relaxed) == 0;
}

void ObserverCount::Add(size_t count) noexcept {
    observerCount.fetch_add(count, std::memory_order_relaxed);
}

void ObserverCount::Subtract(size_t count) noexcept {
    observerCount.fetch_sub(count, std::memory_order_relaxed);
}

// The records that are not removed by observer, and by observer and context, each in order of registration; and what
// flags there may be in each stretch of the list.
struct ObserverList::Index {
    static constexpr size_t stretch = 64;

    using Observer = const ResTreeNodeChangeObserver*;
    std::set<std::pair<Observer, uint64_t>> byObserver;
    std::set<std::tuple<Observer, int32_t, uint64_t>> byContext;
    std::vector<uint32_t> masks;  // Of each `stretch` places; may hold flags that no record there has any more.

    void Add(const ObserverRecord& record, size_t place) {
        byObserver.emplace(record.observer, record.serial);
        byContext.emplace(record.observer, record.context, record.serial);
        masks.resize(place / stretch + 1);
        masks[place / stretch] |= record.mask;
    }
};

ObserverList::ObserverList() noexcept = default;

ObserverList::~ObserverList() {
    ObserverCount::Subtract(records.size() - emptyCount);
}

size_t ObserverList::PlaceOf(uint64_t serial) const noexcept {
    const auto found =
        std::lower_bound(records.begin(), records.end(), serial,
                         [](const ObserverRecord& record, uint64_t wanted) { return record.serial < wanted; });
    return static_cast<size_t>(found - records.begin());
}

// --- Search ---

void ObserverList::BuildIndex() noexcept {
    try {
        auto built = std::make_unique<Index>();
        for (size_t place = 0; place < records.size(); ++place) {
            if (records[place].state != ObserverRecord::Removed) {
                built->Add(records[place], place);
            }
        }
        index = std::move(built);
    } catch (const std::bad_alloc&) {
        // The list is searched from the front then.
    }
}

ObserverRecord* ObserverList::Find(const ResTreeNodeChangeObserver* observer, int32_t context, bool onlyActive) {
    const auto isWanted = [onlyActive](const ObserverRecord& record) {
        return onlyActive ? record.state == ObserverRecord::Active : record.state != ObserverRecord::Removed;
    };
    if (!index && records.size() > shortLimit) {
        BuildIndex();
    }
    if (!index) {
        const auto found = std::find_if(records.begin(), records.end(), [&](const ObserverRecord& record) {
            return isWanted(record) && IsMatch(record, observer, context);
        });
        return found == records.end() ? nullptr : &*found;
    }
    if (context == anyContext) {
        for (auto item = index->byObserver.lower_bound({observer, 0});
             item != index->byObserver.end() && item->first == observer; ++item) {
            if (ObserverRecord& record = WithSerial(item->second); isWanted(record)) {
                return &record;
            }
        }
        return nullptr;
    }
    for (auto item = index->byContext.lower_bound({observer, context, 0});
         item != index->byContext.end() && std::get<0>(*item) == observer && std::get<1>(*item) == context; ++item) {
        if (ObserverRecord& record = WithSerial(std::get<2>(*item)); isWanted(record)) {
            return &record;
        }
    }
    return nullptr;
}

ObserverRecord* ObserverList::FindActive(const ResTreeNodeChangeObserver* observer, int32_t context) {
    return Find(observer, context, true);
}

ObserverRecord* ObserverList::FindPresent(const ResTreeNodeChangeObserver* observer, int32_t context) {
    return Find(observer, context, false);
}

// The ChangeFlags of `mask`, and one more bit for all others: a host may raise and ask for what nobody else does.
constexpr uint32_t ObserverList::Counted(uint32_t mask) noexcept {
    static_assert(NodeDeleting == 1U << (flagCount - 1), "the last flag");
    constexpr uint32_t others = 1U << flagCount;
    return mask < others ? mask : (mask & (others - 1)) | others;
}

bool ObserverList::HasActive(uint32_t mask) const noexcept {
    mask = Counted(mask);
    for (size_t flag = 0; flag < active.size(); ++flag) {
        if ((mask >> flag & 1) != 0 && active[flag] != 0) {
            return true;
        }
    }
    return false;
}

const ObserverRecord* ObserverList::NextActive(size_t& place, uint32_t mask) const noexcept {
    if (!HasActive(mask)) {
        return nullptr;
    }
    while (place < records.size()) {
        if (index && place % Index::stretch == 0 && (index->masks[place / Index::stretch] & mask) == 0) {
            place += Index::stretch;
            continue;
        }
        const ObserverRecord& record = records[place++];
        if (record.state == ObserverRecord::Active && (record.mask & mask) != 0) {
            return &record;
        }
    }
    return nullptr;
}

// --- Changes ---

void ObserverList::CountFlags(uint32_t mask, bool isMore) noexcept {
    mask = Counted(mask);
    for (size_t flag = 0; flag < active.size(); ++flag) {
        if ((mask >> flag & 1) != 0) {
            active[flag] = isMore ? active[flag] + 1 : active[flag] - 1;
        }
    }
}

ObserverRecord& ObserverList::Append(ResTreeNodeChangeObserver* observer, int32_t context, uint32_t mask,
                                     ResTreeNode* chained) {
    if (records.size() == records.capacity()) {
        records.reserve(records.size() * 2 + 1);
    }
    const ObserverRecord::State state = notifying ? ObserverRecord::Added : ObserverRecord::Active;
    const ObserverRecord record{observer, chained, nextSerial, context, mask, 0, state};
    if (index) {
        try {
            index->Add(record, records.size());
        } catch (const std::bad_alloc&) {
            index.reset();  // It is built anew at the next search.
        }
    }
    ++nextSerial;
    if (state == ObserverRecord::Active) {
        CountFlags(mask, true);
        if (firstAdded == records.size()) {
            ++firstAdded;
        }
    }
    records.push_back(record);
    ObserverCount::Add(1);
    return records.back();
}

void ObserverList::SetMask(ObserverRecord& record, uint32_t mask) noexcept {
    if (record.state == ObserverRecord::Active) {
        CountFlags(record.mask, false);
        CountFlags(mask, true);
    }
    record.mask = mask;
    if (index) {
        index->masks[static_cast<size_t>(&record - records.data()) / Index::stretch] |= mask;
    }
}

void ObserverList::Remove(ObserverRecord& record) noexcept {
    if (record.state == ObserverRecord::Active) {
        CountFlags(record.mask, false);
    }
    record.state = ObserverRecord::Removed;
    if (index) {
        index->byObserver.erase({record.observer, record.serial});
        index->byContext.erase({record.observer, record.context, record.serial});
    }
    if (notifying) {
        ++markedCount;
    } else {
        ++emptyCount;
        ObserverCount::Subtract(1);
        CloseUpIfWorthwhile();
    }
}

void ObserverList::ForgetObserver(const ResTreeNodeChangeObserver* observer) noexcept {
    for (ObserverRecord& record : records) {
        if (record.observer == observer) {
            record.observer = nullptr;
        }
    }
}

void ObserverList::CloseUpIfWorthwhile() noexcept {
    const size_t removed = markedCount + emptyCount;
    if (removed != 0 && (records.size() <= shortLimit || removed >= records.size() / 2)) {
        CloseUp();
    }
}

void ObserverList::CloseUp() noexcept {
    std::erase_if(records, [](const ObserverRecord& record) { return record.state == ObserverRecord::Removed; });
    ObserverCount::Subtract(markedCount);
    markedCount = 0;
    emptyCount = 0;
    firstAdded = 0;
    if (records.size() <= shortLimit) {
        index.reset();
    } else if (index) {
        index->masks.assign(records.size() / Index::stretch + 1, 0);
        for (size_t place = 0; place < records.size(); ++place) {
            index->masks[place / Index::stretch] |= records[place].mask;
        }
    }
}

void ObserverList::Sweep() noexcept {
    for (; firstAdded < records.size(); ++firstAdded) {
        ObserverRecord& record = records[firstAdded];
        if (record.state == ObserverRecord::Added) {
            record.state = ObserverRecord::Active;
            CountFlags(record.mask, true);
        }
    }
    ObserverCount::Subtract(markedCount);
    emptyCount += markedCount;
    markedCount = 0;
    CloseUpIfWorthwhile();
}

}  // namespace zkhw
