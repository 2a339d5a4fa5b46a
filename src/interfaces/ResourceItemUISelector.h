#pragma once

// Looks at the project items that the host offers one by one, and hands those that refer to a resource of the tree on.

#include "interfaces/CQNComObject.h"
#include "zkfpga/host_interfaces.h"

namespace zkhw {

class ResourceItemUISelector : public IzkProjectItemSelector, public CQNComObjectRootEx<CQNComMultiThreadModelNoCS> {
  public:
    static const InterfaceMapEntry interfaceMap[];

    explicit ResourceItemUISelector(IzkHostContext* context) : m_context(context) {}

    // Finds the project's own item for `item`, and calls OnItem if that is marked and linked to a resource; S_OK if
    // OnItem says that this was the one, otherwise S_FALSE.
    HRESULT STDMETHODCALLTYPE SelectItem(IzkProjectItem* item, BOOL* result) override;

    // Whether the search is over. The three stay the caller's.
    virtual bool OnItem(IzkProjectItem* item, IzkItemMarker* marker, IzkItemResourceLink* link) = 0;

  protected:
    virtual ~ResourceItemUISelector() = default;

  private:
    IzkHostContext* m_context;  // No reference. Null: no item is found.
};

}  // namespace zkhw
