// Registrations of a host's observers, and change notices held back.

#include <memory>
#include <new>

#include "interfaces/AdapterObserverSet.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "interfaces/ResTreeNodeObserverAdapter.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

namespace {

using Key = AdapterObserverSet::Key;

constexpr ULONG anyId = ResTreeNodeObserverAdapter::anyId;

bool IsAtOrBelow(const ResTreeNode* node, const ResTreeNode* top) {
    while (node != nullptr && node != top) {
        node = node->GetParent();
    }
    return node == top;
}

}  // namespace

HRESULT ResTreeNodeAdapter::Advise(IzkhwResourceTreeNodeObserver* observer, ULONG mask, ULONG id) {
    if (observer == nullptr) {
        return E_POINTER;
    }
    // The mask of the first registration stands.
    const Key key{m_node, observer, id};
    if (m_observers->Find(key) != nullptr) {
        return S_OK;
    }
    try {
        auto registration = std::make_unique<ResTreeNodeObserverAdapter>(this, observer, id);
        m_observers->Insert(registration.get());
        ResTreeNodeObserverAdapter* const member = registration.release();
        try {
            m_node->AddObserver(member, mask, static_cast<int32_t>(id));
        } catch (...) {
            delete m_observers->TakeOut(key);
            throw;
        }
    } catch (const std::bad_alloc&) {
        return E_OUTOFMEMORY;
    }
    return S_OK;
}

HRESULT ResTreeNodeAdapter::Unadvise(IzkhwResourceTreeNodeObserver* observer, ULONG id, BOOL subtree) {
    // Released last: that may end this view, and with an owning one the whole tree.
    AdapterObserverSet::Ended ended;
    if (id != anyId && subtree == 0) {
        if (ResTreeNodeObserverAdapter* const member = m_observers->Find({m_node, observer, id})) {
            m_observers->End(member, ended);
        }
        return S_OK;
    }
    // Of this node alone all that could match stand in a row.
    Key key{subtree != 0 ? nullptr : m_node, subtree != 0 ? nullptr : observer, 0};
    ResTreeNodeObserverAdapter* member = m_observers->FirstFrom(key);
    while (member != nullptr) {
        key = {member->GetNode(), member->GetObserver(), member->GetId()};
        if (subtree == 0 && (key.node != m_node || key.observer != observer)) {
            break;
        }
        if (key.observer == observer && IsAtOrBelow(key.node, m_node) &&
            (id == anyId || key.id == anyId || key.id == id)) {
            m_observers->End(member, ended);
        }
        member = m_observers->FirstBehind(key);
    }
    return S_OK;
}

HRESULT ResTreeNodeAdapter::BeginChange(ULONG* pending) {
    *pending = m_node->BeginChanges();
    return S_OK;
}

HRESULT ResTreeNodeAdapter::EndChange(ULONG flags, BOOL replace) {
    m_node->EndChanges(flags, replace != 0);
    return S_OK;
}

HRESULT ResTreeNodeAdapter::HasPendingChanges() {
    return m_node->HasNoPendingChanges() ? S_FALSE : S_OK;
}

}  // namespace zkhw
