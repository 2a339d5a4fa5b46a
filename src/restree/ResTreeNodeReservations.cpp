// Who holds a node: its records, the text that shows them, and the questions about them. The walks over dependants are
// in ReservationWalk.

#include <algorithm>
#include <memory>
#include <unordered_set>
#include <utility>
#include <vector>

#include "restree/NodeAttachments.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/ReservationList.h"
#include "restree/ReservationWalk.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

constexpr std::u16string_view reservationKey = u"ZKHWReservation";
constexpr uint32_t activeModes = ReserveRead | ReserveWrite | ReserveExclusive;

}  // namespace

// --- One node ---

ReservationList* ResTreeNode::OwnReservations() const {
    return attachments ? attachments->reservations.get() : nullptr;
}

ReservationList& ResTreeNode::MakeReservations() {
    Attachments& own = GetAttachments();
    if (!own.reservations) {
        own.reservations = std::make_unique<ReservationList>();
    }
    return *own.reservations;
}

const std::vector<Reservation>& ResTreeNode::GetReservations() const {
    static const std::vector<Reservation> none;
    const ReservationList* list = OwnReservations();
    return list == nullptr ? none : list->Records();
}

uint32_t ResTreeNode::ReserveOne(const String& owner, uint32_t mode) {
    const ReleaseScope scope;
    const bool isExclusive = (mode & ReserveExclusive) != 0;
    const uint32_t current = GetOwnReservationFlags(nullptr, false);
    const uint32_t obstacles = ReserveExclusive | (isExclusive ? 0 : mode & ReserveWrite);
    if (isDefunct || (current & obstacles) != 0) {
        return 0;
    }
    ReservationList& list = MakeReservations();
    std::vector<Reservation> dropped;
    size_t at = ReservationList::nowhere;
    uint32_t modeBefore = 0;
    if (isExclusive) {
        dropped.push_back({owner, mode});
        dropped = list.Exchange(std::move(dropped));
    } else if (at = list.Find(owner.View()); at != ReservationList::nowhere) {
        modeBefore = list.Records()[at].mode;
        list.SetMode(at, mode);
    } else {
        list.Append({owner, mode});
    }
    const uint32_t granted = isExclusive ? mode : current | mode;
    if (granted == 0) {
        return 0;
    }
    RefreshReservations([&](ReservationList& changed) {
        if (isExclusive) {
            changed.Exchange(std::move(dropped));
        } else if (at != ReservationList::nowhere) {
            changed.SetMode(at, modeBefore);
        } else {
            changed.Erase(changed.Records().size() - 1);
        }
    });
    if (HasLeft()) {
        return 0;
    }
    Raise(ReservationChanged);
    return granted;
}

bool ResTreeNode::ReleaseOne(const String& owner) {
    const ReleaseScope scope;
    ReservationList* list = OwnReservations();
    const size_t at = list == nullptr ? ReservationList::nowhere : list->Find(owner.View());
    if (at == ReservationList::nowhere) {
        return false;
    }
    Reservation record = list->Erase(at);
    RefreshReservations([&](ReservationList& changed) { changed.PutBack(at, std::move(record)); });
    Raise(ReservationChanged);
    return true;
}

uint32_t ResTreeNode::GetOwnReservationFlags(const std::set<String>* owners, bool except) const {
    const ReservationList* list = OwnReservations();
    if (list == nullptr) {
        return 0;
    }
    if (owners == nullptr) {
        return list->Flags();
    }
    for (const Reservation& record : list->Records()) {
        if (owners->contains(record.owner) != except) {
            return record.mode;
        }
    }
    return 0;
}

// --- The text ---

void ResTreeNode::RefreshReservationProperty() {
    const ReleaseScope scope;
    RefreshReservations([](ReservationList&) {});
}

// Should the text not be made, `undo` takes back the change of the records, unless they have changed again: the search
// for the text may load, and an observer of the load may do anything.
template <typename Undo>
void ResTreeNode::RefreshReservations(Undo undo) {
    const uint32_t saved = BeginChanges();
    const uint32_t changeCount = OwnReservations() == nullptr ? 0 : OwnReservations()->ChangeCount();
    try {
        MirrorReservations();
    } catch (...) {
        if (ReservationList* list = OwnReservations(); list != nullptr && list->ChangeCount() == changeCount) {
            undo(*list);
        }
        EndChanges(saved, true);
        throw;
    }
    // In place of what was raised meanwhile: the text goes without a notice.
    EndChanges(saved, true);
}

// Either the text is that of the records in the end, or it is as it was.
void ResTreeNode::MirrorReservations() {
    NodeEntry* entry = Find(reservationKey);
    if (isDefunct) {
        return;
    }
    ReservationList* list = OwnReservations();
    if (list == nullptr || list->IsEmpty()) {
        if (entry != nullptr) {
            RemoveEntry(entry);
        }
    } else if (entry == nullptr) {
        list->NoteWritten(*AddTextEntry(reservationKey, list->Text().View(), TextEntry).entry);
    } else if (entry->IsText()) {
        list->WriteTo(*entry);
        NoteVariables(entry);  // An owner may have any name.
        Raise(PropertyChanged);
    }
}

// --- Dependants ---

uint32_t ResTreeNode::Reserve(const String& owner, uint32_t mode) {
    ReservationWalk walk(owner);
    return walk.ReserveEach({this}, mode) ? walk.Granted() : 0;
}

bool ResTreeNode::ReserveDependants(const String& owner, uint32_t mode) {
    ReservationWalk walk(owner);
    std::vector<ResTreeNode*> dependants;
    GetDependants(dependants, false);
    walk.Bar(*this);
    return walk.ReserveEach(std::move(dependants), mode);
}

bool ResTreeNode::Release(const String& owner) {
    return ReservationWalk(owner).ReleaseEach({this});
}

bool ResTreeNode::ReleaseDependants(const String& owner) {
    ReservationWalk walk(owner);
    std::vector<ResTreeNode*> dependants;
    GetDependants(dependants, true);
    walk.Bar(*this);
    return walk.ReleaseEach(dependants);
}

// Calls `visit` for `top` and the dependants at any distance, in order and each once, until it gives false. A node
// that is met again has nothing new to tell, nor has what it leads to.
template <typename Visit>
void ResTreeNode::VisitWithDependants(ResTreeNode& top, Visit visit) {
    const ReleaseScope scope;
    std::unordered_set<const ResTreeNode*> visited;
    std::vector<ResTreeNode*> open{&top};
    std::vector<ResTreeNode*> dependants;
    while (!open.empty()) {
        ResTreeNode* node = open.back();
        open.pop_back();
        if (node->HasLeft() || !visited.insert(node).second) {
            continue;
        }
        if (!visit(*node)) {
            return;
        }
        dependants.clear();
        node->GetDependants(dependants, false);
        open.insert(open.end(), dependants.rbegin(), dependants.rend());
    }
}

uint32_t ResTreeNode::GetReservationFlags(const String* owners, bool except) {
    std::set<String> set;
    if (owners != nullptr) {
        SplitList(owners->View(), u',', set, true);
    }
    uint32_t flags = 0;
    VisitWithDependants(*this, [&](const ResTreeNode& node) {
        flags |= node.GetOwnReservationFlags(owners == nullptr ? nullptr : &set, except);
        return true;
    });
    return flags;
}

void ResTreeNode::GetReservationOwners(std::vector<String>& list, bool activeOnly) {
    if (!list.empty()) {
        return;
    }
    VisitWithDependants(*this, [&](const ResTreeNode& node) {
        for (const Reservation& record : node.GetReservations()) {
            if (!activeOnly || (record.mode & activeModes) != 0) {
                list.push_back(record.owner);
            }
        }
        return list.empty();
    });
}

// --- Descendants ---

bool ResTreeNode::ReserveAll(const String& owner, uint32_t mode, const String& filter) {
    ReservationWalk walk(owner);
    std::vector<ResTreeNode*> nodes;
    CollectMatchingDescendants(filter, nodes);
    return walk.ReserveEach(std::move(nodes), mode);
}

bool ResTreeNode::ReleaseAll(const String& owner, const String& filter) {
    ReservationWalk walk(owner);
    std::vector<ResTreeNode*> nodes;
    CollectMatchingDescendants(filter, nodes);
    return walk.ReleaseEach(nodes);
}

void ResTreeNode::CollectMatchingDescendants(const String& filter, std::vector<ResTreeNode*>& list) {
    struct Level {
        ResTreeNode* node;
        EntryPosition position;
        const NodeEntry* entry = nullptr;  // At `position`; null before the first.
    };
    const ReleaseScope scope;
    const auto first = static_cast<std::ptrdiff_t>(list.size());
    std::vector<Level> levels;
    EnsureDeferredLoaded();
    levels.push_back({this, {}});
    while (!levels.empty()) {
        Level& level = levels.back();
        // A load may have changed the entries since the last step, or removed the node.
        const EntryList& present = level.node->entries;
        level.position = level.entry == nullptr ? present.Begin() : present.Following(level.position, level.entry);
        if (level.position.IsEnd()) {
            levels.pop_back();
            continue;
        }
        level.entry = present.At(level.position);
        ResTreeNode* child = level.entry->Child();
        if (child != nullptr && child->Supports(filter.View())) {
            list.push_back(child);
            child->EnsureDeferredLoaded();
            levels.push_back({child, {}});
        }
    }
    // What a load has removed is not given, nor what stood below it: that comes behind it.
    std::unordered_set<const ResTreeNode*> gone;
    if (HasLeft()) {
        gone.insert(this);
    }
    const auto left = std::remove_if(list.begin() + first, list.end(), [&gone](const ResTreeNode* node) {
        const bool hasGone = node->isDefunct || node->isKept || gone.contains(node->parent);
        if (hasGone) {
            gone.insert(node);
        }
        return hasGone;
    });
    list.erase(left, list.end());
}

}  // namespace zkhw
