#pragma once

// Windows has one allocator of task memory, the system's.

#include <gtest/gtest.h>

namespace qn::dsc::osdep {

template <class Chosen>
using TaskAllocators = testing::Types<Chosen>;

}  // namespace qn::dsc::osdep
