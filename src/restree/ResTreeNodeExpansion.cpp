// Expansion of parameters in a subtree, and how nodes note where there is something to expand: each of many files that
// one node includes has its parameters looked for in all of that node.

#include "restree/LevelStack.h"
#include "restree/ObserverList.h"
#include "restree/Parameters.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

// --- Notes of where variables are ---

// Who is noted is noted by all above, in the entry that leads to it.
void ResTreeNode::NoteVariables(const NodeEntry* entry) noexcept {
    ResTreeNode* node = this;
    node->entries.NoteVariables(entry);
    while (!node->mayHoldVariables) {
        node->mayHoldVariables = true;
        const ResTreeNode& child = *node;
        node = node->parent;
        if (node == nullptr) {
            return;
        }
        node->entries.NoteVariables(node->entries.TellsVariablesApart() ? node->EntryOfChild(child) : nullptr);
    }
}

// Null if it can't be told, as where another entry has the child's name as its key.
const NodeEntry* ResTreeNode::EntryOfChild(const ResTreeNode& child) const noexcept {
    // Who is just being read is the last one of an ordered node.
    const NodeEntry* entry = entries.IsEmpty() ? nullptr : entries.At(entries.Last());
    if (entry == nullptr || entry->Child() != &child) {
        try {
            entry = FindRaw(child.GetName());
        } catch (...) {
            entry = nullptr;
        }
    }
    return entry != nullptr && entry->Child() == &child ? entry : nullptr;
}

// --- The walk ---

// Goes from level to level and leaves out what holds no variables as far as is noted. The notes are put right on the
// way, so that the next walk has less to do. Observers and loads can change anything under the walk, and then the
// levels that are open are walked to their ends entry by entry, and their notes stay as they are.
struct ResTreeNode::ExpansionWalk {
    struct Level {
        ResTreeNode* node;
        uint32_t disturbances;  // How many there had been when the walk came here.
        EntryPosition position{};
        NodeEntry* last = nullptr;  // Stood at `position` when it was given; null before the first.
        // Whether variables are left: among the entries before, and in the piece of the list that `position` is in.
        bool keepsVariables = false;
        bool pieceKeepsVariables = false;
    };

    explicit ExpansionWalk(const Parameters& parameters) : parameters(parameters) {}

    void Run(ResTreeNode& top);

  private:
    bool IsUndisturbed(const Level& level) const { return !isObserved && level.disturbances == disturbances; }
    void Enter(ResTreeNode& node);
    void Leave();
    NodeEntry* Next(Level& level);
    void Expand(Level& level, NodeEntry& entry, std::u16string_view text);

    const ReleaseScope scope;
    const Parameters& parameters;
    const bool isObserved = !ObserverCount::IsZero();
    uint32_t disturbances = 0;
    LevelStack<Level> levels;
};

void ResTreeNode::ExpansionWalk::Run(ResTreeNode& top) {
    Enter(top);
    while (!levels.IsEmpty()) {
        Level& level = levels.Top();
        NodeEntry* entry = Next(level);
        if (entry == nullptr) {
            Leave();
        } else if (const auto text = entry->Text()) {
            Expand(level, *entry, *text);
        } else if (ResTreeNode* child = entry->Child()) {
            Enter(*child);
        }
    }
}

void ResTreeNode::ExpansionWalk::Enter(ResTreeNode& node) {
    if (node.HasDeferredContents()) {
        ++disturbances;
        node.EnsureDeferredLoaded();
    }
    if (node.mayHoldVariables || node.mayBeDeferred) {
        levels.Push({&node, disturbances});
    }
}

void ResTreeNode::ExpansionWalk::Leave() {
    const Level& level = levels.Top();
    ResTreeNode& node = *level.node;
    if (IsUndisturbed(level)) {
        node.mayHoldVariables = level.keepsVariables;
    }
    levels.Pop();
    if (!levels.IsEmpty()) {
        levels.Top().pieceKeepsVariables |= node.mayHoldVariables;
    }
}

// Null at the end.
NodeEntry* ResTreeNode::ExpansionWalk::Next(Level& level) {
    EntryList& list = level.node->entries;
    const EntryPosition previous = level.position;
    const bool isFirst = level.last == nullptr;
    level.position = isFirst ? list.Begin() : list.Following(previous, level.last);
    if (IsUndisturbed(level)) {
        if (!isFirst && level.position.piece != previous.piece) {
            if (!level.pieceKeepsVariables) {
                list.ForgetVariables(previous);
            }
            level.keepsVariables |= level.pieceKeepsVariables;
            level.pieceKeepsVariables = false;
        }
        level.position = list.SkipWithoutVariables(level.position);
    }
    level.last = level.position.IsEnd() ? nullptr : list.At(level.position);
    return level.last;
}

void ResTreeNode::ExpansionWalk::Expand(Level& level, NodeEntry& entry, std::u16string_view text) {
    const size_t open = FindVariable(text);
    if (open == std::u16string_view::npos) {
        return;
    }
    TextBuilder expanded;
    ExpandVariables(text, parameters, expanded, open);
    level.pieceKeepsVariables |= FindVariable(expanded.View()) != std::u16string_view::npos;
    level.node->SetEntryText(&entry, expanded.View());
}

void ResTreeNode::ApplyParameters(const Parameters& parameters) {
    if (mayHoldVariables || mayBeDeferred) {
        ExpansionWalk(parameters).Run(*this);
    }
}

void ResTreeNode::ApplyInstance(std::u16string_view instanceName, std::u16string_view variable, int32_t index) {
    ApplyParameters(InstanceParameters(instanceName, variable, index));
}

}  // namespace zkhw
