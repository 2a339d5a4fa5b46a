#pragma once

// What holds for every tree, however it came about.

#include <vector>

#include "FuzzInput.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/ResTreeNode.h"

namespace fuzz {

// Visits every node without recursion and without loading what is deferred.
inline void CheckTree(zkhw::ResTreeNode& root) {
    using qn::dsc::osdep::Compare;
    Require(root.GetParent() == nullptr, "a root has no parent");
    std::vector<zkhw::ResTreeNode*> open{&root};
    while (!open.empty()) {
        zkhw::ResTreeNode& node = *open.back();
        open.pop_back();
        const zkhw::NodeEntry* previous = nullptr;
        for (auto entry = node.Begin(); entry != node.End(); ++entry) {
            Require(node.IsOrdered() || previous == nullptr || Compare(previous->Key(), entry.Key()) < 0,
                    "an unordered node has its keys in order, each once");
            previous = &*entry;
            const zkhw::NodeEntry* found = node.FindRaw(entry.Key());
            Require(found != nullptr, "every entry's key is found");
            Require(node.IsOrdered() ? Compare(found->Key(), entry.Key()) == 0 : found == &*entry,
                    "the key of an unordered node finds its entry");
            Require(node.PositionOf(&*entry) == entry, "an entry stands where it is found");
            if (entry->Kind() == zkhw::ChildEntry) {
                Require(entry->Child() != nullptr && entry->Child()->GetParent() == &node, "a child knows its parent");
                open.push_back(entry->Child());
            } else {
                Require(entry->Text() || entry->LinkPath(), "what is no child has a text");
            }
        }
    }
}

// What the reader builds can be found again by its path, as long as names do the finding: below unordered nodes, where
// no entry ahead has the name. `limit` bounds the nodes that are tried.
inline void CheckPaths(zkhw::ResTreeNode& root, size_t limit) {
    std::vector<zkhw::ResTreeNode*> open{&root};
    for (size_t tried = 0; !open.empty() && tried < limit; ++tried) {
        zkhw::ResTreeNode& node = *open.back();
        open.pop_back();
        Require(root.Lookup(node.GetPath().View(), nullptr) == &node, "a node is found by its path");
        for (auto entry = node.Begin(); !node.IsOrdered() && entry != node.End(); ++entry) {
            zkhw::ResTreeNode* child = entry->Child();
            // An empty name and the names of the navigation are not found as components.
            const auto isNamed = [&](std::u16string_view name) { return qn::dsc::osdep::Equal(entry.Key(), name); };
            if (child != nullptr && child->GetName() == entry.Key() && !isNamed(u"") && !isNamed(u".") &&
                !isNamed(u"..")) {
                open.push_back(child);
            }
        }
    }
}

}  // namespace fuzz
