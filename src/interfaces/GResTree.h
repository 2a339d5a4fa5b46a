#pragma once

// Queries on the whole tree (zkfpga/tree_root.h says what each operation does).

#include <vector>

#include "interfaces/CQNComObject.h"
#include "interfaces/InterfacePointer.h"
#include "interfaces/QueryOptions.h"
#include "interfaces/ResourceToAliasMapBuilder.h"
#include "zkfpga/tree_node.h"
#include "zkfpga/tree_root.h"

namespace zkhw {

class GResTree : public IzkEIOGResourceTree2, public CQNComObjectRootEx<CQNComSingleThreadModel> {
  public:
    static const InterfaceMapEntry interfaceMap[];

    // Keeps references to `item`, which may be null, and to `root`, but none to `context`, which may be null too.
    void Bind(IzkHostContext* context, IzkProjectItem* item, IzkhwResourceTreeNode* root);

    HRESULT STDMETHODCALLTYPE GetDescendantNames(LPCWSTR path, LPCWSTR options, ULONG* count, BSTR** names) override;
    HRESULT STDMETHODCALLTYPE GetMultiplePropertyNames(LPCWSTR path, LPCWSTR options, ULONG* count,
                                                       BSTR** names) override;
    HRESULT STDMETHODCALLTYPE GetMultipleProperties(LPCWSTR path, LPCWSTR options, ULONG* count,
                                                    BSTR** values) override;
    HRESULT STDMETHODCALLTYPE GetProperty(LPCWSTR path, LPCWSTR options, BSTR* value) override;
    HRESULT STDMETHODCALLTYPE GetFilteredXml(LPCWSTR path, ULONG nodeNameCount, LPCWSTR* nodeNames,
                                             ULONG propertyNameCount, LPCWSTR* propertyNames, BSTR* xml) override;

  protected:
    // Releases the root, then the item.
    virtual ~GResTree() = default;

  private:
    HRESULT GetProperties(LPCWSTR path, LPCWSTR options, bool withValues, ULONG* count, BSTR** texts);
    ResourceToAliasMap CollectAliases(const QueryOptions& options);

    IzkHostContext* m_context = nullptr;
    InterfacePointer<IzkProjectItem> m_item;
    InterfacePointer<IzkhwResourceTreeNode> m_root;
};

}  // namespace zkhw
