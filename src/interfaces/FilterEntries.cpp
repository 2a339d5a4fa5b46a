#include "interfaces/FilterEntries.h"

#include <vector>

#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

namespace {

// What is loaded may ask for more to be loaded; a file that asks for itself ends here.
constexpr int maximalLoads = 256;

bool IsNamed(const EntryFilter& filter, const NodeEntry& entry) {
    if (const ResTreeNode* const child = entry.Child()) {
        return filter.nodeNames.count(entry.Key()) != 0 || filter.nodeNames.count(child->GetType()) != 0;
    }
    return entry.IsText() && filter.propertyNames.count(entry.Key()) != 0;
}

// Filters the entries as they stand; gives the children that stay. True if anything went.
bool FilterOneNode(ResTreeNode& node, const EntryFilter& filter, std::vector<ResTreeNode*>& remaining) {
    std::vector<NodeEntry*> unwanted;
    for (EntryIterator entry = node.Begin(); !entry.IsEnd(); ++entry) {
        if (IsNamed(filter, *entry) != filter.keep) {
            unwanted.push_back(&*entry);
        } else if (ResTreeNode* const child = entry->Child()) {
            remaining.push_back(child);
        }
    }
    for (NodeEntry* const entry : unwanted) {
        node.RemoveEntry(entry);
    }
    return !unwanted.empty();
}

}  // namespace

void FilterEntries(ResTreeNode& top, const EntryFilter& filter) {
    const ReleaseScope scope;
    std::vector<ResTreeNode*> waiting{&top};
    while (!waiting.empty()) {
        ResTreeNode* const node = waiting.back();
        waiting.pop_back();
        const size_t first = waiting.size();
        bool mayLoadMore = true;
        for (int round = 0; mayLoadMore && round < maximalLoads; ++round) {
            node->EnsureDeferredLoaded();
            waiting.resize(first);
            mayLoadMore = FilterOneNode(*node, filter, waiting) && node->FindRaw(u":DeferredLoadPath") != nullptr;
        }
    }
}

}  // namespace zkhw
