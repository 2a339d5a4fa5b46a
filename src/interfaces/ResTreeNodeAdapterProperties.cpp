// The texts of a node.

#include <vector>

#include "interfaces/BoundaryArrays.h"
#include "interfaces/BoundaryText.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "restree/ReleaseScope.h"
#include "restree/ResTreeNode.h"

namespace zkhw {

namespace {

// The entry at `index` among those that fit; null past the last.
template <typename Fits>
NodeEntry* EntryAt(ResTreeNode& node, ULONG index, Fits fits) {
    for (EntryIterator entry = node.BeginLoaded(); !entry.IsEnd(); ++entry) {
        if (fits(*entry) && index-- == 0) {
            return &*entry;
        }
    }
    return nullptr;
}

}  // namespace

HRESULT ResTreeNodeAdapter::GetProperty(LPCWSTR name, BSTR* value) {
    const auto text = m_node->GetProperty(ViewOf(name));
    return text ? GiveText(*text, value) : S_FALSE;
}

HRESULT ResTreeNodeAdapter::GetPropertyAt(ULONG index, BSTR* value) {
    const NodeEntry* const entry = EntryAt(*m_node, index, [](const NodeEntry& each) { return each.IsText(); });
    return entry == nullptr ? S_FALSE : GiveText(*entry->Text(), value);
}

HRESULT ResTreeNodeAdapter::SetProperty(LPCWSTR name, LPCWSTR value) {
    m_node->SetProperty(ViewOf(name), ViewOf(value));
    return S_OK;
}

HRESULT ResTreeNodeAdapter::SetPropertyAt(ULONG index, LPCWSTR value) {
    NodeEntry* const entry = EntryAt(*m_node, index, [](const NodeEntry& each) { return each.Kind() == TextEntry; });
    if (entry == nullptr) {
        return S_FALSE;
    }
    m_node->SetEntryText(entry, ViewOf(value));
    return S_OK;
}

HRESULT ResTreeNodeAdapter::GetPropertyNames(ULONG* count, BSTR** names) {
    if (count == nullptr || names == nullptr) {
        return E_POINTER;
    }
    std::vector<String> keys;
    for (EntryIterator entry = m_node->BeginLoaded(); !entry.IsEnd(); ++entry) {
        if (entry->IsText()) {
            keys.emplace_back(entry->Key());
        }
    }
    return GiveTexts(keys, count, names);
}

HRESULT ResTreeNodeAdapter::IsLocalizedProperty(LPCWSTR name) {
    const NodeEntry* const entry = m_node->Find(ViewOf(name));
    return entry != nullptr && entry->Kind() == LocalizedTextEntry ? S_OK : S_FALSE;
}

}  // namespace zkhw
