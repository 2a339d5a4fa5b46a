#pragma once

// Who holds a resource tree: a ResTreeOwner owns the root node, which is made when it is first asked for. One thread at
// a time; the first use too has no other guard.

#include <cstdint>

namespace zkhw {

class ResTreeNode;

class ResTreeOwnerBase {
  public:
    ResTreeOwnerBase() = default;
    ResTreeOwnerBase(const ResTreeOwnerBase&) = delete;
    ResTreeOwnerBase& operator=(const ResTreeOwnerBase&) = delete;
    virtual ~ResTreeOwnerBase() = default;
};

class ResTreeOwner : public ResTreeOwnerBase {
  public:
    ResTreeOwner() = default;
    ~ResTreeOwner() override;

    // Gives the root, which stays the owner's. As long as there is none, it is made by CreateRootNode and announced by
    // OnRootNodeCreated. A negative result of either is handed on, and 0x80004005 is the result if no node came of it;
    // `root` is then untouched. A node that CreateRootNode left in spite of its failure stays: the failure is reported
    // once, and the next call gives that node.
    int32_t GetRootNode(ResTreeNode*& root);

    // Makes the tree. `root` is the owner's own field: what is stored there belongs to the owner from then on, also if
    // the result is negative.
    virtual int32_t CreateRootNode(ResTreeNode*& root) = 0;

    // Called when CreateRootNode has succeeded. Gives 0 and does nothing.
    virtual int32_t OnRootNodeCreated(ResTreeNode* root);

  private:
    ResTreeNode* rootNode = nullptr;  // Owned. Null until it is first asked for.
};

}  // namespace zkhw
