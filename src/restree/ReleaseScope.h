#pragma once

// While a ReleaseScope stands, what leaves a tree on this thread keeps its memory until the outermost scope ends:
// code further up the stack (a load, a merge, a walk, a change notice under way) may still hold it. A removed node
// that nobody observes even stays whole, so that it can go on serving as the source of a copy.

#include <cstdint>

namespace zkhw {

class NodeEntry;
class ResTreeNode;

class ReleaseScope {
  public:
    ReleaseScope() noexcept;
    ~ReleaseScope();
    ReleaseScope(const ReleaseScope&) = delete;
    ReleaseScope& operator=(const ReleaseScope&) = delete;

    static bool IsActive() noexcept;

    // True if a node that left a tree is kept whole.
    static bool HoldsWholeNodes() noexcept;

    // How many nodes have been kept on this thread so far, those of former scopes included.
    static uint64_t CountOfNodes() noexcept;

    // Makes sure that the next Keep of an entry can't fail, and that a node stays whole in it. Throws bad_alloc;
    // TryReserve gives false instead.
    static void Reserve();
    static bool TryReserve() noexcept;

    // Takes over what has left a tree; only while a scope is active, and, for an entry, after Reserve. A node that
    // there is no room for ends here, but its memory is kept as well.
    static void Keep(ResTreeNode* node) noexcept;
    static void Keep(NodeEntry* entry) noexcept;
};

}  // namespace zkhw
