#include "restree/ReservationWalk.h"

#include <new>
#include <utility>

#include "restree/ResTreeNode.h"

namespace zkhw {

bool ReservationWalk::IsOnPath(ResTreeNode* node) const {
    const auto found = onPath.find(node);
    return found != onPath.end() && found->second;
}

// --- Reserving ---

bool ReservationWalk::ReserveEach(std::vector<ResTreeNode*>&& list, uint32_t mode) {
    levels.push_back({nullptr, std::move(list), 0});
    try {
        return TakeEach(mode);
    } catch (const std::bad_alloc&) {
        TakeBack();
        throw;
    }
}

bool ReservationWalk::TakeEach(uint32_t mode) {
    while (true) {
        const Level& level = levels.back();
        if (level.next < level.list.size()) {
            Enter(level.list[level.next]);
        } else if (levels.size() == 1) {
            levels.pop_back();
            return true;
        } else if (!Take(mode)) {
            Undo();
            return false;
        }
    }
}

void ReservationWalk::Enter(ResTreeNode* node) {
    const auto [place, isNew] = onPath.try_emplace(node, false);
    if (place->second || node->HasLeft()) {
        ++levels.back().next;
        return;
    }
    place->second = true;
    levels.push_back({node, {}, 0});
    repetitions += isNew ? 0 : 1;
    if (isNew || repetitions <= maximalRepetitions) {
        node->GetDependants(levels.back().list, false);
    }
}

// Takes the node whose dependants are all taken. False for a refusal, and for a node that has left its tree meanwhile;
// then they are dropped again.
bool ReservationWalk::Take(uint32_t mode) {
    ResTreeNode* node = levels.back().node;
    granted = node->HasLeft() ? 0 : TakeOne(*node, mode);
    if (granted != 0) {
        Leave();
        ++levels.back().next;
        return true;
    }
    if (node->HasLeft()) {
        ReleaseTaken();
    } else {
        std::vector<ResTreeNode*> dependants;
        node->GetDependants(dependants, true);
        ReleaseEach(dependants);
    }
    Leave();
    return false;
}

uint32_t ReservationWalk::TakeOne(ResTreeNode& node, uint32_t mode) {
    const size_t countBefore = node.GetReservations().size();
    newlyHeld.push_back(&node);
    const auto forgetUnlessNew = [&] {
        if (node.GetReservations().size() <= countBefore) {
            newlyHeld.pop_back();
        }
    };
    try {
        const uint32_t given = node.ReserveOne(owner, mode);
        forgetUnlessNew();
        return given;
    } catch (const std::bad_alloc&) {
        forgetUnlessNew();
        throw;
    }
}

void ReservationWalk::Leave() {
    onPath[levels.back().node] = false;
    levels.pop_back();
    // What could not be entered may be reached now.
    if (std::exchange(ranIntoPath, false)) {
        released.clear();
    }
}

// Drops what was taken of the innermost list.
void ReservationWalk::ReleaseTaken() {
    std::vector<ResTreeNode*> taken = std::move(levels.back().list);
    taken.resize(levels.back().next);
    ReleaseEach(taken);
}

void ReservationWalk::Undo() {
    while (true) {
        ReleaseTaken();
        if (levels.size() == 1) {
            levels.pop_back();
            return;
        }
        Leave();
    }
}

// Unlike for a refusal, what was held before stays held.
void ReservationWalk::TakeBack() {
    try {
        for (; !newlyHeld.empty(); newlyHeld.pop_back()) {
            if (!newlyHeld.back()->HasLeft()) {
                newlyHeld.back()->ReleaseOne(owner);
            }
        }
    } catch (const std::bad_alloc&) {
        // The rest stays held.
    }
}

// --- Releasing ---

bool ReservationWalk::ReleaseEach(const std::vector<ResTreeNode*>& list) {
    bool any = false;
    std::vector<ResTreeNode*> open = list;
    while (!open.empty()) {
        ResTreeNode* node = open.back();
        open.pop_back();
        if (IsOnPath(node)) {
            ranIntoPath = true;
            continue;
        }
        if (node->HasLeft() || !released.insert(node).second) {
            continue;
        }
        any |= node->ReleaseOne(owner);
        // The last of them is on top, so it is next.
        node->GetDependants(open, true);
    }
    return any;
}

}  // namespace zkhw
