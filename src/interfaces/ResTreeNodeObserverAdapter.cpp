#include "interfaces/ResTreeNodeObserverAdapter.h"

#include "interfaces/AdapterObserverSet.h"

namespace zkhw {

ResTreeNodeObserverAdapter::ResTreeNodeObserverAdapter(ResTreeNodeAdapter* adapter,
                                                       IzkhwResourceTreeNodeObserver* observer, ULONG id)
    : m_adapter(adapter), m_observer(observer), m_id(id) {
    m_adapter->AddRef();
    m_observer->AddRef();
}

ResTreeNodeObserverAdapter::~ResTreeNodeObserverAdapter() {
    m_observer->Release();
    m_adapter->Release();
}

void ResTreeNodeObserverAdapter::OnNodeChanged(ResTreeNode*, uint32_t changes, int32_t context) {
    m_observer->NodeChanged(m_adapter, changes, static_cast<ULONG>(context));
}

bool ResTreeNodeObserverAdapter::DeleteWithNode() {
    return m_adapter->GetObservers()->TakeOut({GetNode(), m_observer, m_id}) != nullptr;
}

}  // namespace zkhw
