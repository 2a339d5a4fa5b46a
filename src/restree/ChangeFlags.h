#pragma once

#include <cstdint>

namespace zkhw {

// What may change about a node. Several flags are delivered together as one 32-bit set.
enum ChangeFlags : uint32_t {
    NodeDeleted = 0x1,          // On the node being removed: its child nodes are gone, its entry is about to be.
    NodeNameChanged = 0x2,      // On the node: its name or its "DisplayName" changed, or that of a node above.
    PropertyChanged = 0x4,      // On the owner of the entry: a text was assigned.
    PropertyAdded = 0x8,        // On the owner: a text entry was inserted.
    PropertyRemoved = 0x10,     // On the owner: a text entry was removed.
    AncestorChanged = 0x20,     // Never raised by itself: asks AddObserver to watch the nodes above.
    ReservationChanged = 0x40,  // On the node: its reservations changed, or those of a node that it depends on.
    ChildRemoved = 0x80,        // On the owner: a child or link entry was removed.
    ChildAdded = 0x100,         // On the owner: a child or link entry was inserted.
    ChildNameChanged = 0x200,   // On the parent: a child's name or its "DisplayName" changed.
    NodeDeleting = 0x400,       // On the node being removed, before its children are touched.
};

inline constexpr uint32_t allChanges = 0xFFFFFFFF;

}  // namespace zkhw
