#pragma once

#include <cstdint>

namespace zkhw {

class ResTreeNode;

// Hears of the changes of the nodes that it was registered with (ResTreeNode::AddObserver).
// Called on the thread that changes the tree. An observer may change the tree, register and remove observers and
// remove nodes, the notifying one included, from inside a call.
class ResTreeNodeChangeObserver {
  public:
    ResTreeNodeChangeObserver() = default;
    ResTreeNodeChangeObserver(const ResTreeNodeChangeObserver&) = delete;
    ResTreeNodeChangeObserver& operator=(const ResTreeNodeChangeObserver&) = delete;
    virtual ~ResTreeNodeChangeObserver() = default;

    // `changes` is the whole set that is delivered, not only the flags that were asked for. `context` is the value
    // given at registration. An exception passes through to whoever changed the tree and leaves the node held back.
    virtual void OnNodeChanged(ResTreeNode* node, uint32_t changes, int32_t context) = 0;

    // True: the node deletes this observer when it is itself destroyed.
    virtual bool DeleteWithNode() { return false; }
};

}  // namespace zkhw
