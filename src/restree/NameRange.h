#pragma once

// The names that a `names` attribute stands for.

#include <cstdint>
#include <vector>

#include "qn/dsc/StringBase.h"

namespace zkhw {

using qn::dsc::String;

struct InstanceRecord {
    String name;
    String variable;  // Empty if the name has no loop variable.
    int32_t index;    // The value of the loop variable.
};

// If `item` has the form "Bank[i=0..3]" or "Port[1..2]A", appends a record per value, ascending, and gives true, also
// for a range without any value. Otherwise false, and the item is a plain name, brackets and all.
bool ParseNameRange(const String& item, std::vector<InstanceRecord>& instances);

// The records of a whole comma list of plain names and ranges, and the loop variables of the ranges, in order.
void ParseNames(const String& names, std::vector<InstanceRecord>& instances, std::vector<String>& loopVariables);

}  // namespace zkhw
