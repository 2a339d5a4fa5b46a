#pragma once

// A tree's owner as a host sees it: a handle on an object of the host that stands for the tree (zkfpga/tree_owner.h).

#include "interfaces/CQNComObject.h"
#include "interfaces/InterfacePointer.h"
#include "zkfpga/tree_owner.h"

namespace zkhw {

class ResTreeOwnerAdapter : public IzkhwResourceTreeOwner, public CQNComObjectRootEx<CQNComSingleThreadModel> {
  public:
    static const InterfaceMapEntry interfaceMap[];

    // Keeps a reference to the host's object.
    void SetInner(IUnknown* inner) { m_inner = InterfacePointer<IUnknown>::Share(inner); }

    // Traps if there is no such object.
    HRESULT STDMETHODCALLTYPE GetRootNode(IzkhwResourceTreeNode** root) override;

  protected:
    virtual ~ResTreeOwnerAdapter() = default;

  private:
    InterfacePointer<IUnknown> m_inner;
};

}  // namespace zkhw
