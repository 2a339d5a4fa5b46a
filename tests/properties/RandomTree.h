#pragma once

// Random trees for laws: up to two dozen nodes of both forms, with texts, plain and localised, and links, under names
// that are hard on paths and on XML.

#include <memory>
#include <vector>

#include "properties/Random.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

struct TreeKind {
    // Leaves out what the writer says can't come back (RandomTree.cpp lists it).
    bool comesBack = false;
    // In an ordered node, a child's key may be that of an earlier entry.
    bool mayRepeatChildren = true;
};

std::unique_ptr<ResTreeNode> MakeRandomTree(Random& random, TreeKind kind);

// All nodes, parents first, in the order of the entries.
std::vector<ResTreeNode*> NodesOf(ResTreeNode& root);

// Some change of some node: an entry made, changed, removed or renamed.
void ChangeSomething(Random& random, ResTreeNode& root);

}  // namespace zkhw
