#pragma once

// The one thing that the foundation asks of what stands above it; defined in hostbridge/HostErrorText.cpp.

#include <cstdint>

#include "qn/dsc/StringBase.h"

namespace qn::dsc::zk {

// The host's words for its error `code`; "Unknown error code or error text unavailable." if it has none, and the empty
// text if it says that it has but gives no string. The host must be there: without its run-time, or with one that lacks
// the function, the process ends (hostbridge/HostFunctions.h). std::bad_alloc if there is no memory.
NarrowString GetHostErrorText(int32_t code);

}  // namespace qn::dsc::zk
