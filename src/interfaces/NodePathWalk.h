#pragma once

// The way from a node along a path that a host gives. Unlike a path of the tree itself it always starts at the node:
// a leading "/" is passed over, and "..", "." and anchors are names as any others.

#include <cstdint>
#include <string_view>

namespace zkhw {

class ResTreeNode;

struct NodePathResult {
    ResTreeNode* node;  // The last one reached: `start` itself if not even the first name was found.
    bool isComplete;    // Whether that is the end of the path. The empty path is not.
    bool crossedLink;   // Whether a link was followed on the way.
    // Where the rest begins: the length of the path if it is complete. Otherwise counted from the names that were
    // found, as if each of their slashes, but no backslash, had been escaped.
    uint32_t consumed;
};

// May load.
NodePathResult WalkNodePath(ResTreeNode& start, std::u16string_view path);

}  // namespace zkhw
