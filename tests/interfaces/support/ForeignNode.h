#pragma once

// A node that is no object of this library: a host may compare its own with ours.

#include <string>
#include <utility>

#include "interfaces/InterfacePointer.h"
#include "zkfpga/tree_node.h"

namespace zkhw {

// Every operation fails.
class FailingNode : public IzkhwResourceTreeNode5 {
  public:
    HRESULT STDMETHODCALLTYPE GetName(BSTR*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetPath(BSTR*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetDisplayPath(BSTR*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE SetName(LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetType(BSTR*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetTypes(ULONG*, BSTR**) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE IsOfType(LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetProperty(LPCWSTR, BSTR*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetPropertyAt(ULONG, BSTR*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE SetProperty(LPCWSTR, LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE SetPropertyAt(ULONG, LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetPropertyNames(ULONG*, BSTR**) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetReservation(LPCWSTR, ULONG*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE Reserve(LPCWSTR, ULONG, ULONG*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE Unreserve(LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE ReserveDescendants(LPCWSTR, ULONG, LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE UnreserveDescendants(LPCWSTR, LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE LoadContent(LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE RemoveEntry(LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE HasParent() override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetParent(IzkhwResourceTreeNode**) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE HasChildren() override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetChildren(ULONG*, IzkhwResourceTreeNode***) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetChildrenOfType(LPCWSTR, ULONG*, IzkhwResourceTreeNode***) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetDescendantsOfType(LPCWSTR, ULONG*, IzkhwResourceTreeNode***) override {
        return E_FAIL;
    }
    HRESULT STDMETHODCALLTYPE GetChildNames(LPCWSTR, BOOL, ULONG*, BSTR**, BSTR**) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetChildNamesOfType(LPCWSTR, LPCWSTR, BOOL, ULONG*, BSTR**, BSTR**) override {
        return E_FAIL;
    }
    HRESULT STDMETHODCALLTYPE GetDescendantNames(LPCWSTR, LPCWSTR, BOOL, ULONG*, BSTR**, BSTR**) override {
        return E_FAIL;
    }
    HRESULT STDMETHODCALLTYPE FindNode(LPCWSTR, ULONG*, BOOL*, IzkhwResourceTreeNode**) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE Advise(IzkhwResourceTreeNodeObserver*, ULONG, ULONG) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE Unadvise(IzkhwResourceTreeNodeObserver*, ULONG, BOOL) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE BeginChange(ULONG*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE EndChange(ULONG, BOOL) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE HasPendingChanges() override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetXml(BSTR*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetReservationEx(LPCWSTR, BOOL, ULONG*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetFilteredXml(ULONG, LPCWSTR*, ULONG, LPCWSTR*, BSTR*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE IsCompatibleWith(IzkhwResourceTreeNode*, BOOL*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE CloneDetached(LPCWSTR, IzkhwResourceTreeNode**) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetDescendantNamesEx(LPCWSTR, LPCWSTR, BOOL, LPCWSTR, ULONG*, BSTR**, BSTR**) override {
        return E_FAIL;
    }
    HRESULT STDMETHODCALLTYPE GetFilteredXmlEx(BOOL, ULONG, LPCWSTR*, ULONG, LPCWSTR*, BSTR*) override {
        return E_FAIL;
    }
    HRESULT STDMETHODCALLTYPE ResolveReservations(IzkProjectItemLocator*, ULONG*, IUnknown***, ULONG*, BSTR**,
                                                  BOOL) override {
        return E_FAIL;
    }
    HRESULT STDMETHODCALLTYPE ReserveForItem(IzkProjectItem*, ULONG, ULONG*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetReservationForItem(IzkProjectItem*, ULONG*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE UnreserveForItem(IzkProjectItem*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE ReserveDescendantsForItem(IzkProjectItem*, ULONG, LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE UnreserveDescendantsForItem(IzkProjectItem*, LPCWSTR) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE IsCompatibleWithEx(IzkhwResourceTreeNode*, BOOL*, BOOL) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE IsLocalizedProperty(LPCWSTR) override { return E_FAIL; }

  protected:
    ~FailingNode() = default;
};

// What goes wrong in the nodes of a foreign tree, and how many of them are alive.
struct ForeignTree {
    bool hasVersion5 = true;
    bool givesNullValues = false;
    HRESULT propertyResult = S_OK;   // Other than S_OK: in place of every value; the value is given all the same.
    HRESULT localizedResult = S_OK;  // Other than S_OK: in place of IsLocalizedProperty's own.
    std::u16string calls;            // A letter each: F FindNode, Q QueryInterface, P GetProperty, L IsLocalized.
    int liveObjects = 0;
};

// Answers what a comparison asks of the other side, from a node of this library behind it. Its version 5 is an object
// of its own, as it may be with a host.
class ForeignNode final : public FailingNode {
  public:
    ForeignNode(ForeignTree& tree, IzkhwResourceTreeNode* inner)
        : tree(tree), inner(InterfacePointer<IzkhwResourceTreeNode>::Share(inner)) {
        ++tree.liveObjects;
    }

    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** result) override {
        tree.calls += u'Q';
        *result = nullptr;
        if (!(id == IID_IzkhwResourceTreeNode5) || !tree.hasVersion5) {
            return E_NOINTERFACE;
        }
        *result = static_cast<IzkhwResourceTreeNode5*>(new ForeignNode(tree, inner.Get()));
        return S_OK;
    }
    ULONG STDMETHODCALLTYPE AddRef() override { return ++references; }
    ULONG STDMETHODCALLTYPE Release() override {
        const ULONG left = --references;
        if (left == 0) {
            --tree.liveObjects;
            delete this;
        }
        return left;
    }

    HRESULT STDMETHODCALLTYPE FindNode(LPCWSTR path, ULONG* consumed, BOOL* crossedLink,
                                       IzkhwResourceTreeNode** node) override {
        tree.calls += u'F';
        InterfacePointer<IzkhwResourceTreeNode> found;
        const HRESULT result = inner->FindNode(path, consumed, crossedLink, found.Receive());
        *node = found ? new ForeignNode(tree, found.Get()) : nullptr;
        return result;
    }
    HRESULT STDMETHODCALLTYPE GetProperty(LPCWSTR name, BSTR* value) override {
        tree.calls += u'P';
        if (tree.givesNullValues) {
            *value = nullptr;
            return S_OK;
        }
        const HRESULT result = inner->GetProperty(name, value);
        return result == S_OK ? tree.propertyResult : result;
    }
    HRESULT STDMETHODCALLTYPE IsLocalizedProperty(LPCWSTR name) override {
        tree.calls += u'L';
        InterfacePointer<IzkhwResourceTreeNode5> latest;
        inner->QueryInterface(IID_IzkhwResourceTreeNode5, latest.ReceiveAny());
        return tree.localizedResult != S_OK ? tree.localizedResult : latest->IsLocalizedProperty(name);
    }

  private:
    ~ForeignNode() = default;

    ForeignTree& tree;
    InterfacePointer<IzkhwResourceTreeNode> inner;
    ULONG references = 1;
};

}  // namespace zkhw
