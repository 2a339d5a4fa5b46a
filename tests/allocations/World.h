#pragma once

// The tree in which operations of nodes and of trees are called, with a host around it. By types and names:
//
//     /N          a Stage, ordered: DisplayName, Protocols = "P,Q", SupportedValues = "a,b", Reserves = "../Partner",
//                 the localised Loc = "x", the T "with/slash" with P = "1", and the link Partner to /Partner
//     /Partner    a Part that three items read
//
// An observer of the host hears of every change of /N. The host's objects allocate nothing while an operation runs:
// what they give is made by GetReady.

#include <string>
#include <utility>

#include "interfaces/ResourceToAliasMapBuilder.h"
#include "interfaces/support/OwnedTree.h"
#include "interfaces/support/ProjectItems.h"
#include "support/TemporaryFolder.h"
#include "zkfpga/tree_owner.h"

namespace allocations {

using zkhw::StackObject;

// A string that the host gives away once.
class ReadyText {
  public:
    explicit ReadyText(const char16_t* content) : content(content) {}
    ReadyText(const ReadyText&) = delete;
    ReadyText& operator=(const ReadyText&) = delete;
    ~ReadyText() { SysFreeString(text); }

    void GetReady() {
        if (text == nullptr) {
            text = SysAllocString(reinterpret_cast<const OLECHAR*>(content));
        }
    }
    BSTR Give() { return std::exchange(text, nullptr); }

  private:
    const char16_t* content;
    BSTR text = nullptr;
};

// The item {AAAAAAAA-0000-0000-0000-000000000001}, named "Alias". It offers itself as what is below it.
class Item final : public StackObject<IzkProjectItem> {
  public:
    HRESULT STDMETHODCALLTYPE GetItemInfo(ProjectItemRecord* record) override;
    HRESULT STDMETHODCALLTYPE GetName(BSTR* result) override;
    HRESULT STDMETHODCALLTYPE GetProject(IUnknown** project) override;
    HRESULT STDMETHODCALLTYPE SelectItems(IzkProjectItemSelector* selector, IUnknown** result) override;

    ReadyText name{u"Alias"};
};

// Refers to /N/Partner.
class Link final : public StackObject<IzkItemResourceLink> {
  public:
    HRESULT STDMETHODCALLTYPE GetResourcePath(BSTR* result) override;

    ReadyText path{u"/N/Partner"};
};

class Marker final : public StackObject<IzkItemMarker> {};

// The project's own item: marked, and linked to a resource.
class FoundItem final : public StackObject<IUnknown> {
  public:
    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** result) override;

    Marker marker;
    Link link;
};

// Knows the items of the reservations by the first number of their ids; that of C can't be used.
class Locator final : public StackObject<IzkProjectItemLocator> {
  public:
    HRESULT STDMETHODCALLTYPE FindItemById(GUID id, IUnknown** item) override;
    HRESULT STDMETHODCALLTYPE FindItem(ProjectItemRecord* record, IUnknown** item) override;

    FoundItem found;
};

// Stands for a tree, whose root is the node that it holds.
class Context final : public StackObject<IzkHostContext> {
  public:
    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** result) override;
    IzkProjectItemLocator* STDMETHODCALLTYPE GetItemLocator() override { return locator; }

    IzkProjectItemLocator* locator = nullptr;
};

class Observer final : public StackObject<IzkhwResourceTreeNodeObserver> {
  public:
    HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode*, ULONG, ULONG) override { return S_OK; }
};

// A file with the contents of /N.
class ContentsFile {
  public:
    ContentsFile();
    zkhw::String Path() const { return folder.System(u"contents.xml"); }

  private:
    qn::dsc::osdep::TemporaryFolder folder;
};

class World {
  public:
    // With a `file`, /N names that and has nothing else.
    explicit World(const ContentsFile* file);
    World(const World&) = delete;
    World& operator=(const World&) = delete;
    ~World();

    void GetReady();
    std::string State();
    std::string Rest();

    // These outlive the tree.
    Item item;
    Locator locator;
    Context context;
    Observer observer;
    Observer second;  // Of nothing yet.
    zkhw::ResourceToAliasMap aliases;
    zkhw::OwnedTree tree;
    zkhw::ResTreeNode& n;
    zkhw::ResTreeNode& partner;
    zkhw::View view;  // Of /N.
    zkhw::View rootView;
    zkhw::View partnerView;
    zkhw::InterfacePointer<IzkEIOGResourceTree2> queries;
    zkhw::InterfacePointer<IzkhwResourceTreeOwner> owner;  // Of what the context stands for.

    // With `wantsCopy` GetReady makes one of /N, which `second` observes.
    bool wantsCopy = false;
    zkhw::InterfacePointer<IzkhwResourceTreeNode> copy;
};

// Makes the contents of /N.
void Fill(zkhw::ResTreeNode& n);

}  // namespace allocations
