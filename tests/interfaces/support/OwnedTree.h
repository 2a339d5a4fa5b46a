#pragma once

// A tree with its owner, as a host comes to it.

#include <functional>
#include <memory>

#include "interfaces/BoundaryText.h"
#include "interfaces/InterfacePointer.h"
#include "restree/ResTreeNode.h"
#include "restree/ResTreeOwner.h"
#include "support/TreeMaking.h"
#include "zkfpga/tree_node.h"
#include "zkfpga/tree_root.h"

namespace zkhw {

using View = InterfacePointer<IzkhwResourceTreeNode5>;

inline LPCWSTR Text(const char16_t* text) {
    return reinterpret_cast<LPCWSTR>(text);
}

// Makes its tree with `create`, at first an unordered root without entries.
class TestOwner : public ResTreeOwner {
  public:
    int32_t CreateRootNode(ResTreeNode*& root) override {
        ++creations;
        return create(root);
    }
    int32_t OnRootNodeCreated(ResTreeNode* root) override {
        announced = root;
        return announcement;
    }

    std::function<int32_t(ResTreeNode*&)> create = [](ResTreeNode*& root) {
        root = MakeRootNode().release();
        return 0;
    };
    int32_t announcement = 0;
    int creations = 0;
    ResTreeNode* announced = nullptr;
};

// An owner with its tree made; the node `Root()` is there to be filled.
class OwnedTree {
  public:
    explicit OwnedTree(bool isOrdered = false) : owner(std::make_unique<TestOwner>()) {
        owner->create = [isOrdered](ResTreeNode*& node) {
            node = MakeRootNode(isOrdered).release();
            return 0;
        };
        owner->GetRootNode(root);
    }

    ResTreeNode& Root() { return *root; }

    View RootView() {
        View view;
        owner->QueryTreeInterface(IID_IzkhwResourceTreeNode5, nullptr, nullptr, view.ReceiveAny());
        return view;
    }

    // A view of the node at a path; every call makes a new one.
    View At(const char16_t* path) {
        View view;
        RootView()->FindNode(Text(path), nullptr, nullptr,
                             reinterpret_cast<IzkhwResourceTreeNode**>(view.ReceiveAny()));
        return view;
    }

    InterfacePointer<IzkEIOGResourceTree2> Tree(IzkHostContext* context = nullptr, IzkProjectItem* item = nullptr) {
        InterfacePointer<IzkEIOGResourceTree2> tree;
        owner->QueryTreeInterface(IID_IzkEIOGResourceTree2, context, item, tree.ReceiveAny());
        return tree;
    }

    TestOwner& Owner() { return *owner; }

    // The end of the tree.
    void End() { owner.reset(); }

  private:
    std::unique_ptr<TestOwner> owner;
    ResTreeNode* root = nullptr;
};

// How many references an object has, by its own account.
inline ULONG ReferencesOf(IUnknown* object) {
    object->AddRef();
    return object->Release();
}

}  // namespace zkhw
