#include "interfaces/ResourceItemUISelector.h"

#include "interfaces/InterfacePointer.h"
#include "interfaces/ProjectItem.h"

namespace zkhw {

const InterfaceMapEntry ResourceItemUISelector::interfaceMap[] = {
    {&IID_IzkProjectItemSelector, 0, InterfaceMapEntry::plain},
    {nullptr, 0, InterfaceMapEntry::closing},
};

HRESULT ResourceItemUISelector::SelectItem(IzkProjectItem* item, BOOL* result) {
    *result = 1;
    ItemRecord info(item);
    IzkProjectItemLocator* const locator = m_context == nullptr ? nullptr : m_context->GetItemLocator();
    if (locator == nullptr) {
        return S_FALSE;
    }
    InterfacePointer<IUnknown> found;
    locator->FindItem(info.Get(), found.Receive());
    if (!found) {
        return S_FALSE;
    }
    InterfacePointer<IzkItemMarker> marker;
    InterfacePointer<IzkItemResourceLink> link;
    found->QueryInterface(IID_IzkItemMarker, marker.ReceiveAny());
    if (marker) {
        found->QueryInterface(IID_IzkItemResourceLink, link.ReceiveAny());
    }
    if (!marker || !link) {
        return S_FALSE;
    }
    return OnItem(item, marker.Get(), link.Get()) ? S_OK : S_FALSE;
}

}  // namespace zkhw
