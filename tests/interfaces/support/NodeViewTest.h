#pragma once

// Views over a tree that a test makes by hand.

#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "interfaces/AdapterObserverSet.h"
#include "interfaces/InterfacePointer.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "interfaces/support/HostMemory.h"
#include "restree/ResTreeNode.h"
#include "support/TreeMaking.h"

namespace zkhw {

using NodeView = InterfacePointer<IzkhwResourceTreeNode5>;

// A new view with one reference.
inline NodeView MakeView(ResTreeNode& node, AdapterObserverSet& observers) {
    NodeView view;
    ResTreeNodeAdapter::Make(&node, &observers)->QueryInterface(IID_IzkhwResourceTreeNode5, view.ReceiveAny());
    return view;
}

// A tree whose root keeps the order of its entries.
class NodeViewTest : public ::testing::Test {
  protected:
    NodeView View(ResTreeNode& node) { return MakeView(node, observers); }
    NodeView Root() { return View(*root); }

    AdapterObserverSet observers;  // Outlives the tree.
    std::unique_ptr<ResTreeNode> root = MakeRootNode(true);
};

}  // namespace zkhw
