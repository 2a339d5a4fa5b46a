// Merges and deep copies. A merge walks the source and fills the target at the same time, level by level on a stack
// of its own. What the target gains on the way is never entered as a source, so a node can be merged with a node
// above it; and what the merge removes stays readable until it ends (ReleaseScope).

#include <utility>

#include "restree/EntryWalk.h"
#include "restree/LevelStack.h"
#include "restree/NodePath.h"
#include "restree/Parameters.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace zkhw {

struct ResTreeNode::MergeWalk {
    struct Level {
        ResTreeNode* target;
        ResTreeNode* source;
        // What is done for an entry may change the source: observers do, and a source that stands below the target
        // can be replaced or filled by the merge itself.
        EntryWalk walk;
        // As long as the target has nothing but what was copied from a source of its own form: how many entries. They
        // then come in the target's order. Else unknownOrder.
        uint32_t copiedInOrder;
        // Paths of the two, made for the first link.
        String sourcePath = String::WithoutBuffer();
        String targetPath = String::WithoutBuffer();
        bool hasPaths = false;
    };

    static constexpr uint32_t unknownOrder = 0xFFFFFFFF;

    // With `parameters` every text is expanded as it comes in; only if MayExpandWhileMerging.
    MergeWalk(ResTreeNode& target, ResTreeNode& source, bool overwrite, const Parameters* parameters)
        : top(&target), overwrite(overwrite), parameters(parameters) {
        Enter(target, source);
    }

    void Run();
    void Enter(ResTreeNode& target, ResTreeNode& source) {
        if (&target != &source) {
            uint32_t copiedInOrder = unknownOrder;
            if (target.entries.IsEmpty()) {
                target.entries.Reserve(source.entries.Size());
                copiedInOrder = target.IsOrdered() || source.IsOrdered() ? unknownOrder : 0;
            }
            levels.Push({&target, &source, {}, copiedInOrder});
        }
    }
    void MergeText(Level& level, const NodeEntry& entry);
    void StoreText(Level& level, const NodeEntry& entry, std::u16string_view text, bool holdsVariables);
    void MergeLink(Level& level, const NodeEntry& entry);

    const ReleaseScope scope;
    ResTreeNode* top;
    bool overwrite;
    const Parameters* parameters;
    LevelStack<Level> levels;
};

void ResTreeNode::MergeWalk::Run() {
    while (!levels.IsEmpty()) {
        Level& level = levels.Top();
        const NodeEntry* entry = level.walk.Next(level.source->entries);
        if (entry == nullptr) {
            levels.Pop();
        } else if (entry->IsText()) {
            MergeText(level, *entry);
        } else if (entry->Kind() == LinkEntry) {
            MergeLink(level, *entry);
        } else if (ResTreeNode* sourceChild = entry->Child(); sourceChild != nullptr && sourceChild != top) {
            NodeEntry* placed = nullptr;
            if (ResTreeNode* child = level.target->PrepareClone(EntryList::End(), {entry->Key(), entry->KeyHash()},
                                                                *sourceChild, overwrite, placed)) {
                Enter(*child, *sourceChild);
            }
        }
    }
}

void ResTreeNode::MergeWalk::MergeText(Level& level, const NodeEntry& entry) {
    const std::u16string_view text = *entry.Text();
    const size_t open = level.source->mayHoldVariables ? FindVariable(text) : std::u16string_view::npos;
    const bool holdsVariables = open != std::u16string_view::npos;
    if (parameters == nullptr || !holdsVariables) {
        StoreText(level, entry, text, holdsVariables);
        return;
    }
    TextBuilder expanded;
    ExpandVariables(text, *parameters, expanded, open);
    StoreText(level, entry, expanded.View(), FindVariable(expanded.View()) != std::u16string_view::npos);
    if (level.target == top) {
        // Nobody hears of nodes that are just being made, but the node that holds the new one may gather its changes.
        top->RaiseTextChange(entry);
    }
}

void ResTreeNode::MergeWalk::StoreText(Level& level, const NodeEntry& entry, std::u16string_view text,
                                       bool holdsVariables) {
    ResTreeNode& target = *level.target;
    const HashedKey key(entry.Key(), entry.KeyHash());
    if (level.copiedInOrder == target.entries.Size()) {
        // The search would end at the end.
        ++level.copiedInOrder;
        target.Store(EntryList::End(), NodeEntry::MakeText(key, entry.Kind(), text), PropertyAdded, holdsVariables);
        return;
    }
    const Added added = target.AddText(key, text, entry.Kind(), PropertyAdded, nullptr, holdsVariables);
    if (!added.isNew && overwrite) {
        target.SetEntryText(added.entry, text);
    }
}

void ResTreeNode::MergeWalk::MergeLink(Level& level, const NodeEntry& entry) {
    if (!level.hasPaths) {
        level.sourcePath = level.source->GetPath();
        level.targetPath = level.target->GetPath();
        level.hasPaths = true;
    }
    // The text of the link counts as one further component of the path, slashes and all.
    const String linkTarget = JoinList(level.sourcePath, *entry.LinkPath(), u'/', false, true);
    const String path = MakeRelativeNodePath(linkTarget, level.targetPath);
    const Added added = level.target->AddLinkEntry(entry.Key(), path.View());
    if (!added.isNew && overwrite) {
        level.target->SetEntryText(added.entry, path.View());
    }
}

void ResTreeNode::MergeFrom(ResTreeNode& source, bool overwrite) {
    MergeWalk(*this, source, overwrite, nullptr).Run();
}

// Whether texts may be expanded on their way from `source` into this node: it has just been made, no observer can look
// at it in between, and no load comes between the copy and the expansion.
bool ResTreeNode::MayExpandWhileMerging(const ResTreeNode& source) const {
    const bool isObserved = MayBeHeard() || (parent != nullptr && parent->attachments);
    return entries.IsEmpty() && !isObserved && !source.mayBeDeferred;
}

void ResTreeNode::MergeExpanded(ResTreeNode& source, bool overwrite, const Parameters& parameters) {
    if (MayExpandWhileMerging(source)) {
        MergeWalk(*this, source, overwrite, &parameters).Run();
    } else {
        MergeFrom(source, overwrite);
        ApplyParameters(parameters);
    }
}

// All of a clone but the merge. Gives the child that is to receive it, or null if another kind of entry holds
// the place or an observer has removed the child already.
ResTreeNode* ResTreeNode::PrepareClone(EntryPosition position, HashedKey key, ResTreeNode& source, bool overwrite,
                                       NodeEntry*& entry) {
    // Ahead of what is removed and loaded, which may change the source.
    NameAndType childTexts(key.text, source.GetType());
    key.text = childTexts.Name();
    if (IsOrdered()) {
        if (const NodeEntry* found = FindRaw(key)) {
            const EntryPosition foundPosition = entries.Locate(found);
            const uint32_t foundIndex = entries.IndexOf(foundPosition);
            uint32_t index = entries.IndexOf(position);
            const bool isThatEntry = foundPosition == position;
            if (foundIndex < index) {
                // One less for the entry that is about to go, and one less as well if it then stays.
                --index;
            }
            RemoveIfMismatched(!overwrite, key, childTexts.Type(), source.IsOrdered());
            position = isThatEntry ? EntryList::End() : entries.AtIndex(index);
        } else if (!overwrite && HasDeferredContents()) {
            // What comes in now may bring what is to be removed.
            const uint32_t index = position.IsEnd() ? 0 : entries.IndexOf(position);
            RemoveEntryByName(key);
            position = position.IsEnd() ? position : entries.AtIndex(index);
        }
    }
    ResTreeNode* child = nullptr;
    entry = IsOrdered()
                ? AddChildAt(position, key, std::move(childTexts), source.IsOrdered(), child).entry
                : ReplaceChild(!overwrite, std::move(childTexts), key.hash, source.IsOrdered(), child, nullptr).entry;
    return StillHolds(entry) ? child : nullptr;
}

EntryIterator ResTreeNode::CloneSubtreeInto(EntryIterator position, std::u16string_view key, ResTreeNode& source,
                                            bool overwrite, ResTreeNode*& child) {
    const ReleaseScope scope;
    NodeEntry* entry = nullptr;
    child = PrepareClone(position.Position(), key, source, overwrite, entry);
    if (child != nullptr) {
        child->MergeFrom(source, overwrite);
    }
    if (!StillHolds(entry)) {
        child = nullptr;
        return {entries, EntryList::End()};
    }
    return {entries, entries.Locate(entry)};
}

NodeEntry* ResTreeNode::CloneExpandedBehind(const NodeEntry* behind, std::u16string_view key, ResTreeNode& source,
                                            bool overwrite, const Parameters& parameters) {
    const ReleaseScope scope;
    EntryPosition position = EntryList::End();
    // An unordered node has no use for a position, and need not be put into its order for one.
    if (IsOrdered() && StillHolds(behind)) {
        position = entries.Next(entries.Locate(behind));
    }
    NodeEntry* entry = nullptr;
    ResTreeNode* child = PrepareClone(position, key, source, overwrite, entry);
    if (child == nullptr) {
        return nullptr;
    }
    if (child->MayExpandWhileMerging(source)) {
        MergeWalk(*child, source, overwrite, &parameters).Run();
        return entry;
    }
    child->MergeFrom(source, overwrite);
    if (!StillHolds(entry)) {
        return nullptr;
    }
    child->ApplyParameters(parameters);
    return entry;
}

std::unique_ptr<ResTreeNode> ResTreeNode::Clone() {
    auto clone = std::make_unique<ResTreeNode>(GetName(), GetType(), IsOrdered(), GetTypeTable());
    clone->MergeFrom(*this, false);
    return clone;
}

}  // namespace zkhw
