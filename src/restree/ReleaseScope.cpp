#include "restree/ReleaseScope.h"

#include <vector>

#include "restree/NodeEntry.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

namespace {

struct Kept {
    uint32_t depth = 0;
    std::vector<ResTreeNode*> nodes;
    std::vector<NodeEntry*> entries;
};

thread_local Kept kept;

}  // namespace

ReleaseScope::ReleaseScope() noexcept {
    ++kept.depth;
}

ReleaseScope::~ReleaseScope() {
    // The last scope stands until all is released: releasing a node may call an observer, which may remove more.
    while (kept.depth == 1 && !(kept.nodes.empty() && kept.entries.empty())) {
        if (!kept.nodes.empty()) {
            ResTreeNode* node = kept.nodes.back();
            kept.nodes.pop_back();
            node->parent = nullptr;
            delete node;
        } else {
            NodeEntry* entry = kept.entries.back();
            kept.entries.pop_back();
            NodeEntry::Release(entry);
        }
    }
    --kept.depth;
}

bool ReleaseScope::IsActive() noexcept {
    return kept.depth != 0;
}

void ReleaseScope::Reserve() {
    if (kept.nodes.size() == kept.nodes.capacity()) {
        kept.nodes.reserve(kept.nodes.size() * 2 + 8);
    }
    if (kept.entries.size() == kept.entries.capacity()) {
        kept.entries.reserve(kept.entries.size() * 2 + 8);
    }
}

void ReleaseScope::Keep(ResTreeNode* node) noexcept {
    kept.nodes.push_back(node);
}

void ReleaseScope::Keep(NodeEntry* entry) noexcept {
    kept.entries.push_back(entry);
}

}  // namespace zkhw
