// Reservations, by text and by project item.

#include "interfaces/BoundaryText.h"
#include "interfaces/ProjectItem.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

namespace {

HRESULT GiveMode(uint32_t mode, ULONG* result) {
    if (result != nullptr) {
        *result = mode;
    }
    return mode != 0 ? S_OK : S_FALSE;
}

HRESULT Answer(bool yes) {
    return yes ? S_OK : S_FALSE;
}

}  // namespace

HRESULT ResTreeNodeAdapter::GetReservation(LPCWSTR owners, ULONG* mode) {
    return GetReservationEx(owners, 0, mode);
}

HRESULT ResTreeNodeAdapter::GetReservationEx(LPCWSTR owners, BOOL except, ULONG* mode) {
    if (owners == nullptr) {
        return GiveMode(m_node->GetReservationFlags(nullptr, except != 0), mode);
    }
    const String list = CopyOf(owners);
    return GiveMode(m_node->GetReservationFlags(&list, except != 0), mode);
}

HRESULT ResTreeNodeAdapter::Reserve(LPCWSTR owner, ULONG mode, ULONG* granted) {
    return GiveMode(m_node->Reserve(CopyOf(owner), mode), granted);
}

HRESULT ResTreeNodeAdapter::Unreserve(LPCWSTR owner) {
    return Answer(m_node->Release(CopyOf(owner)));
}

HRESULT ResTreeNodeAdapter::ReserveDescendants(LPCWSTR owner, ULONG mode, LPCWSTR type) {
    return Answer(m_node->ReserveAll(CopyOf(owner), mode, CopyOf(type)));
}

HRESULT ResTreeNodeAdapter::UnreserveDescendants(LPCWSTR owner, LPCWSTR type) {
    return Answer(m_node->ReleaseAll(CopyOf(owner), CopyOf(type)));
}

HRESULT ResTreeNodeAdapter::ReserveForItem(IzkProjectItem* item, ULONG mode, ULONG* granted) {
    return item == nullptr ? E_POINTER : GiveMode(m_node->Reserve(GetItemKey(item), mode), granted);
}

HRESULT ResTreeNodeAdapter::GetReservationForItem(IzkProjectItem* item, ULONG* mode) {
    if (item == nullptr) {
        return GetReservation(nullptr, mode);
    }
    const String key = GetItemKey(item);
    return GiveMode(m_node->GetReservationFlags(&key, false), mode);
}

HRESULT ResTreeNodeAdapter::UnreserveForItem(IzkProjectItem* item) {
    return item == nullptr ? E_POINTER : Answer(m_node->Release(GetItemKey(item)));
}

HRESULT ResTreeNodeAdapter::ReserveDescendantsForItem(IzkProjectItem* item, ULONG mode, LPCWSTR type) {
    return item == nullptr ? E_POINTER : Answer(m_node->ReserveAll(GetItemKey(item), mode, CopyOf(type)));
}

HRESULT ResTreeNodeAdapter::UnreserveDescendantsForItem(IzkProjectItem* item, LPCWSTR type) {
    return item == nullptr ? E_POINTER : Answer(m_node->ReleaseAll(GetItemKey(item), CopyOf(type)));
}

}  // namespace zkhw
