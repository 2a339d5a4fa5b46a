#pragma once

// The properties of a node as a host's list.

#include <string_view>
#include <vector>

#include "qn/dsc/StringBase.h"

namespace zkhw {

using qn::dsc::String;

class ResTreeNode;

struct PropertyQuery {
    bool includePath;     // The node's path and "/" in front of each name.
    const String& strip;  // Taken off the front of that, as QueryOptions say.
    bool withValues;      // Name and value as a cluster (ClusterText.h), in place of the name.
};

// Appends one text for each property of `node`, plain and localised ones, in the order of its entries. `path` is how
// the node was found. May load.
void CollectProperties(ResTreeNode& node, std::u16string_view path, const PropertyQuery& query,
                       std::vector<String>& list);

}  // namespace zkhw
