#pragma once

// The names, or paths, of the nodes below a node, as lists.

#include <string_view>
#include <vector>

#include "qn/dsc/StringBase.h"

namespace zkhw {

using qn::dsc::String;

class ResTreeNode;

// What a list of names is to hold.
struct NameQuery {
    std::u16string_view type;               // Only nodes that support it; empty: all.
    std::u16string_view exclusionProperty;  // No node with a property of this name that is empty or true; empty: all.
    bool includePath = false;               // Paths in place of names.
    const String* path = nullptr;           // Stands for the node's own path where that is joined; null: its own.
    bool wantsDisplayPaths = false;
};

struct NameLists {
    std::vector<String> names;
    std::vector<String> displayPaths;  // As many as names, if they were wanted.
};

// Of the entries of `node`, links followed. May load.
void CollectChildNames(ResTreeNode& node, const NameQuery& query, NameLists& lists);

// Of everything below `node`, a parent before its children, links followed. Below a node that the query leaves out the
// walk goes on. Loads everything. Linear in the lists' text.
void CollectDescendantNames(ResTreeNode& node, const NameQuery& query, NameLists& lists);

}  // namespace zkhw
