#include "interfaces/GResTree.h"

#include <utility>

#include "hostbridge/ClusterText.h"
#include "interfaces/BoundaryArrays.h"
#include "interfaces/BoundaryText.h"
#include "interfaces/CollectProperties.h"
#include "interfaces/NodeNames.h"
#include "interfaces/NodePathWalk.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "restree/AdapterFactory.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

namespace {

// The node at `path`, the root for the empty one; null if it leads nowhere.
ResTreeNode* FindPathNode(IzkhwResourceTreeNode* root, std::u16string_view path) {
    ResTreeNode& rootNode = *static_cast<ResTreeNodeAdapter*>(root)->GetNode();
    if (path.empty()) {
        return &rootNode;
    }
    const NodePathResult found = WalkNodePath(rootNode, path);
    return found.isComplete ? found.node : nullptr;
}

// Writes what `options` want of one name in its place. A name of which nothing would be left stays whole.
void PresentName(String& name, const String* displayPath, const QueryOptions& options,
                 const ResourceToAliasMap& aliases) {
    String shown;
    if (!options.stripPathPrefix.IsEmpty()) {
        shown = String(StripPathPrefix(name.View(), options.stripPathPrefix, options.includePath));
    } else {
        shown = name;
    }
    if (options.includeAliases || options.includeDisplayNames) {
        const auto alias = aliases.find(name);
        shown = MakeResourceCluster(shown, alias == aliases.end() ? String() : alias->second,
                                    displayPath == nullptr ? String() : UpToNul(*displayPath));
    }
    if (!shown.IsEmpty()) {
        name = std::move(shown);
    }
}

}  // namespace

const InterfaceMapEntry GResTree::interfaceMap[] = {
    {&IID_IzkEIOGResourceTree, 0, InterfaceMapEntry::plain},
    {&IID_IzkEIOGResourceTree2, 0, InterfaceMapEntry::plain},
    {nullptr, 0, InterfaceMapEntry::closing},
};

void GResTree::Bind(IzkHostContext* context, IzkProjectItem* item, IzkhwResourceTreeNode* root) {
    m_context = context;
    m_item = InterfacePointer<IzkProjectItem>::Share(item);
    m_root = InterfacePointer<IzkhwResourceTreeNode>::Share(root);
}

HRESULT GResTree::GetDescendantNames(LPCWSTR path, LPCWSTR options, ULONG* count, BSTR** names) {
    if (count == nullptr || names == nullptr) {
        return E_POINTER;
    }
    *count = 0;
    *names = nullptr;
    const ReleaseScope scope;
    const QueryOptions query = ParseQueryOptions(ViewOf(options), QueryKeys::All);
    ResTreeNode* const node = FindPathNode(m_root.Get(), ViewOf(path));
    if (node == nullptr) {
        return S_FALSE;
    }
    const String pathText = CopyOf(path);
    NameQuery nameQuery{.type = query.protocol.View(),
                        .exclusionProperty = query.exclusionProperty.View(),
                        .includePath = query.includePath,
                        .path = path != nullptr ? &pathText : nullptr,
                        .wantsDisplayPaths = query.includeDisplayNames};
    NameLists lists;
    if (query.recurse) {
        CollectDescendantNames(*node, nameQuery, lists);
    } else {
        CollectChildNames(*node, nameQuery, lists);
    }
    const ResourceToAliasMap aliases = CollectAliases(query);
    for (size_t i = 0; i < lists.names.size(); ++i) {
        PresentName(lists.names[i], query.includeDisplayNames ? &lists.displayPaths[i] : nullptr, query, aliases);
    }
    return GiveTexts(lists.names, count, names);
}

ResourceToAliasMap GResTree::CollectAliases(const QueryOptions& options) {
    ResourceToAliasMap aliases;
    if (options.includeAliases && m_item) {
        BuildAliasMap(m_context, m_item.Get(), aliases);
    }
    return aliases;
}

HRESULT GResTree::GetMultiplePropertyNames(LPCWSTR path, LPCWSTR options, ULONG* count, BSTR** names) {
    return GetProperties(path, options, false, count, names);
}

HRESULT GResTree::GetMultipleProperties(LPCWSTR path, LPCWSTR options, ULONG* count, BSTR** values) {
    return GetProperties(path, options, true, count, values);
}

HRESULT GResTree::GetProperties(LPCWSTR path, LPCWSTR options, bool withValues, ULONG* count, BSTR** texts) {
    if (count == nullptr || texts == nullptr) {
        return E_POINTER;
    }
    *count = 0;
    *texts = nullptr;
    const ReleaseScope scope;
    const QueryOptions query = ParseQueryOptions(ViewOf(options), QueryKeys::WithoutAliases);
    ResTreeNode* const node = FindPathNode(m_root.Get(), ViewOf(path));
    if (node == nullptr) {
        return S_FALSE;
    }
    std::vector<String> collected;
    const PropertyQuery properties{
        .includePath = query.includePath, .strip = query.stripPathPrefix, .withValues = withValues};
    if (node->Supports(query.protocol.View())) {
        CollectProperties(*node, ViewOf(path), properties, collected);
    }
    if (query.recurse) {
        const String pathText = CopyOf(path);
        NameLists below;
        CollectDescendantNames(*node,
                               {.type = query.protocol.View(),
                                .exclusionProperty = query.exclusionProperty.View(),
                                .includePath = true,
                                .path = path != nullptr ? &pathText : nullptr,
                                .wantsDisplayPaths = false},
                               below);
        for (const String& name : below.names) {
            // The walk has looked at the type. A path by which it came may lead nowhere from here.
            if (ResTreeNode* const descendant = FindPathNode(m_root.Get(), UpToNul(name).View())) {
                CollectProperties(*descendant, UpToNul(name).View(), properties, collected);
            }
        }
    }
    return GiveTextsWithBlock(collected, count, texts);
}

HRESULT GResTree::GetProperty(LPCWSTR path, LPCWSTR, BSTR* value) {
    const ReleaseScope scope;
    ResTreeNode& root = *static_cast<ResTreeNodeAdapter*>(m_root.Get())->GetNode();
    const std::u16string_view text = ViewOf(path);
    const NodePathResult found = WalkNodePath(root, text);
    const auto property = found.node->GetProperty(text.substr(found.consumed));
    return property ? GiveText(*property, value) : S_FALSE;
}

HRESULT GResTree::GetFilteredXml(LPCWSTR path, ULONG nodeNameCount, LPCWSTR* nodeNames, ULONG propertyNameCount,
                                 LPCWSTR* propertyNames, BSTR* xml) {
    InterfacePointer<IzkhwResourceTreeNode> node;
    if (ViewOf(path).empty()) {
        node = InterfacePointer<IzkhwResourceTreeNode>::Share(m_root.Get());
    } else {
        ULONG consumed = 0;
        const HRESULT found = m_root->FindNode(path, &consumed, nullptr, node.Receive());
        if (found != S_OK) {
            return found;
        }
    }
    InterfacePointer<IzkhwResourceTreeNode3> filtering;
    const HRESULT given = node->QueryInterface(IID_IzkhwResourceTreeNode3, filtering.ReceiveAny());
    return FAILED(given) ? given
                         : filtering->GetFilteredXml(nodeNameCount, nodeNames, propertyNameCount, propertyNames, xml);
}

int32_t CreateTreeObject(IzkHostContext* context, IzkProjectItem* item, IUnknown* rootNode, IUnknown** result) {
    *result = nullptr;
    CQNComObject<GResTree>* tree = nullptr;
    if (FAILED(CQNComObject<GResTree>::Create(&tree))) {
        return E_OUTOFMEMORY;
    }
    InterfacePointer<IzkhwResourceTreeNode> root;
    rootNode->QueryInterface(IID_IzkhwResourceTreeNode, root.ReceiveAny());
    tree->Bind(context, item, root.Get());
    return tree->QueryInterface(IID_IzkEIOGResourceTree2, reinterpret_cast<void**>(result));
}

}  // namespace zkhw
