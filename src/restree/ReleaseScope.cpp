#include "restree/ReleaseScope.h"

#include <new>
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
// Of nodes, reserved and not yet taken.
constinit thread_local uint32_t heldPlaces = 0;

// Null while nothing is kept. Neither is destroyed at the end of a thread: the tree of the process is taken down when
// that of the main thread is over.
constinit thread_local Kept* kept = nullptr;

// Releasing a node may call an observer, which may remove more.
void ReleaseKept(void (*release)(ResTreeNode*)) {
    while (!(kept->nodes.empty() && kept->entries.empty())) {
        if (!kept->nodes.empty()) {
            ResTreeNode* node = kept->nodes.back();
            kept->nodes.pop_back();
            release(node);
        } else {
            NodeEntry* entry = kept->entries.back();
            kept->entries.pop_back();
            NodeEntry::Release(entry);
        }
    }
}

}  // namespace

ReleaseScope::ReleaseScope() noexcept {
    ++depth;
}

ReleaseScope::~ReleaseScope() {
    // The last scope stands until all is released.
    if (depth == 1 && kept != nullptr) {
        ReleaseKept([](ResTreeNode* node) {
            node->parent = nullptr;
            delete node;
        });
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
    const size_t taken = kept->nodes.size() + heldPlaces;
    if (taken >= kept->nodes.capacity()) {
        kept->nodes.reserve(taken * 2 + 8);
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

void ReleaseScope::HoldPlace(int32_t change) noexcept {
    heldPlaces += static_cast<uint32_t>(change);
}

bool ReleaseScope::HoldsWholeNodes() noexcept {
    return kept != nullptr && kept->hasWholeNodes;
}

void ReleaseScope::Keep(ResTreeNode* node) noexcept {
    node->isKept = 1;
    kept->hasWholeNodes |= node->isDefunct == 0;
    ++countOfNodes;
    kept->nodes.push_back(node);
}

void ReleaseScope::Keep(NodeEntry* entry) noexcept {
    kept->entries.push_back(entry);
}

}  // namespace zkhw
