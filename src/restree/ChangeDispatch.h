#pragma once

// One run of change notices: from a node to its observers, and on through the nodes that watch it. The nodes that are
// open at one time stand on a stack of its own, so that a chain of watching nodes may be as long as the tree is deep.

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory_resource>
#include <vector>

#include "restree/ReleaseScope.h"

namespace zkhw {

class ResTreeNode;

class ChangeDispatch {
  public:
    ChangeDispatch(const ChangeDispatch&) = delete;
    ChangeDispatch& operator=(const ChangeDispatch&) = delete;

    // Delivers what is pending of `mask` on `node`, and all that follows from it. bad_alloc if there was no memory for
    // a node on the way, whose changes then wait to be delivered; all others have been.
    static void Run(ResTreeNode& node, uint32_t mask);

  private:
    // A node whose observers are being called, or (`raised` nonzero) one that is still to hear of a change.
    struct Step {
        ResTreeNode* node;
        uint32_t raised;
        uint32_t mask;
        uint32_t saved;      // What was pending when the pass began, less what it has delivered.
        uint32_t delivered;  // What the pass delivers.
        size_t next;         // The record to call next.
        bool wasSuspended;
        const ChangeDispatch* outer;  // The run that had the node open already: an observer has asked for this one.
    };

    ChangeDispatch() { steps.reserve(stepsInPlace); }
    // If an observer throws, nodes are still open. They stay held back, but this run no longer has them.
    ~ChangeDispatch();
    void Open(ResTreeNode& node, uint32_t mask);
    static void BeginPass(Step& step);
    bool EndPass(Step& step) const;
    void RaiseInTurn(ResTreeNode& node, uint32_t changes);
    void Advance();

    // Enough for most changes: those take no memory from the heap.
    static constexpr size_t stepsInPlace = 6;

    const ReleaseScope scope;  // Outlives the steps.
    alignas(Step) std::array<std::byte, stepsInPlace * sizeof(Step)> place;
    std::pmr::monotonic_buffer_resource memory{place.data(), place.size()};
    std::pmr::vector<Step> steps{&memory};
    bool isIncomplete = false;  // A node was passed over.
};

}  // namespace zkhw
