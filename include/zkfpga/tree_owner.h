/* What holds a tree, and whom a node's changes reach. */
#ifndef ZKFPGA_TREE_OWNER_H
#define ZKFPGA_TREE_OWNER_H

#include "zkfpga/ids.h"
#include "zkfpga/types.h"

#ifdef __cplusplus

struct IzkhwResourceTreeNode;

/* Implemented by this library, around an object of the host that stands for the tree. Holds a reference to that. */
struct IzkhwResourceTreeOwner : public IUnknown {
    /* The node interface of the host's object, with one reference for the caller: the result of its QueryInterface for
     * IID_IzkhwResourceTreeNode, failures included. E_POINTER: null `root`. Traps if the host gave no object. */
    virtual HRESULT STDMETHODCALLTYPE GetRootNode(IzkhwResourceTreeNode** root) = 0;

  protected:
    ~IzkhwResourceTreeOwner() = default;
};

/* Implemented by the host, for IzkhwResourceTreeNode::Advise. */
struct IzkhwResourceTreeNodeObserver : public IUnknown {
    /* `node` is the object on which Advise was called; no reference comes with it. `changes` are all flags delivered
     * together (ZkhwChange), also those that weren't asked for. `id` is the one given to Advise. When the whole tree
     * ends, every registration, whatever its mask, gets one call more, with ZkhwNodeDeleted and the id 0, and is ended;
     * the tree still stands then. The end of a copy (CloneDetached) is not told.
     * Called on the thread that made the change. May call any operation of the tree, remove the node, end this and
     * other registrations, and give back the last reference to anything; what it changes about the node is delivered
     * in a further call. The result isn't looked at. An exception passes through to whoever changed the tree, and the
     * node's notices then stay held back: none should leave it. */
    virtual HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode* node, ULONG changes, ULONG id) = 0;

  protected:
    ~IzkhwResourceTreeNodeObserver() = default;
};

#endif /* __cplusplus */

#endif
