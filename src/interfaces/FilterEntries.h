#pragma once

// Takes entries out of a tree.

#include <set>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/TextArgument.h"
#include "qn/dsc/osdep/Compare.h"

namespace zkhw {

class ResTreeNode;

struct EntryFilter {
    // Names may be looked for as views.
    struct IsLess {
        using is_transparent = void;
        bool operator()(qn::dsc::TextArgument left, qn::dsc::TextArgument right) const {
            return qn::dsc::osdep::Compare(left.View(), right.View()) < 0;
        }
    };
    using NameSet = std::set<qn::dsc::String, IsLess>;

    bool keep;              // What is named stays, and all else goes; otherwise what is named goes.
    NameSet nodeNames;      // Names a child by its key or its type.
    NameSet propertyNames;  // Names a text by its key. A link is never named.
};

// Filters the entries of `top`, and of each child that stays in turn. Loads deferred contents. Linear but for the sets.
void FilterEntries(ResTreeNode& top, const EntryFilter& filter);

}  // namespace zkhw
