#pragma once

// The names that a `names` attribute stands for.

#include <cstdint>
#include <string_view>
#include <vector>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/TextArgument.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::TextArgument;

struct InstanceRecord {
    String name;
    std::u16string_view variable;  // Empty if the name has no loop variable. Part of a text that outlives the record.
    int32_t index;                 // The value of the loop variable.
};

// If `item` has the form "Bank[i=0..3]" or "Port[1..2]A", appends a record per value, ascending, and gives true, also
// for a range without any value. Otherwise false, and the item is a plain name, brackets and all. The variables of the
// records are parts of `item`.
bool ParseNameRange(TextArgument item, std::vector<InstanceRecord>& instances);

// The records of a whole comma list of plain names and ranges, and the loop variables of the ranges, in order;
// consecutive equal ones stand there once. The variables of the records are those texts: `instances` must not outlive
// `loopVariables`. Both are empty before.
void ParseNames(TextArgument names, std::vector<InstanceRecord>& instances, std::vector<String>& loopVariables);

}  // namespace zkhw
