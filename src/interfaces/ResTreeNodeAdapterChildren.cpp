// The nodes next to a node and below it.

#include <vector>

#include "interfaces/BoundaryText.h"
#include "interfaces/NodeViews.h"
#include "interfaces/NodesOnPath.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "restree/EntryWalk.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

namespace {

// All nodes below `top` that are of `type`, in the order of a walk that enters every one, through links too.
class DescendantCollector {
  public:
    DescendantCollector(std::u16string_view type, std::vector<ResTreeNode*>& found) : type(type), found(found) {}

    void Collect(ResTreeNode& top) {
        Enter(top);
        while (!levels.empty()) {
            Level& level = levels.back();
            NodeEntry* const entry = level.walk.Next(level.node->Entries());
            if (entry == nullptr) {
                levels.pop_back();
                path.Leave();
                continue;
            }
            ResTreeNode* const child = level.node->ResolveEntry(entry);
            if (child == nullptr || path.Contains(child, *entry)) {
                continue;
            }
            if (child->Supports(type)) {
                found.push_back(child);
            }
            Enter(*child);
        }
    }

  private:
    struct Level {
        ResTreeNode* node;
        EntryWalk walk;
    };

    void Enter(ResTreeNode& node) {
        path.Enter(&node);
        node.EnsureDeferredLoaded();
        levels.push_back({&node, {}});
    }

    std::u16string_view type;
    std::vector<ResTreeNode*>& found;
    std::vector<Level> levels;
    NodesOnPath path;
};

}  // namespace

HRESULT ResTreeNodeAdapter::HasChildren() {
    const ReleaseScope scope;
    m_node->EnsureDeferredLoaded();
    EntryWalk walk;
    while (NodeEntry* const entry = walk.Next(m_node->Entries())) {
        if (m_node->ResolveEntry(entry) != nullptr) {
            return S_OK;
        }
    }
    return S_FALSE;
}

HRESULT ResTreeNodeAdapter::GetChildren(ULONG* count, IzkhwResourceTreeNode*** nodes) {
    return GetChildrenOfType(nullptr, count, nodes);
}

HRESULT ResTreeNodeAdapter::GetChildrenOfType(LPCWSTR type, ULONG* count, IzkhwResourceTreeNode*** nodes) {
    if (count == nullptr || nodes == nullptr) {
        return E_POINTER;
    }
    const ReleaseScope scope;
    std::vector<ResTreeNode*> children;
    m_node->EnsureDeferredLoaded();
    EntryWalk walk;
    while (NodeEntry* const entry = walk.Next(m_node->Entries())) {
        ResTreeNode* const child = m_node->ResolveEntry(entry);
        if (child != nullptr && child->Supports(ViewOf(type))) {
            children.push_back(child);
        }
    }
    return GiveViews(children, m_observers, count, nodes);
}

HRESULT ResTreeNodeAdapter::GetDescendantsOfType(LPCWSTR type, ULONG* count, IzkhwResourceTreeNode*** nodes) {
    if (count == nullptr || nodes == nullptr) {
        return E_POINTER;
    }
    const ReleaseScope scope;
    std::vector<ResTreeNode*> descendants;
    DescendantCollector(ViewOf(type), descendants).Collect(*m_node);
    return GiveViews(descendants, m_observers, count, nodes);
}

}  // namespace zkhw
