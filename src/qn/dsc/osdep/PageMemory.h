#pragma once

// Memory straight from the system, in whole pages.

#include <cstddef>

namespace qn::dsc::osdep {

// `size` bytes of zeroes that begin at a multiple of `alignment`; null if there is no memory. Both are multiples of the
// page size, `alignment` a power of two. Pages take real memory only when they are written. Never given back.
void* MapPages(size_t size, size_t alignment);

// Puts real memory behind mapped pages that are about to be written, all at once: less costly than a fault for each.
// Does nothing where the system can't.
void PopulatePages(void* pages, size_t size);

}  // namespace qn::dsc::osdep
