#include "interfaces/NodeViews.h"

#include "interfaces/BoundaryArrays.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "restree/AdapterFactory.h"

namespace zkhw {

namespace {

// A new view asked for the interface by which it goes out.
HRESULT MakeView(ResTreeNode* node, AdapterObserverSet* observers, REFIID id, bool ownsNode, void** view) {
    *view = nullptr;
    ResTreeNodeAdapter* const adapter = ResTreeNodeAdapter::Make(node, observers);
    if (adapter == nullptr) {
        return E_OUTOFMEMORY;
    }
    const HRESULT given = adapter->QueryInterface(id, view);
    if (SUCCEEDED(given) && ownsNode) {
        adapter->TakeOwnership();
    }
    return given;
}

}  // namespace

int32_t CreateNodeAdapter(ResTreeNode* node, AdapterObserverSet* observers, void** result, bool ownsNode) {
    return MakeView(node, observers, IID_IzkhwResourceTreeNode4, ownsNode, result);
}

HRESULT GiveView(ResTreeNode* node, AdapterObserverSet* observers, IzkhwResourceTreeNode** view) {
    return MakeView(node, observers, IID_IzkhwResourceTreeNode, false, reinterpret_cast<void**>(view));
}

HRESULT GiveViews(const std::vector<ResTreeNode*>& nodes, AdapterObserverSet* observers, ULONG* count,
                  IzkhwResourceTreeNode*** views) {
    *count = 0;
    *views = nullptr;
    std::vector<InterfacePointer<IzkhwResourceTreeNode>> made(nodes.size());
    for (size_t i = 0; i < nodes.size(); ++i) {
        const HRESULT given = GiveView(nodes[i], observers, made[i].Receive());
        if (FAILED(given)) {
            return given;
        }
    }
    return GiveObjects(made, count, views);
}

}  // namespace zkhw
