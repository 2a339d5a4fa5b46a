#pragma once

// The view of a node that a host holds (zkfpga/tree_node.h says what each operation does). A view doesn't keep its node
// alive, except the one that CloneDetached makes, which owns node and observers. Every operation converts the
// boundary's types, calls the tree, and converts back; walks that exist only here are in files of their own.

#include "interfaces/CQNComObject.h"
#include "zkfpga/tree_node.h"

namespace zkhw {

class AdapterObserverSet;
class ResTreeNode;

class ResTreeNodeAdapter : public IzkhwResourceTreeNode5, public CQNComObjectRootEx<CQNComSingleThreadModel> {
  public:
    static const InterfaceMapEntry interfaceMap[];

    // A new view with no reference yet; null if there is no memory.
    static ResTreeNodeAdapter* Make(ResTreeNode* node, AdapterObserverSet* observers);

    // Makes this view the owner of its node and its observers.
    void TakeOwnership() { m_ownsNode = true; }

    ResTreeNode* GetNode() const { return m_node; }
    AdapterObserverSet* GetObservers() const { return m_observers; }

    HRESULT STDMETHODCALLTYPE GetName(BSTR* name) override;
    HRESULT STDMETHODCALLTYPE GetPath(BSTR* path) override;
    HRESULT STDMETHODCALLTYPE GetDisplayPath(BSTR* path) override;
    HRESULT STDMETHODCALLTYPE SetName(LPCWSTR name) override;
    HRESULT STDMETHODCALLTYPE GetType(BSTR* type) override;
    HRESULT STDMETHODCALLTYPE GetTypes(ULONG* count, BSTR** types) override;
    HRESULT STDMETHODCALLTYPE IsOfType(LPCWSTR type) override;

    HRESULT STDMETHODCALLTYPE GetProperty(LPCWSTR name, BSTR* value) override;
    HRESULT STDMETHODCALLTYPE GetPropertyAt(ULONG index, BSTR* value) override;
    HRESULT STDMETHODCALLTYPE SetProperty(LPCWSTR name, LPCWSTR value) override;
    HRESULT STDMETHODCALLTYPE SetPropertyAt(ULONG index, LPCWSTR value) override;
    HRESULT STDMETHODCALLTYPE GetPropertyNames(ULONG* count, BSTR** names) override;

    HRESULT STDMETHODCALLTYPE GetReservation(LPCWSTR owners, ULONG* mode) override;
    HRESULT STDMETHODCALLTYPE Reserve(LPCWSTR owner, ULONG mode, ULONG* granted) override;
    HRESULT STDMETHODCALLTYPE Unreserve(LPCWSTR owner) override;
    HRESULT STDMETHODCALLTYPE ReserveDescendants(LPCWSTR owner, ULONG mode, LPCWSTR type) override;
    HRESULT STDMETHODCALLTYPE UnreserveDescendants(LPCWSTR owner, LPCWSTR type) override;

    HRESULT STDMETHODCALLTYPE LoadContent(LPCWSTR fragment) override;
    HRESULT STDMETHODCALLTYPE RemoveEntry(LPCWSTR name) override;

    HRESULT STDMETHODCALLTYPE HasParent() override;
    HRESULT STDMETHODCALLTYPE GetParent(IzkhwResourceTreeNode** parent) override;
    HRESULT STDMETHODCALLTYPE HasChildren() override;
    HRESULT STDMETHODCALLTYPE GetChildren(ULONG* count, IzkhwResourceTreeNode*** nodes) override;
    HRESULT STDMETHODCALLTYPE GetChildrenOfType(LPCWSTR type, ULONG* count, IzkhwResourceTreeNode*** nodes) override;
    HRESULT STDMETHODCALLTYPE GetDescendantsOfType(LPCWSTR type, ULONG* count, IzkhwResourceTreeNode*** nodes) override;

    HRESULT STDMETHODCALLTYPE GetChildNames(LPCWSTR path, BOOL includePath, ULONG* count, BSTR** names,
                                            BSTR** displayNames) override;
    HRESULT STDMETHODCALLTYPE GetChildNamesOfType(LPCWSTR path, LPCWSTR type, BOOL includePath, ULONG* count,
                                                  BSTR** names, BSTR** displayNames) override;
    HRESULT STDMETHODCALLTYPE GetDescendantNames(LPCWSTR path, LPCWSTR type, BOOL includePath, ULONG* count,
                                                 BSTR** names, BSTR** displayNames) override;
    HRESULT STDMETHODCALLTYPE FindNode(LPCWSTR path, ULONG* consumed, BOOL* crossedLink,
                                       IzkhwResourceTreeNode** node) override;

    HRESULT STDMETHODCALLTYPE Advise(IzkhwResourceTreeNodeObserver* observer, ULONG mask, ULONG id) override;
    HRESULT STDMETHODCALLTYPE Unadvise(IzkhwResourceTreeNodeObserver* observer, ULONG id, BOOL subtree) override;
    HRESULT STDMETHODCALLTYPE BeginChange(ULONG* pending) override;
    HRESULT STDMETHODCALLTYPE EndChange(ULONG flags, BOOL replace) override;
    HRESULT STDMETHODCALLTYPE HasPendingChanges() override;

    HRESULT STDMETHODCALLTYPE GetXml(BSTR* xml) override;
    HRESULT STDMETHODCALLTYPE GetReservationEx(LPCWSTR owners, BOOL except, ULONG* mode) override;
    HRESULT STDMETHODCALLTYPE GetFilteredXml(ULONG nodeNameCount, LPCWSTR* nodeNames, ULONG propertyNameCount,
                                             LPCWSTR* propertyNames, BSTR* xml) override;
    HRESULT STDMETHODCALLTYPE IsCompatibleWith(IzkhwResourceTreeNode* other, BOOL* result) override;
    HRESULT STDMETHODCALLTYPE CloneDetached(LPCWSTR name, IzkhwResourceTreeNode** clone) override;
    HRESULT STDMETHODCALLTYPE GetDescendantNamesEx(LPCWSTR path, LPCWSTR type, BOOL includePath,
                                                   LPCWSTR exclusionProperty, ULONG* count, BSTR** names,
                                                   BSTR** displayNames) override;
    HRESULT STDMETHODCALLTYPE GetFilteredXmlEx(BOOL keep, ULONG nodeNameCount, LPCWSTR* nodeNames,
                                               ULONG propertyNameCount, LPCWSTR* propertyNames, BSTR* xml) override;
    HRESULT STDMETHODCALLTYPE ResolveReservations(IzkProjectItemLocator* locator, ULONG* foundCount, IUnknown*** found,
                                                  ULONG* missingCount, BSTR** missing, BOOL activeOnly) override;
    HRESULT STDMETHODCALLTYPE ReserveForItem(IzkProjectItem* item, ULONG mode, ULONG* granted) override;
    HRESULT STDMETHODCALLTYPE GetReservationForItem(IzkProjectItem* item, ULONG* mode) override;
    HRESULT STDMETHODCALLTYPE UnreserveForItem(IzkProjectItem* item) override;
    HRESULT STDMETHODCALLTYPE ReserveDescendantsForItem(IzkProjectItem* item, ULONG mode, LPCWSTR type) override;
    HRESULT STDMETHODCALLTYPE UnreserveDescendantsForItem(IzkProjectItem* item, LPCWSTR type) override;
    HRESULT STDMETHODCALLTYPE IsCompatibleWithEx(IzkhwResourceTreeNode* other, BOOL* result,
                                                 BOOL skipLocalized) override;
    HRESULT STDMETHODCALLTYPE IsLocalizedProperty(LPCWSTR name) override;

  protected:
    virtual ~ResTreeNodeAdapter() = default;

    // An owning view ends the registrations of its tree, then destroys it.
    void FinalRelease();

  private:
    bool m_ownsNode = false;
    ResTreeNode* m_node = nullptr;
    AdapterObserverSet* m_observers = nullptr;  // Shared by all views of a tree; its owner's, or the owning view's.
};

}  // namespace zkhw
