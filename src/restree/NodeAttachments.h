#pragma once

// What only few nodes have, kept out of the node itself: most nodes of a tree are never observed and have no types of
// their own. Internal to the node's implementation.

#include <memory>
#include <vector>

#include "restree/ObserverList.h"
#include "restree/ResTreeNode.h"
#include "restree/ReservationList.h"

namespace zkhw {

class ChangeDispatch;

struct ResTreeNode::Attachments {
    std::unique_ptr<TypeTable> typeTable;

    ObserverList observers;
    const ChangeDispatch* dispatch = nullptr;  // The run of notices that has this node open, if any.

    // The nodes that hold a record of this one, so that none of them is left with it when this node goes. Each stands
    // here once per record, which in turn knows its slot here.
    struct Watch {
        ResTreeNode* node;
        uint64_t serial;  // Of the record.
    };
    std::vector<Watch> watched;

    // Entries that a renaming over a sibling took from the collection. They live on, out of reach of any lookup, for
    // as long as this node does.
    std::vector<NodeEntry*> lostEntries;

    std::unique_ptr<ReservationList> reservations;  // Null until the first reservation.
};

}  // namespace zkhw
