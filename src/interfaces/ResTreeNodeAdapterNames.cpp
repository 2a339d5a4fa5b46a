// Nodes by path, and lists of names.

#include "interfaces/BoundaryArrays.h"
#include "interfaces/BoundaryText.h"
#include "interfaces/NodeNames.h"
#include "interfaces/NodePathWalk.h"
#include "interfaces/NodeViews.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

namespace {

// Both arrays or none.
HRESULT GiveNames(const NameLists& lists, ULONG* count, BSTR** names, BSTR** displayNames) {
    if (displayNames != nullptr) {
        *displayNames = nullptr;
    }
    const HRESULT given = GiveTexts(lists.names, count, names);
    if (FAILED(given) || displayNames == nullptr) {
        return given;
    }
    const HRESULT displaysGiven = GiveTexts(lists.displayPaths, count, displayNames);
    if (FAILED(displaysGiven)) {
        FreeTexts(static_cast<ULONG>(lists.names.size()), *names);
        *names = nullptr;
    }
    return displaysGiven;
}

}  // namespace

HRESULT ResTreeNodeAdapter::GetChildNames(LPCWSTR path, BOOL includePath, ULONG* count, BSTR** names,
                                          BSTR** displayNames) {
    return GetChildNamesOfType(path, nullptr, includePath, count, names, displayNames);
}

HRESULT ResTreeNodeAdapter::GetChildNamesOfType(LPCWSTR path, LPCWSTR type, BOOL includePath, ULONG* count,
                                                BSTR** names, BSTR** displayNames) {
    if (count == nullptr || names == nullptr) {
        return E_POINTER;
    }
    const String pathText = CopyOf(path);
    NameLists lists;
    CollectChildNames(*m_node,
                      {.type = ViewOf(type),
                       .exclusionProperty = {},
                       .includePath = includePath != 0,
                       .path = path != nullptr ? &pathText : nullptr,
                       .wantsDisplayPaths = displayNames != nullptr},
                      lists);
    return GiveNames(lists, count, names, displayNames);
}

HRESULT ResTreeNodeAdapter::GetDescendantNames(LPCWSTR path, LPCWSTR type, BOOL includePath, ULONG* count, BSTR** names,
                                               BSTR** displayNames) {
    return GetDescendantNamesEx(path, type, includePath, nullptr, count, names, displayNames);
}

HRESULT ResTreeNodeAdapter::GetDescendantNamesEx(LPCWSTR path, LPCWSTR type, BOOL includePath,
                                                 LPCWSTR exclusionProperty, ULONG* count, BSTR** names,
                                                 BSTR** displayNames) {
    if (count == nullptr || names == nullptr) {
        return E_POINTER;
    }
    const String pathText = CopyOf(path);
    NameLists lists;
    CollectDescendantNames(*m_node,
                           {.type = ViewOf(type),
                            .exclusionProperty = ViewOf(exclusionProperty),
                            .includePath = includePath != 0,
                            .path = path != nullptr ? &pathText : nullptr,
                            .wantsDisplayPaths = displayNames != nullptr},
                           lists);
    return GiveNames(lists, count, names, displayNames);
}

HRESULT ResTreeNodeAdapter::FindNode(LPCWSTR path, ULONG* consumed, BOOL* crossedLink, IzkhwResourceTreeNode** node) {
    if (node == nullptr) {
        return E_POINTER;
    }
    *node = nullptr;
    if (consumed != nullptr) {
        *consumed = 0;
    }
    if (crossedLink != nullptr) {
        *crossedLink = 0;
    }
    const std::u16string_view text = ViewOf(path);
    if (text.empty()) {
        return S_FALSE;
    }
    const ReleaseScope scope;
    const NodePathResult found = WalkNodePath(*m_node, text);
    if (crossedLink != nullptr) {
        *crossedLink = found.crossedLink ? 1 : 0;
    }
    if (consumed == nullptr && !found.isComplete) {
        return S_FALSE;
    }
    const HRESULT given = GiveView(found.node, m_observers, node);
    if (FAILED(given)) {
        return given;
    }
    if (consumed != nullptr) {
        *consumed = found.consumed;
    }
    return found.isComplete ? S_OK : S_FALSE;
}

}  // namespace zkhw
