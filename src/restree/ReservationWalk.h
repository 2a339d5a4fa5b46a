#pragma once

// A walk that reserves or releases nodes with their dependants for one owner, on a stack of its own: lists of
// dependants may form chains as long as memory allows, and circles. Reserving takes all or nothing.

#include <cstddef>
#include <cstdint>
#include <unordered_map>
#include <unordered_set>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "restree/ReleaseScope.h"

namespace zkhw {

using qn::dsc::String;

class ResTreeNode;

class ReservationWalk {
  public:
    // The owner is copied: an observer may release what the text was taken from.
    explicit ReservationWalk(const String& owner) : owner(owner) {}
    ReservationWalk(const ReservationWalk&) = delete;
    ReservationWalk& operator=(const ReservationWalk&) = delete;

    // Keeps the walk from entering a node: the one whose dependants it is about.
    void Bar(ResTreeNode& node) { onPath[&node] = true; }

    // Takes the nodes of the list in order, each behind its dependants. If one is refused, or leaves its tree while its
    // dependants are taken, drops in reverse order what was taken, and gives false. Before bad_alloc leaves, drops what
    // wasn't held before, as far as there is memory for that.
    bool ReserveEach(std::vector<ResTreeNode*>&& list, uint32_t mode);

    // What ReserveOne gave for the node that was taken last; 0 if none was.
    uint32_t Granted() const { return granted; }

    // Drops what the owner holds on the nodes of the list, from the last to the first, each before its dependants.
    // True if there was anything.
    bool ReleaseEach(const std::vector<ResTreeNode*>& list);

  private:
    struct Level {
        ResTreeNode* node;  // Whose dependants `list` holds; null for the list of ReserveEach.
        std::vector<ResTreeNode*> list;
        size_t next;  // All before are taken, but for those that were on the path or have left.
    };

    // A node that lists name several times is walked over each time, and told of it each time. In a mesh of lists the
    // ways to a node are countless; from so many repetitions on the dependants of such a node, which are taken
    // already, are left out.
    static constexpr size_t maximalRepetitions = 10'000;

    bool IsOnPath(ResTreeNode* node) const;
    bool TakeEach(uint32_t mode);
    void Enter(ResTreeNode* node);
    bool Take(uint32_t mode);
    uint32_t TakeOne(ResTreeNode& node, uint32_t mode);
    void Leave();
    void ReleaseTaken();
    void Undo();
    void TakeBack();

    const ReleaseScope scope;
    const String owner;
    std::vector<Level> levels;
    std::unordered_map<ResTreeNode*, bool> onPath;  // Every node that was entered; true while it is.
    std::vector<ResTreeNode*> newlyHeld;            // By what was taken so far, and by what is about to be.
    size_t repetitions = 0;
    uint32_t granted = 0;

    // A node that was released has nothing left to release, nor has what it leads to: each is visited once.
    std::unordered_set<ResTreeNode*> released;
    bool ranIntoPath = false;  // A release has left out a node that was on the path.
};

}  // namespace zkhw
