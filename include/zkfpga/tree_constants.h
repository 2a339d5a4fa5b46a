/* Numbers of the resource tree's interfaces: change flags and reservation modes. Never changed, only added to. */
#ifndef ZKFPGA_TREE_CONSTANTS_H
#define ZKFPGA_TREE_CONSTANTS_H

/* What may change about a node. Several come together as one 32-bit set. */
enum ZkhwChange {
    ZkhwNodeDeleted = 0x1,         /* The node is being removed: its child nodes are gone, its entry is about to be. */
    ZkhwNodeNameChanged = 0x2,     /* The node's name or "DisplayName" changed, or that of a node above it. */
    ZkhwPropertyChanged = 0x4,     /* A property of the node was assigned. */
    ZkhwPropertyAdded = 0x8,       /* The node has a new property. */
    ZkhwPropertyRemoved = 0x10,    /* A property of the node was removed. */
    ZkhwAncestorChanged = 0x20,    /* Never delivered by itself: in a mask it asks to watch the names of all above. */
    ZkhwReservationChanged = 0x40, /* The node's reservations changed, or those of a node that it reserves with it. */
    ZkhwChildRemoved = 0x80,       /* A child or a link of the node was removed. */
    ZkhwChildAdded = 0x100,        /* The node has a new child or link. */
    ZkhwChildNameChanged = 0x200,  /* The name or the "DisplayName" of a child changed. */
    ZkhwNodeDeleting = 0x400       /* The node is being removed: nothing of it is gone yet. */
};

/* How a node is held; the bits combine. Readers go with each other and with one writer. */
enum ZkhwReservationMode {
    ZkhwReserveRead = 1,
    ZkhwReserveWrite = 2,    /* One at a time, whoever asks. */
    ZkhwReserveExclusive = 4 /* Drops all holders when it is taken, and then keeps out everybody, its holder too. */
};

#endif
