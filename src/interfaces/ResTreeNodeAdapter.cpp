// A view's life, and what the node is: name, path, type, parent.

#include "interfaces/ResTreeNodeAdapter.h"

#include <vector>

#include "interfaces/AdapterObserverSet.h"
#include "interfaces/BoundaryArrays.h"
#include "interfaces/BoundaryText.h"
#include "interfaces/NodeViews.h"
#include "restree/AdapterFactory.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

const InterfaceMapEntry ResTreeNodeAdapter::interfaceMap[] = {
    {&IID_IzkhwResourceTreeNode, 0, InterfaceMapEntry::plain},
    {&IID_IzkhwResourceTreeNode2, 0, InterfaceMapEntry::plain},
    {&IID_IzkhwResourceTreeNode3, 0, InterfaceMapEntry::plain},
    {&IID_IzkhwResourceTreeNode4, 0, InterfaceMapEntry::plain},
    {&IID_IzkhwResourceTreeNode5, 0, InterfaceMapEntry::plain},
    {nullptr, 0, InterfaceMapEntry::closing},
};

ResTreeNodeAdapter* ResTreeNodeAdapter::Make(ResTreeNode* node, AdapterObserverSet* observers) {
    CQNComObject<ResTreeNodeAdapter>* adapter = nullptr;
    if (FAILED(CQNComObject<ResTreeNodeAdapter>::Create(&adapter))) {
        return nullptr;
    }
    adapter->m_node = node;
    adapter->m_observers = observers;
    return adapter;
}

void ResTreeNodeAdapter::FinalRelease() {
    if (!m_ownsNode) {
        return;
    }
    m_observers->UnadviseAll();
    // An observer may have let this view go while it hears of a change of the tree.
    ResTreeNode::Destroy(m_node);
    DestroyAdapterObserverSet(m_observers);
}

HRESULT ResTreeNodeAdapter::GetName(BSTR* name) {
    return name == nullptr ? E_POINTER : GiveText(m_node->GetName(), name);
}

HRESULT ResTreeNodeAdapter::GetPath(BSTR* path) {
    return path == nullptr ? E_POINTER : GiveText(m_node->GetPath(), path);
}

HRESULT ResTreeNodeAdapter::GetDisplayPath(BSTR* path) {
    return path == nullptr ? E_POINTER : GiveText(m_node->GetDisplayPath(), path);
}

HRESULT ResTreeNodeAdapter::SetName(LPCWSTR name) {
    if (name == nullptr) {
        return E_POINTER;
    }
    return m_node->Rename(ViewOf(name)) ? S_OK : S_FALSE;
}

HRESULT ResTreeNodeAdapter::GetType(BSTR* type) {
    return type == nullptr ? E_POINTER : GiveText(m_node->GetType(), type);
}

HRESULT ResTreeNodeAdapter::GetTypes(ULONG* count, BSTR** types) {
    if (count == nullptr || types == nullptr) {
        return E_POINTER;
    }
    std::vector<String> protocols;
    m_node->GetProtocols(protocols);
    return GiveTexts(protocols, count, types);
}

HRESULT ResTreeNodeAdapter::IsOfType(LPCWSTR type) {
    return m_node->Supports(ViewOf(type)) ? S_OK : S_FALSE;
}

HRESULT ResTreeNodeAdapter::HasParent() {
    return m_node->GetParent() != nullptr ? S_OK : S_FALSE;
}

HRESULT ResTreeNodeAdapter::GetParent(IzkhwResourceTreeNode** parent) {
    if (parent == nullptr) {
        return E_POINTER;
    }
    *parent = nullptr;
    ResTreeNode* const node = m_node->GetParent();
    return node == nullptr ? S_OK : GiveView(node, m_observers, parent);
}

}  // namespace zkhw
