#include "restree/ReleaseScope.h"

#include <new>
#include <utility>
#include <vector>

#include "restree/NodeEntry.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

namespace {

struct Kept {
    std::vector<ResTreeNode*> nodes;
    std::vector<NodeEntry*> entries;
    bool hasWholeNodes = false;
};

constinit thread_local uint32_t depth = 0;
constinit thread_local uint64_t countOfNodes = 0;
// Nodes that have ended and that `kept` had no room for, each with the next one as its parent.
constinit thread_local ResTreeNode* withoutRoom = nullptr;

// Null while nothing is kept. Neither is destroyed at the end of a thread: the tree of the process is taken down when
// that of the main thread is over.
constinit thread_local Kept* kept = nullptr;

// The next node to release, or null.
template <typename Next>
ResTreeNode* TakeNode(Next next) {
    if (withoutRoom != nullptr) {
        return std::exchange(withoutRoom, next(withoutRoom));
    }
    if (kept == nullptr || kept->nodes.empty()) {
        return nullptr;
    }
    ResTreeNode* node = kept->nodes.back();
    kept->nodes.pop_back();
    return node;
}

NodeEntry* TakeEntry() {
    if (kept == nullptr || kept->entries.empty()) {
        return nullptr;
    }
    NodeEntry* entry = kept->entries.back();
    kept->entries.pop_back();
    return entry;
}

}  // namespace

ReleaseScope::ReleaseScope() noexcept {
    ++depth;
}

ReleaseScope::~ReleaseScope() {
    // The last scope stands until all is released: that may call an observer, which may remove more.
    if (depth == 1 && (kept != nullptr || withoutRoom != nullptr)) {
        while (true) {
            if (ResTreeNode* node = TakeNode([](const ResTreeNode* last) { return last->parent; })) {
                node->parent = nullptr;
                delete node;
            } else if (NodeEntry* entry = TakeEntry()) {
                NodeEntry::Release(entry);
            } else {
                break;
            }
        }
        delete kept;
        kept = nullptr;
    }
    --depth;
}

bool ReleaseScope::IsActive() noexcept {
    return depth != 0;
}

uint64_t ReleaseScope::CountOfNodes() noexcept {
    return countOfNodes;
}

void ReleaseScope::Reserve() {
    if (kept == nullptr) {
        kept = new Kept;
    }
    if (kept->nodes.size() == kept->nodes.capacity()) {
        kept->nodes.reserve(kept->nodes.size() * 2 + 8);
    }
    if (kept->entries.size() == kept->entries.capacity()) {
        kept->entries.reserve(kept->entries.size() * 2 + 8);
    }
}

bool ReleaseScope::TryReserve() noexcept {
    try {
        Reserve();
    } catch (const std::bad_alloc&) {
        return false;
    }
    return true;
}

bool ReleaseScope::HoldsWholeNodes() noexcept {
    return kept != nullptr && kept->hasWholeNodes;
}

void ReleaseScope::Keep(ResTreeNode* node) noexcept {
    node->isKept = true;
    ++countOfNodes;
    if (kept == nullptr || kept->nodes.size() == kept->nodes.capacity()) {
        if (!node->isDefunct) {
            node->TearDown();
        }
        node->parent = withoutRoom;
        withoutRoom = node;
        return;
    }
    kept->hasWholeNodes |= !node->isDefunct;
    kept->nodes.push_back(node);
}

void ReleaseScope::Keep(NodeEntry* entry) noexcept {
    kept->entries.push_back(entry);
}

}  // namespace zkhw
