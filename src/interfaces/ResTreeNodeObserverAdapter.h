#pragma once

// One registration of a host's observer at a node. It isn't counted: its set, or its node at the end, deletes it.

#include "interfaces/InterfacePointer.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "restree/ResTreeNodeChangeObserver.h"
#include "zkfpga/tree_owner.h"

namespace zkhw {

class ResTreeNodeObserverAdapter : public ResTreeNodeChangeObserver {
  public:
    // In `Unadvise` any number; in `Advise` a number like any other.
    static constexpr ULONG anyId = 0xFFFFFFFF;

    // Keeps a reference to both.
    ResTreeNodeObserverAdapter(ResTreeNodeAdapter* adapter, IzkhwResourceTreeNodeObserver* observer, ULONG id);
    ~ResTreeNodeObserverAdapter() override;
    ResTreeNodeObserverAdapter(const ResTreeNodeObserverAdapter&) = delete;
    ResTreeNodeObserverAdapter& operator=(const ResTreeNodeObserverAdapter&) = delete;

    // Calls the host's observer with the view that it was registered on. The host may end this very registration.
    void OnNodeChanged(ResTreeNode* node, uint32_t changes, int32_t context) override;

    // Leaves the set; true if it was there, and the dying node has to delete it.
    bool DeleteWithNode() override;

    ResTreeNodeAdapter* GetAdapter() const { return m_adapter; }
    ResTreeNode* GetNode() const { return m_adapter->GetNode(); }
    IzkhwResourceTreeNodeObserver* GetObserver() const { return m_observer; }
    ULONG GetId() const { return m_id; }

  private:
    ResTreeNodeAdapter* m_adapter;
    IzkhwResourceTreeNodeObserver* m_observer;
    ULONG m_id;
};

}  // namespace zkhw
