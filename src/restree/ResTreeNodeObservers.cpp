// Who hears of a node's changes, and how a node comes to watch others.

#include <algorithm>
#include <new>
#include <typeinfo>
#include <unordered_set>

#include "restree/ChangeDispatch.h"
#include "restree/NodeAttachments.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

constexpr int32_t anyContext = ObserverList::anyContext;
constexpr int32_t ancestorContext = 1;   // The watching node stands below.
constexpr int32_t dependantContext = 2;  // The watching node reserves this one with it.
constexpr uint32_t ancestorMask = NodeNameChanged | AncestorChanged;

// The observer if it is a node and nothing more, so that what it does with a notice is known; else null.
ResTreeNode* AsPlainNode(ResTreeNodeChangeObserver* observer) {
    return observer != nullptr && typeid(*observer) == typeid(ResTreeNode) ? static_cast<ResTreeNode*>(observer)
                                                                           : nullptr;
}

}  // namespace

// --- Delivery ---

uint32_t ResTreeNode::BeginChanges() {
    const uint32_t saved = pendingChanges;
    pendingChanges = 0;
    ++suspendCount;
    return saved;
}

void ResTreeNode::EndChanges(uint32_t saved, bool replace) {
    pendingChanges = replace ? saved : pendingChanges | saved;
    if (--suspendCount == 0) {
        DispatchChanges(allChanges);
    }
}

void ResTreeNode::DispatchChanges(uint32_t mask) {
    if (suspendCount == 0 && (!attachments || attachments->observers.IsEmpty())) {
        pendingChanges &= ~mask;
        return;
    }
    ChangeDispatch::Run(*this, mask);
}

void ResTreeNode::RaiseObserved(uint32_t changes) {
    if (isDefunct) {
        return;
    }
    pendingChanges |= changes;
    if (suspendCount == 0) {
        DispatchChanges(allChanges);
    }
}

void ResTreeNode::OnNodeChanged(ResTreeNode*, uint32_t changes, int32_t) {
    const ReleaseScope scope;
    if ((changes & ancestorMask) != 0) {
        Raise(changes & ancestorMask);
    }
    if ((changes & ReservationChanged) != 0) {
        Raise(ReservationChanged);
    }
}

// --- Registration ---

bool ResTreeNode::AnyActiveObserver(uint32_t mask) const {
    return attachments && attachments->observers.HasActive(mask);
}

// The record itself, without what AddObserver does on top. True if it is new.
bool ResTreeNode::Register(ResTreeNodeChangeObserver* observer, uint32_t mask, int32_t context, ResTreeNode* chained) {
    ObserverList& observers = GetAttachments().observers;
    if (ObserverRecord* record = observers.FindActive(observer, context)) {
        observers.SetMask(*record, mask);
        return false;
    }
    if (chained == nullptr) {
        observers.Append(observer, context, mask, nullptr);
        return true;
    }
    std::vector<Attachments::Watch>& watched = chained->GetAttachments().watched;
    if (watched.size() == watched.capacity()) {
        watched.reserve(watched.size() * 2 + 1);
    }
    ObserverRecord& record = observers.Append(observer, context, mask, chained);
    record.watchSlot = static_cast<uint32_t>(watched.size());
    watched.push_back({this, record.serial});
    return true;
}

// Takes out the first matching record, also one that waits for the end of a dispatch to become active: its observer
// may be about to die. True if there was one.
bool ResTreeNode::Unregister(ResTreeNodeChangeObserver* observer, int32_t context) {
    ObserverRecord* record = attachments ? attachments->observers.FindPresent(observer, context) : nullptr;
    if (record == nullptr) {
        return false;
    }
    EndWatch(*record);
    attachments->observers.Remove(*record);
    return true;
}

// Takes the record off the list of its watching node, if it has one: the node may be gone before the record is.
void ResTreeNode::EndWatch(ObserverRecord& record) noexcept {
    if (record.chained == nullptr) {
        return;
    }
    std::vector<Attachments::Watch>& watched = record.chained->attachments->watched;
    // The last one takes its slot. It may be this very record.
    const Attachments::Watch moved = watched.back();
    moved.node->attachments->observers.WithSerial(moved.serial).watchSlot = record.watchSlot;
    watched[record.watchSlot] = moved;
    watched.pop_back();
    record.chained = nullptr;
}

bool ResTreeNode::WatchAncestors() {
    bool anyNew = false;
    for (ResTreeNode* node = this; node->parent != nullptr; node = node->parent) {
        anyNew |= node->parent->Register(node, ancestorMask, ancestorContext, node);
    }
    return anyNew;
}

bool ResTreeNode::WatchDependants() {
    struct Level {
        ResTreeNode* node;
        std::vector<ResTreeNode*> dependants;
        size_t next = 0;
    };
    // A node that has been walked once has all its dependants registered already, so cycles and repeated paths end.
    const ReleaseScope scope;
    bool anyNew = false;
    std::unordered_set<ResTreeNode*> walked;
    std::vector<Level> levels;
    const auto enter = [&](ResTreeNode* node) {
        if (walked.insert(node).second) {
            levels.push_back({node, {}});
            node->GetDependants(levels.back().dependants, false);
        }
    };
    enter(this);
    while (!levels.empty()) {
        Level& level = levels.back();
        // The load of a deferred content may have removed the node itself, or one that an earlier step has found.
        if (level.next == level.dependants.size() || level.node->HasLeft()) {
            levels.pop_back();
            continue;
        }
        ResTreeNode* dependant = level.dependants[level.next++];
        if (!dependant->HasLeft()) {
            // A dependant hears of its own before the next one is registered: that is the order of notices.
            anyNew |= dependant->Register(level.node, ReservationChanged, dependantContext, level.node);
            enter(dependant);
        }
    }
    return anyNew;
}

// The record `observer`, `context` of `node`, and what nodes no longer have to watch for its sake. Without memory to
// find that out nodes may go on watching dependants, which nobody hears of, but none goes on watching those above it:
// that would reach others.
bool ResTreeNode::RemoveRecords(ResTreeNode& node, ResTreeNodeChangeObserver* observer, int32_t context) {
    const ReleaseScope scope;
    if (!UnregisterAll(node, observer, context)) {
        return false;
    }
    try {
        EndWatchesOf(node);
    } catch (const std::bad_alloc&) {
        for (ResTreeNode* from = &node; from->parent != nullptr && !from->AnyActiveObserver(AncestorChanged);
             from = from->parent) {
            UnregisterAll(*from->parent, from, ancestorContext);
        }
    }
    return true;
}

bool ResTreeNode::UnregisterAll(ResTreeNode& node, ResTreeNodeChangeObserver* observer, int32_t context) {
    bool any = false;
    while (node.Unregister(observer, context)) {
        any = true;
    }
    return any;
}

// `top` has lost a record, so it may have less to watch, and so may those that it has watched.
void ResTreeNode::EndWatchesOf(ResTreeNode& top) {
    struct Removal {
        ResTreeNode* node;
        ResTreeNode* observer;
        int32_t context;
    };
    std::vector<Removal> open;
    std::vector<ResTreeNode*> dependants;
    const auto enter = [&](ResTreeNode* from) {
        if (from->parent != nullptr && !from->AnyActiveObserver(AncestorChanged)) {
            open.push_back({from->parent, from, ancestorContext});
        }
        if (!from->AnyActiveObserver(ReservationChanged)) {
            dependants.clear();
            from->GetDependants(dependants, true);
            for (ResTreeNode* dependant : dependants) {
                open.push_back({dependant, from, dependantContext});
            }
        }
    };
    enter(&top);
    while (!open.empty()) {
        const Removal removal = open.back();
        open.pop_back();
        if (UnregisterAll(*removal.node, removal.observer, removal.context)) {
            enter(removal.node);
        }
    }
}

bool ResTreeNode::AddObserver(ResTreeNodeChangeObserver* observer, uint32_t mask, int32_t context) {
    if (isDefunct) {
        return false;
    }
    const bool isNew = Register(observer, mask, context, AsPlainNode(observer));
    bool anyNew = isNew;
    try {
        if ((mask & AncestorChanged) != 0) {
            anyNew |= WatchAncestors();
        }
        if ((mask & ReservationChanged) != 0) {
            anyNew |= WatchDependants();
        }
    } catch (...) {
        if (isNew) {
            RemoveRecords(*this, observer, context);
        }
        throw;
    }
    return anyNew;
}

bool ResTreeNode::RemoveObserver(ResTreeNodeChangeObserver* observer, int32_t context, bool recursive) {
    if (!recursive) {
        return RemoveRecords(*this, observer, context);
    }
    const ReleaseScope scope;
    bool removedAny = false;
    std::vector<ResTreeNode*> open{this};
    while (!open.empty()) {
        ResTreeNode* node = open.back();
        open.pop_back();
        removedAny |= RemoveRecords(*node, observer, context);
        const size_t first = open.size();
        for (EntryIterator entry = node->BeginLoaded(); !entry.IsEnd(); ++entry) {
            if (ResTreeNode* child = entry->Child()) {
                open.push_back(child);
            }
        }
        std::reverse(open.begin() + static_cast<std::ptrdiff_t>(first), open.end());
    }
    return removedAny;
}

void ResTreeNode::ForgetWatching() noexcept {
    while (attachments && !attachments->watched.empty()) {
        RemoveRecords(*attachments->watched.back().node, this, anyContext);
    }
}

void ResTreeNode::GetDependants(std::vector<ResTreeNode*>& list, bool raw) {
    constexpr std::u16string_view key = u"Reserves";
    const ReleaseScope scope;
    const NodeEntry* entry = raw ? FindRaw(key) : Find(key);
    if (entry == nullptr || !entry->IsText()) {
        return;
    }
    std::vector<String> paths;
    SplitList(*entry->Text(), u',', paths, true);
    const size_t first = list.size();
    const uint64_t removals = ReleaseScope::CountOfNodes();
    LookUpAll(paths, list);
    if (ReleaseScope::CountOfNodes() != removals) {
        // A load on the way has removed nodes, and what was found before it may be among them. All is loaded now.
        list.resize(first);
        LookUpAll(paths, list);
        list.erase(std::remove_if(list.begin() + static_cast<std::ptrdiff_t>(first), list.end(),
                                  [](const ResTreeNode* node) { return node->HasLeft(); }),
                   list.end());
    }
}

void ResTreeNode::LookUpAll(const std::vector<String>& paths, std::vector<ResTreeNode*>& list) {
    for (const String& path : paths) {
        if (ResTreeNode* node = Lookup(path.View(), nullptr)) {
            list.push_back(node);
        }
    }
}

}  // namespace zkhw
