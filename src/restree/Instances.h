#pragma once

#include "restree/ParseFrame.h"

namespace zkhw {

// Makes the copies that a `names` element stands for, when it is complete: the node under the first record's name is
// the pattern. Does nothing unless there are several records and that name leads to a child.
void ReplicateInstances(ParseFrame& frame);

}  // namespace zkhw
