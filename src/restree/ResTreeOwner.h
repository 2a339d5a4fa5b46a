#pragma once

// Who holds a resource tree. ResTreeOwnerBase knows the interfaces that a host gets of a tree; ResTreeOwner also owns
// the root node. All are made when they are first asked for, and stay until the owner dies. One thread at a time; the
// first use too has no other guard.

#include <cstdint>

struct _GUID;
struct IUnknown;
struct IzkHostContext;
struct IzkProjectItem;

namespace zkhw {

class AdapterObserverSet;
class ResTreeNode;

class ResTreeOwnerBase {
  public:
    ResTreeOwnerBase() = default;
    ResTreeOwnerBase(const ResTreeOwnerBase&) = delete;
    ResTreeOwnerBase& operator=(const ResTreeOwnerBase&) = delete;

    // Releases the interfaces. What a host still holds of them stays valid for Release alone.
    virtual ~ResTreeOwnerBase();

    // Gives a view of the root node (IzkhwResourceTreeNode4), with one reference for the caller, or a negative code.
    virtual int32_t GetRootNodeInterface(void** result) = 0;

    // Gives the interface `id`, with one reference for the caller: of the root node (IzkhwResourceTreeNode to
    // IzkhwResourceTreeNode5), of the tree's queries (IzkEIOGResourceTree, IzkEIOGResourceTree2), or of the owner
    // (IzkhwResourceTreeOwner). `context` and `item` may be null; they count only when the object that keeps them is
    // made, that is, at the first query of its kind.
    // 0; 0x80004002 for any other id; the negative code of what makes an object, which the next call tries again.
    // `*result` is null then. A null `result` with a known id traps.
    int32_t QueryTreeInterface(const _GUID& id, IzkHostContext* context, IzkProjectItem* item, void** result);

  private:
    int32_t MakeOwnerInterface(IzkHostContext* context, IzkProjectItem* item);
    int32_t MakeTreeInterfaces(IzkHostContext* context, IzkProjectItem* item);

    // One reference each, null until they are asked for.
    IUnknown* nodeInterface = nullptr;
    IUnknown* treeInterface = nullptr;
    IUnknown* ownerInterface = nullptr;
};

class ResTreeOwner : public ResTreeOwnerBase {
  public:
    ResTreeOwner() = default;

    // Tells the host's observers that the tree ends, and deletes it.
    ~ResTreeOwner() override;

    // As GetRootNode; then gives a new view of that node.
    int32_t GetRootNodeInterface(void** result) override;

    // Makes the tree. `root` is the owner's own field: what is stored there belongs to the owner from then on, also if
    // the result is negative.
    virtual int32_t CreateRootNode(ResTreeNode*& root) = 0;

    // Called when CreateRootNode has succeeded. Gives 0 and does nothing.
    virtual int32_t OnRootNodeCreated(ResTreeNode* root);

    // Gives the root, which stays the owner's. As long as there is none, it is made by CreateRootNode and announced by
    // OnRootNodeCreated. A negative result of either is handed on, and 0x80004005 is the result if no node came of it;
    // `root` is then untouched. A node that CreateRootNode left in spite of its failure stays: the failure is reported
    // once, and the next call gives that node.
    int32_t GetRootNode(ResTreeNode*& root);

  private:
    AdapterObserverSet* adapterObservers = nullptr;  // Owned. Shared by all views of the tree; null until the first.
    ResTreeNode* rootNode = nullptr;                 // Owned. Null until it is first asked for.
};

}  // namespace zkhw
