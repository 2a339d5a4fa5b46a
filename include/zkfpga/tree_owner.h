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
     * IID_IzkhwResourceTreeNode. E_POINTER: null `root`. */
    virtual HRESULT STDMETHODCALLTYPE GetRootNode(IzkhwResourceTreeNode** root) = 0;

  protected:
    ~IzkhwResourceTreeOwner() = default;
};

/* Implemented by the host, for IzkhwResourceTreeNode::Advise. */
struct IzkhwResourceTreeNodeObserver : public IUnknown {
    /* `node` is the object on which Advise was called; no reference comes with it. `changes` are all flags delivered
     * together (ZkhwChange), also those that weren't asked for. `id` is the one given to Advise, except when the whole
     * tree ends: every observer then hears ZkhwNodeDeleted with the id 0. Called on the thread that made the change,
     * and may call any operation of the tree, Unadvise too; what it changes is delivered in a further call. The result
     * isn't looked at. An exception must not leave it. */
    virtual HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode* node, ULONG changes, ULONG id) = 0;

  protected:
    ~IzkhwResourceTreeNodeObserver() = default;
};

#endif /* __cplusplus */

#endif
