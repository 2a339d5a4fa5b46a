// How entries and whole subtrees leave a tree.
//
// While nobody observes anything, a subtree goes without notices, in one walk that needs no memory. Otherwise each
// node of it is told, and any observer may change the tree meanwhile: what such a walk still holds is kept by a
// ReleaseScope, and an entry that an observer has removed already is known by its kind, EmptyEntry.

#include <algorithm>
#include <new>
#include <optional>
#include <unordered_set>
#include <utility>
#include <vector>

#include "restree/NodeAttachments.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

ResTreeNode::~ResTreeNode() {
    if (!isDefunct) {
        TearDown();
    }
    // What observers have added to a node that was torn down already, or what there was no memory to tell of.
    entries.VisitUnordered([](NodeEntry* entry) {
        if (entry->Child() != nullptr) {
            DestroySubtree(entry->TakeChild());
        }
    });
}

void ResTreeNode::TearDown() noexcept {
    if (!ObserverCount::IsZero()) {
        const ReleaseScope scope;
        entries.DropIndex();
        try {
            while (!entries.IsEmpty()) {
                RemoveEntry(entries.At(entries.Begin()));
            }
        } catch (const std::bad_alloc&) {
            // What is left goes with the node, and without notices.
        }
    }
    EndQuietly();
}

// All but the entries.
void ResTreeNode::EndQuietly() noexcept {
    ForgetWatching();
    isDefunct = true;
    if (attachments) {
        ReleaseLostEntries();
        ReleaseObservers();
        attachments.reset();
    }
    parent = nullptr;
}

void ResTreeNode::ReleaseLostEntries() {
    std::optional<ReleaseScope> scope;
    if (!ObserverCount::IsZero()) {
        scope.emplace();
    }
    for (NodeEntry* entry : std::exchange(attachments->lostEntries, {})) {
        if (entry->Child() != nullptr) {
            ResTreeNode* child = entry->TakeChild();
            // Destroyed when the scope ends, if there is one, so that nodes lost inside each other need no stack.
            if (ReleaseScope::IsActive()) {
                child->parent = nullptr;
                ReleaseScope::TryReserve();
                ReleaseScope::Keep(child);
            } else {
                DestroySubtree(child);
            }
        }
        NodeEntry::Release(entry);
    }
}

void ResTreeNode::ReleaseObservers() {
    ObserverList& observers = attachments->observers;
    std::unordered_set<const ResTreeNodeChangeObserver*> deleted;
    // An observer that dies here may take itself or others off the list: their records are only marked then.
    observers.SetNotifying(true);
    for (size_t place = 0; place < observers.Size(); ++place) {
        ObserverRecord& record = observers.At(place);
        if (record.state == ObserverRecord::Removed || deleted.count(record.observer) != 0) {
            continue;
        }
        ResTreeNodeChangeObserver* observer = record.observer;
        if (record.chained != nullptr) {
            EndWatch(record);
        } else if (observer != nullptr && observer->DeleteWithNode()) {
            try {
                deleted.insert(observer);
            } catch (const std::bad_alloc&) {
                observers.ForgetObserver(observer);
            }
            delete observer;
        }
    }
}

// Destroys a subtree, of which nobody is told. The nodes still to come are threaded through their parent pointers.
void ResTreeNode::DestroySubtree(ResTreeNode* top) noexcept {
    ResTreeNode* pending = top;
    pending->parent = nullptr;
    while (pending != nullptr) {
        ResTreeNode* node = pending;
        pending = node->parent;
        node->entries.VisitUnordered([&pending](NodeEntry* entry) {
            if (entry->Child() != nullptr) {
                ResTreeNode* child = entry->TakeChild();
                child->parent = pending;
                pending = child;
            }
        });
        if (node->attachments) {
            for (NodeEntry* entry : node->attachments->lostEntries) {
                if (entry->Child() != nullptr) {
                    ResTreeNode* child = entry->TakeChild();
                    child->parent = pending;
                    pending = child;
                }
            }
        }
        node->EndQuietly();
        delete node;
    }
}

bool ResTreeNode::HasLeft() const {
    if (isDefunct || !ReleaseScope::HoldsWholeNodes()) {
        return isDefunct;
    }
    const ResTreeNode* node = this;
    while (node != nullptr && !node->isKept) {
        node = node->parent;
    }
    return node != nullptr;
}

void ResTreeNode::ReleaseNode(ResTreeNode* node) noexcept {
    if (ObserverCount::IsZero()) {
        if (ReleaseScope::IsActive()) {
            ReleaseScope::Keep(node);
        } else {
            DestroySubtree(node);
        }
        return;
    }
    if (ReleaseScope::IsActive()) {
        node->TearDown();
        ReleaseScope::Keep(node);
    } else {
        delete node;
    }
}

void ResTreeNode::Destroy(ResTreeNode* root) noexcept {
    if (root != nullptr) {
        // Keeping it needs no room.
        if (ReleaseScope::IsActive()) {
            ReleaseScope::TryReserve();
        }
        ReleaseNode(root);
    }
}

void ResTreeNode::RemoveEntry(EntryIterator iterator) {
    if (!iterator.IsEnd()) {
        RemoveEntry(&*iterator);
    }
}

void ResTreeNode::RemoveEntry(NodeEntry* entry) {
    ResTreeNode* child = entry->Child();
    if (child == nullptr || ObserverCount::IsZero()) {
        FinishRemoval(entry);
        return;
    }
    const ReleaseScope scope;
    child->Raise(NodeDeleting);
    child->RetireDescendants();
    child->Raise(NodeDeleted);
    if (StillHolds(entry)) {
        FinishRemoval(entry);
    }
}

// False if an observer has removed the entry meanwhile, or lost it by renaming it over another one.
bool ResTreeNode::StillHolds(const NodeEntry* entry) const {
    if (entry->Kind() == EmptyEntry) {
        return false;
    }
    return !attachments || std::find(attachments->lostEntries.begin(), attachments->lostEntries.end(), entry) ==
                               attachments->lostEntries.end();
}

// The removal itself, when all who watch a child have been told.
void ResTreeNode::FinishRemoval(NodeEntry* entry) {
    std::optional<ReleaseScope> scope;
    if (!ObserverCount::IsZero()) {
        scope.emplace();
    }
    if (ReleaseScope::IsActive()) {
        ReleaseScope::Reserve();
    }
    const bool isText = entry->IsText();
    entries.Detach(entries.Locate(entry));
    ResTreeNode* child = entry->Child();
    if (child != nullptr) {
        entry->TakeChild();
    } else {
        entry->ReleaseText();
    }
    if (ReleaseScope::IsActive()) {
        ReleaseScope::Keep(entry);
    } else {
        NodeEntry::Release(entry);
    }
    if (child != nullptr) {
        ReleaseNode(child);
    }
    Raise(isText ? PropertyRemoved : ChildRemoved);
}

std::vector<NodeEntry*> ResTreeNode::ChildEntriesInRemovalOrder() const {
    std::vector<NodeEntry*> children;
    for (EntryPosition position = entries.Begin(); !position.IsEnd(); position = entries.Next(position)) {
        if (entries.At(position)->Child() != nullptr) {
            children.push_back(entries.At(position));
        }
    }
    // From the last to the first in an ordered node, by key in an unordered one.
    if (IsOrdered()) {
        std::reverse(children.begin(), children.end());
    }
    return children;
}

// Removes all nodes below, each with its notices. Every node of an open level still stands, unless an observer has
// removed it, which its entry tells.
void ResTreeNode::RetireDescendants() {
    struct Level {
        ResTreeNode* node;
        NodeEntry* entry;  // Of `node` in the level above; null for the topmost level.
        std::vector<NodeEntry*> children;
        size_t next = 0;
    };
    std::vector<Level> levels;
    levels.push_back({this, nullptr, ChildEntriesInRemovalOrder()});
    while (true) {
        Level& level = levels.back();
        if (level.next < level.children.size()) {
            ResTreeNode* node = level.node;
            NodeEntry* entry = level.children[level.next++];
            if (node->StillHolds(entry)) {
                ResTreeNode* child = entry->Child();
                child->Raise(NodeDeleting);
                if (node->StillHolds(entry)) {
                    levels.push_back({child, entry, child->ChildEntriesInRemovalOrder()});
                }
            }
            continue;
        }
        if (levels.size() == 1) {
            return;
        }
        ResTreeNode* node = level.node;
        NodeEntry* entry = level.entry;
        levels.pop_back();
        node->Raise(NodeDeleted);
        if (levels.back().node->StillHolds(entry)) {
            levels.back().node->FinishRemoval(entry);
        }
    }
}

void ResTreeNode::RemoveChildNodes() {
    entries.DropIndex();
    if (!ObserverCount::IsZero()) {
        const ReleaseScope scope;
        RetireDescendants();
        return;
    }
    for (NodeEntry* entry : ChildEntriesInRemovalOrder()) {
        FinishRemoval(entry);
    }
}

void ResTreeNode::RemoveEntryByName(HashedKey key) {
    if (NodeEntry* entry = Find(key)) {
        RemoveEntry(entry);
    }
}

}  // namespace zkhw
