#pragma once

// The nodes that a walk stands in, one below the other. A walk that follows links asks it before it enters a node, so
// that it doesn't run in circles. Costs next to nothing until the first link: without one no node can come twice.

#include <unordered_set>
#include <vector>

#include "restree/NodeEntry.h"

namespace zkhw {

class NodesOnPath {
  public:
    // Whether the walk stands in `node`, which `entry` of its innermost node leads to.
    bool Contains(const ResTreeNode* node, const NodeEntry& entry) {
        if (!isSearchable) {
            if (entry.Kind() != LinkEntry) {
                return false;
            }
            nodeSet.insert(nodes.begin(), nodes.end());
            isSearchable = true;
        }
        return nodeSet.count(node) != 0;
    }

    void Enter(const ResTreeNode* node) {
        nodes.push_back(node);
        if (isSearchable) {
            nodeSet.insert(node);
        }
    }

    void Leave() {
        if (isSearchable) {
            nodeSet.erase(nodes.back());
        }
        nodes.pop_back();
    }

  private:
    std::vector<const ResTreeNode*> nodes;
    std::unordered_set<const ResTreeNode*> nodeSet;  // Filled once a link was met.
    bool isSearchable = false;
};

}  // namespace zkhw
