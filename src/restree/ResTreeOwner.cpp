#include "restree/ResTreeOwner.h"

#include "restree/AdapterFactory.h"
#include "restree/ResTreeNode.h"
#include "restree/ResultCode.h"
#include "zkfpga/ids.h"

namespace zkhw {

namespace {

void Release(IUnknown*& object) {
    if (object != nullptr) {
        object->Release();
        object = nullptr;
    }
}

bool IsNodeId(const IID& id) {
    return id == IID_IzkhwResourceTreeNode || id == IID_IzkhwResourceTreeNode2 || id == IID_IzkhwResourceTreeNode3 ||
           id == IID_IzkhwResourceTreeNode4 || id == IID_IzkhwResourceTreeNode5;
}

bool IsTreeId(const IID& id) {
    return id == IID_IzkEIOGResourceTree || id == IID_IzkEIOGResourceTree2;
}

}  // namespace

// --- ResTreeOwnerBase ---

ResTreeOwnerBase::~ResTreeOwnerBase() {
    Release(treeInterface);
    Release(nodeInterface);
    Release(ownerInterface);
}

int32_t ResTreeOwnerBase::QueryTreeInterface(const IID& id, IzkHostContext* context, IzkProjectItem* item,
                                             void** result) {
    if (result != nullptr) {
        *result = nullptr;
    }
    if (id == IID_IzkhwResourceTreeOwner) {
        const int32_t made = MakeOwnerInterface(context, item);
        return made < 0 ? made : ownerInterface->QueryInterface(id, result);
    }
    if (!IsNodeId(id) && !IsTreeId(id)) {
        return E_NOINTERFACE;
    }
    const int32_t made = MakeTreeInterfaces(context, item);
    if (made < 0) {
        return made;
    }
    return (IsNodeId(id) ? nodeInterface : treeInterface)->QueryInterface(id, result);
}

int32_t ResTreeOwnerBase::MakeOwnerInterface(IzkHostContext* context, IzkProjectItem* item) {
    if (ownerInterface != nullptr) {
        return success;
    }
    IUnknown* hostObject = nullptr;
    int32_t made = GetHostTreeObject(context, item, &hostObject);
    if (made >= 0) {
        made = CreateOwnerAdapter(hostObject, &ownerInterface);
    }
    Release(hostObject);
    return made;
}

int32_t ResTreeOwnerBase::MakeTreeInterfaces(IzkHostContext* context, IzkProjectItem* item) {
    if (nodeInterface == nullptr) {
        void* node = nullptr;
        const int32_t made = GetRootNodeInterface(&node);
        if (made < 0) {
            return made;
        }
        nodeInterface = static_cast<IUnknown*>(node);
    }
    if (treeInterface == nullptr) {
        return CreateTreeObject(context, item, nodeInterface, &treeInterface);
    }
    return success;
}

// --- ResTreeOwner ---

ResTreeOwner::~ResTreeOwner() {
    if (rootNode != nullptr) {
        if (adapterObservers != nullptr) {
            EndAdapterObservers(*adapterObservers, rootNode);
        }
        delete rootNode;
    }
    DestroyAdapterObserverSet(adapterObservers);
}

int32_t ResTreeOwner::GetRootNodeInterface(void** result) {
    ResTreeNode* root = nullptr;
    const int32_t made = GetRootNode(root);
    if (made < 0) {
        return made;
    }
    if (adapterObservers == nullptr) {
        adapterObservers = MakeAdapterObserverSet();
        if (adapterObservers == nullptr) {
            return outOfMemory;
        }
    }
    return CreateNodeAdapter(root, adapterObservers, result, false);
}

int32_t ResTreeOwner::OnRootNodeCreated(ResTreeNode*) {
    return success;
}

int32_t ResTreeOwner::GetRootNode(ResTreeNode*& root) {
    if (rootNode == nullptr) {
        const int32_t created = CreateRootNode(rootNode);
        if (created < 0) {
            return created;
        }
        if (rootNode == nullptr) {
            return generalFailure;
        }
        const int32_t announced = OnRootNodeCreated(rootNode);
        if (announced < 0) {
            return announced;
        }
    }
    root = rootNode;
    return success;
}

}  // namespace zkhw
