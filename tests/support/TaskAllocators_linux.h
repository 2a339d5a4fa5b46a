#pragma once

// The allocators of task memory that a build can choose from.

#include <gtest/gtest.h>

#include "qn/dsc/osdep/MallocAllocator.h"
#include "qn/dsc/osdep/PoolAllocator.h"

namespace qn::dsc::osdep {

template <class Chosen>
using TaskAllocators = testing::Types<Chosen, PoolAllocator, MallocAllocator>;

}  // namespace qn::dsc::osdep
