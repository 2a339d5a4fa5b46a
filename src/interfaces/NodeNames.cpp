#include "interfaces/NodeNames.h"

#include <utility>

#include "interfaces/NodePathWalk.h"
#include "interfaces/NodesOnPath.h"
#include "restree/EntryWalk.h"
#include "restree/NodePath.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

bool IsExcludedBy(std::u16string_view exclusionProperty, ResTreeNode& node) {
    if (exclusionProperty.empty()) {
        return false;
    }
    const auto value = node.GetProperty(exclusionProperty);
    return value && (value->empty() || ParseBool(*value));
}

String DisplayPathBelow(const String& parentDisplayPath, ResTreeNode& node) {
    // First, since it may load, and so change the name.
    const auto displayName = node.GetProperty(u"DisplayName");
    return JoinDisplayPath(parentDisplayPath, node.GetName(), displayName);
}

// The node's path as text, made when it is first asked for.
class LazyPath {
  public:
    const String& Of(const ResTreeNode& node) {
        if (!isMade) {
            path = node.GetPath();
            isMade = true;
        }
        return path;
    }
    const String& DisplayOf(ResTreeNode& node) {
        if (!isMade) {
            path = node.GetDisplayPath();
            isMade = true;
        }
        return path;
    }

  private:
    String path = String::WithoutBuffer();
    bool isMade = false;
};

// Walks everything below a node. A plain child bears its own path until the walk of its parent has met a link; from
// there on, every node is named by the way on which the walk comes to it.
class DescendantNames {
  public:
    DescendantNames(const NameQuery& query, NameLists& lists) : query(query), lists(lists) {}

    void Collect(ResTreeNode& top, bool crossed, String base, String displayBase) {
        Enter(top, crossed, std::move(base), std::move(displayBase));
        while (!levels.empty()) {
            Level& level = levels.back();
            NodeEntry* const entry = level.walk.Next(level.node->Entries());
            if (entry == nullptr) {
                levels.pop_back();
                path.Leave();
                continue;
            }
            ResTreeNode* const child = level.node->ResolveEntry(entry);
            if (child != nullptr && !path.Contains(child, *entry)) {
                Visit(level, *entry, *child);
                Enter(*child, level.crossed, level.newBase, level.newDisplayBase);
            }
        }
    }

  private:
    struct Level {
        ResTreeNode* node;
        EntryWalk walk;
        bool crossed;  // A link was met on the way here, or among the entries so far.
        // The way on which the walk came here; read only once `crossed` is set.
        String base;
        String displayBase;
        // The way to the entry that was named last. Entries in front of a link hand it on as it stands.
        String newBase;
        String newDisplayBase;
        LazyPath ownPath;
        LazyPath ownDisplayPath;
    };

    void Enter(ResTreeNode& node, bool crossed, String base, String displayBase) {
        path.Enter(&node);
        node.EnsureDeferredLoaded();
        levels.push_back({&node, {}, crossed, std::move(base), std::move(displayBase), {}, {}, {}, {}});
    }

    bool IsWanted(ResTreeNode& child) const {
        return child.Supports(query.type) && !IsExcludedBy(query.exclusionProperty, child);
    }

    void Visit(Level& level, const NodeEntry& entry, ResTreeNode& child) {
        ResTreeNode& node = *level.node;
        if (!level.crossed && entry.Kind() != LinkEntry) {
            if (IsWanted(child)) {
                AppendPlainChild(level, child);
            }
            return;
        }
        if (query.includePath) {
            level.newBase = JoinEscapedPath(level.crossed ? level.base : level.ownPath.Of(node), entry.Key());
        }
        if (query.wantsDisplayPaths) {
            level.newDisplayBase =
                DisplayPathBelow(level.crossed ? level.displayBase : level.ownDisplayPath.DisplayOf(node), child);
        }
        if (IsWanted(child)) {
            lists.names.push_back(query.includePath ? level.newBase : String(child.GetName()));
            if (query.wantsDisplayPaths) {
                lists.displayPaths.push_back(level.newDisplayBase);
            }
        }
        level.crossed = true;
    }

    void AppendPlainChild(Level& level, ResTreeNode& child) {
        ResTreeNode& node = *level.node;
        lists.names.push_back(query.includePath ? JoinEscapedPath(level.ownPath.Of(node), child.GetName())
                                                : String(child.GetName()));
        if (query.wantsDisplayPaths) {
            lists.displayPaths.push_back(DisplayPathBelow(level.ownDisplayPath.DisplayOf(node), child));
        }
    }

    const NameQuery& query;
    NameLists& lists;
    std::vector<Level> levels;
    NodesOnPath path;
};

}  // namespace

void CollectChildNames(ResTreeNode& node, const NameQuery& query, NameLists& lists) {
    const ReleaseScope scope;
    String base = String::WithoutBuffer();
    if (query.includePath) {
        base = query.path != nullptr ? *query.path : node.GetPath();
    }
    String displayBase = String::WithoutBuffer();
    if (query.wantsDisplayPaths) {
        displayBase = node.GetDisplayPath();
    }
    node.EnsureDeferredLoaded();
    EntryWalk walk;
    while (NodeEntry* const entry = walk.Next(node.Entries())) {
        ResTreeNode* const child = node.ResolveEntry(entry);
        if (child == nullptr || !child->Supports(query.type)) {
            continue;
        }
        lists.names.push_back(query.includePath ? JoinEscapedPath(base, entry->Key()) : String(child->GetName()));
        if (query.wantsDisplayPaths) {
            lists.displayPaths.push_back(DisplayPathBelow(displayBase, *child));
        }
    }
}

void CollectDescendantNames(ResTreeNode& node, const NameQuery& query, NameLists& lists) {
    const ReleaseScope scope;
    bool crossed = false;
    String base;
    if (query.includePath) {
        if (query.path != nullptr) {
            crossed = WalkNodePath(node, query.path->View()).crossedLink;
            base = *query.path;
        } else {
            base = node.GetPath();
        }
    }
    String displayBase;
    if (query.wantsDisplayPaths) {
        displayBase = node.GetDisplayPath();
    }
    DescendantNames(query, lists).Collect(node, crossed, std::move(base), std::move(displayBase));
}

}  // namespace zkhw
