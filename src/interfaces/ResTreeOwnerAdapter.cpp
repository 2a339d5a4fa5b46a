#include "interfaces/ResTreeOwnerAdapter.h"

#include "interfaces/ProjectItem.h"
#include "qn/dsc/osdep/DebugTrap.h"
#include "restree/AdapterFactory.h"

namespace zkhw {

const InterfaceMapEntry ResTreeOwnerAdapter::interfaceMap[] = {
    {&IID_IzkhwResourceTreeOwner, 0, InterfaceMapEntry::plain},
    {nullptr, 0, InterfaceMapEntry::closing},
};

HRESULT ResTreeOwnerAdapter::GetRootNode(IzkhwResourceTreeNode** root) {
    if (root == nullptr) {
        return E_POINTER;
    }
    if (!m_inner) {
        qn::dsc::osdep::DebugTrap();
    }
    return m_inner->QueryInterface(IID_IzkhwResourceTreeNode, reinterpret_cast<void**>(root));
}

int32_t CreateOwnerAdapter(IUnknown* hostObject, IUnknown** result) {
    *result = nullptr;
    CQNComObject<ResTreeOwnerAdapter>* adapter = nullptr;
    if (FAILED(CQNComObject<ResTreeOwnerAdapter>::Create(&adapter))) {
        return E_OUTOFMEMORY;
    }
    adapter->SetInner(hostObject);
    return adapter->QueryInterface(IID_IzkhwResourceTreeOwner, reinterpret_cast<void**>(result));
}

int32_t GetHostTreeObject(IzkHostContext* context, IzkProjectItem* item, IUnknown** result) {
    *result = nullptr;
    if (item == nullptr) {
        return context == nullptr ? E_POINTER : context->QueryInterface(IID_IUnknown, reinterpret_cast<void**>(result));
    }
    ItemRecord info(item);
    InterfacePointer<IUnknown> project;
    const HRESULT projectGiven = item->GetProject(project.Receive());
    if (FAILED(projectGiven) || !project) {
        return FAILED(projectGiven) ? projectGiven : E_FAIL;
    }
    return static_cast<IzkProject*>(project.Get())->GetItemObject(info.Get(), result);
}

}  // namespace zkhw
