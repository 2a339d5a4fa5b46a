#pragma once

// New views of nodes, each with one reference for the caller.

#include <vector>

#include "zkfpga/tree_node.h"

namespace zkhw {

class AdapterObserverSet;
class ResTreeNode;

// Gives a view of `node`. S_OK, or E_OUTOFMEMORY and null.
HRESULT GiveView(ResTreeNode* node, AdapterObserverSet* observers, IzkhwResourceTreeNode** view);

// Gives an array of views; the out pointers are not null. E_OUTOFMEMORY, and the count is 0, the array null, and
// nothing is left behind.
HRESULT GiveViews(const std::vector<ResTreeNode*>& nodes, AdapterObserverSet* observers, ULONG* count,
                  IzkhwResourceTreeNode*** views);

}  // namespace zkhw
