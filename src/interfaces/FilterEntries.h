#pragma once

// Takes entries out of a tree.

#include <set>

#include "qn/dsc/StringBase.h"

namespace zkhw {

class ResTreeNode;

struct EntryFilter {
    bool keep;                                // What is named stays, and all else goes; otherwise what is named goes.
    std::set<qn::dsc::String> nodeNames;      // Names a child by its key or its type.
    std::set<qn::dsc::String> propertyNames;  // Names a text by its key. A link is never named.
};

// Filters the entries of `top`, and of each child that stays in turn. Loads deferred contents. Linear but for the sets.
void FilterEntries(ResTreeNode& top, const EntryFilter& filter);

}  // namespace zkhw
