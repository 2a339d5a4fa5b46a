#pragma once

// Who holds a node, and in what way.

#include <cstdint>

#include "qn/dsc/StringBase.h"

namespace zkhw {

using qn::dsc::String;

// A mode may have further bits: they are kept and given back, and mean nothing here.
enum ReservationFlags : uint32_t {
    ReserveRead = 1,       // Goes together with everything but an exclusive holder.
    ReserveWrite = 2,      // One at a time.
    ReserveExclusive = 4,  // Drops all other holders and keeps everybody out, its own owner included.
};

struct Reservation {
    String owner;  // Compared with Compare, so blind to letter case. Holds no comma if the property is to be readable.
    uint32_t mode;
};

}  // namespace zkhw
