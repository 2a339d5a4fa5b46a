// Change notices of the model.

#include <algorithm>

#include "TreeModel.h"
#include "restree/ChangeFlags.h"

namespace fuzz::model {

namespace {

constexpr uint32_t nameChanges = zkhw::NodeNameChanged | zkhw::AncestorChanged;
constexpr uint32_t anyId = 0xFFFFFFFF;

bool AnyActive(const Node& node, uint32_t mask) {
    return std::any_of(node.records.begin(), node.records.end(), [mask](const auto& record) {
        return record->state == Record::Active && (record->mask & mask) != 0;
    });
}

bool IsAtOrBelow(const Node* node, const Node* top) {
    while (node != nullptr && node != top) {
        node = node->parent;
    }
    return node == top;
}

}  // namespace

// --- Delivery ---

void Tree::Raise(Node& node, uint32_t changes) {
    node.pending |= changes;
    if (node.suspendCount == 0) {
        Dispatch(node, ++runs);
    }
}

// A watching node that the same dispatch has open already has raised this itself: a circle of watching ends there.
void Tree::RaiseChained(Node& node, uint32_t changes, uint64_t run) {
    if (node.run == run) {
        return;
    }
    node.pending |= changes;
    if (node.suspendCount == 0) {
        Dispatch(node, run);
    }
}

void Tree::Dispatch(Node& node, uint64_t run) {
    const uint64_t outer = node.run;
    node.run = run;
    do {
        const uint32_t delivered = node.pending;
        node.suspendCount = 1;
        node.isNotifying = true;
        node.pending = 0;
        if (delivered != 0) {
            Deliver(node, delivered, run);
            if (outer == 0) {
                std::erase_if(node.records, [](const auto& record) { return record->state == Record::Removed; });
                for (const auto& record : node.records) {
                    record->state = Record::Active;
                }
            }
        }
        node.isNotifying = outer != 0;
        node.suspendCount = 0;
    } while (node.pending != 0);
    node.run = outer;
}

void Tree::Deliver(Node& node, uint32_t delivered, uint64_t run) {
    for (size_t i = 0; i < node.records.size(); ++i) {
        const Record record = *node.records[i];
        if (record.state != Record::Active || (record.mask & delivered) == 0) {
            continue;
        }
        if (record.watcher != nullptr) {
            if ((delivered & nameChanges) != 0) {
                RaiseChained(*record.watcher, delivered & nameChanges, run);
            }
            if ((delivered & zkhw::ReservationChanged) != 0) {
                RaiseChained(*record.watcher, zkhw::ReservationChanged, run);
            }
            continue;
        }
        const Registration registration = *record.registration;
        calls.push_back({registration.observer, delivered, registration.id, registration.node->real});
        reaction(registration);
    }
}

uint32_t Tree::BeginChanges(Node& node) {
    const uint32_t saved = node.pending;
    node.pending = 0;
    ++node.suspendCount;
    return saved;
}

void Tree::EndChanges(Node& node, uint32_t saved, bool replace) {
    node.pending = replace ? saved : node.pending | saved;
    if (--node.suspendCount == 0) {
        Dispatch(node, ++runs);
    }
}

// --- Registration ---

bool Tree::AddObserver(Node& node, Registration* registration, Node* watcher, uint32_t mask, int32_t context) {
    Record* present = nullptr;
    for (const auto& record : node.records) {
        if (present == nullptr && record->state == Record::Active && record->Is(registration, watcher) &&
            (context == -1 || record->context == context)) {
            present = record.get();
        }
    }
    const bool isNew = present == nullptr;
    if (isNew) {
        node.records.push_back(std::make_unique<Record>(
            Record{registration, watcher, context, mask, node.isNotifying ? Record::Added : Record::Active}));
    } else {
        present->mask = mask;
    }
    bool anyNew = isNew;
    if ((mask & zkhw::AncestorChanged) != 0 && node.parent != nullptr) {
        anyNew |= AddObserver(*node.parent, nullptr, &node, nameChanges, 1);
    }
    if ((mask & zkhw::ReservationChanged) != 0 && !node.isBeingWatched) {
        node.isBeingWatched = true;
        for (Node* dependant : Dependants(node)) {
            anyNew |= AddObserver(*dependant, nullptr, &node, zkhw::ReservationChanged, 2);
        }
        node.isBeingWatched = false;
    }
    return anyNew;
}

// Also takes out what was added during a notice and isn't active yet: whoever listened may be about to die.
bool Tree::RemoveObserver(Node& node, const Registration* registration, const Node* watcher, int32_t context) {
    bool removed = false;
    for (size_t i = 0; i < node.records.size();) {
        Record& record = *node.records[i];
        if (record.state == Record::Removed || !record.Is(registration, watcher) ||
            (context != -1 && record.context != context)) {
            ++i;
            continue;
        }
        removed = true;
        if (node.isNotifying) {
            record.state = Record::Removed;
        } else {
            node.records.erase(node.records.begin() + static_cast<ptrdiff_t>(i));
        }
    }
    if (!removed) {
        return false;
    }
    if (node.parent != nullptr && !AnyActive(node, zkhw::AncestorChanged)) {
        RemoveObserver(*node.parent, nullptr, &node, 1);
    }
    if (!AnyActive(node, zkhw::ReservationChanged)) {
        for (Node* dependant : Dependants(node)) {
            RemoveObserver(*dependant, nullptr, &node, 2);
        }
    }
    return true;
}

void Tree::Advise(Node& node, size_t observer, uint32_t mask, uint32_t id) {
    for (const auto& registration : registrations) {
        if (registration->node == &node && registration->observer == observer && registration->id == id) {
            return;
        }
    }
    registrations.push_back(std::make_unique<Registration>(Registration{&node, observer, id}));
    AddObserver(node, registrations.back().get(), nullptr, mask, static_cast<int32_t>(id));
}

void Tree::End(Registration& registration) {
    RemoveObserver(*registration.node, &registration, nullptr, static_cast<int32_t>(registration.id));
    std::erase_if(registrations, [&](const auto& other) { return other.get() == &registration; });
}

void Tree::Unadvise(Node& node, size_t observer, uint32_t id, bool subtree) {
    std::vector<Registration*> matches;
    for (const auto& registration : registrations) {
        const bool isExact = id != anyId && !subtree;
        const bool fits =
            isExact ? registration->id == id : id == anyId || registration->id == anyId || registration->id == id;
        const bool isHere = subtree ? IsAtOrBelow(registration->node, &node) : registration->node == &node;
        if (fits && isHere && registration->observer == observer) {
            matches.push_back(registration.get());
        }
    }
    for (Registration* registration : matches) {
        End(*registration);
    }
}

}  // namespace fuzz::model
