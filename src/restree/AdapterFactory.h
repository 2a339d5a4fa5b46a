#pragma once

// The objects through which a host sees a tree, as far as the owner of the tree has to do with them. They are made and
// defined in a layer above; the tree itself knows nothing of them.
//
// Results are codes as everywhere: 0, or negative and nothing is given.

#include <cstdint>

struct IUnknown;
struct IzkHostContext;
struct IzkProjectItem;

namespace zkhw {

class AdapterObserverSet;
class ResTreeNode;

// The host's observers of one tree: an empty set, or null if there is no memory.
AdapterObserverSet* MakeAdapterObserverSet();

// Tells every observer that the tree of `root` ends (NodeDeleted, with the id 0), and ends its registration.
void EndAdapterObservers(AdapterObserverSet& observers, ResTreeNode* root);

// Frees a set that has no members any more; null does nothing.
void DestroyAdapterObserverSet(AdapterObserverSet* observers) noexcept;

// Gives a new view of `node` (IzkhwResourceTreeNode4), with one reference for the caller. With `ownsNode` the view owns
// node and set from then on. 0x8007000E if there is no memory.
int32_t CreateNodeAdapter(ResTreeNode* node, AdapterObserverSet* observers, void** result, bool ownsNode);

// Gives a new query object for the tree of `rootNode`, a view of its root (IzkEIOGResourceTree2), with one reference.
// The object keeps references to `rootNode` and `item`, but none to `context`; these two may be null.
int32_t CreateTreeObject(IzkHostContext* context, IzkProjectItem* item, IUnknown* rootNode, IUnknown** result);

// Gives a new object that stands for the owner (IzkhwResourceTreeOwner), with one reference, around an object of the
// host, to which it keeps a reference. `hostObject` may be null: using the new object then traps.
int32_t CreateOwnerAdapter(IUnknown* hostObject, IUnknown** result);

// Gives the host's object that stands for the tree, with one reference, or null if the host says so: asked of the
// item's project, or of `context` if `item` is null. 0x80004003 if both are null, 0x80004005 if the item has no
// project; otherwise the host's own result.
int32_t GetHostTreeObject(IzkHostContext* context, IzkProjectItem* item, IUnknown** result);

}  // namespace zkhw
