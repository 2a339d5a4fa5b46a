// A node as text, and text into a node; copies.

#include <memory>
#include <new>

#include "hostbridge/XmlEscape.h"
#include "interfaces/AdapterObserverSet.h"
#include "interfaces/BoundaryText.h"
#include "interfaces/FilterEntries.h"
#include "interfaces/ResTreeNodeAdapter.h"
#include "restree/AdapterFactory.h"
#include "restree/ResTreeNode.h"
#include "restree/TreeWriter.h"

namespace zkhw {

namespace {

using namespace std::string_view_literals;

String ToXml(ResTreeNode& node) {
    String text;
    WriteNode(node, text, {});
    return text;
}

EntryFilter::NameSet NamesOf(ULONG count, LPCWSTR* names) {
    EntryFilter::NameSet result;
    for (ULONG i = 0; i < count; ++i) {
        result.insert(CopyOf(names[i]));
    }
    return result;
}

}  // namespace

HRESULT ResTreeNodeAdapter::LoadContent(LPCWSTR fragment) {
    // Type and fragment go in as they stand: what isn't well formed there is the caller's.
    String text;
    text.Append(u"<"sv);
    text.Append(m_node->GetType());
    text.Append(u" name=\""sv);
    AppendXmlEscaped(text, m_node->GetName(), false);
    text.Append(m_node->IsOrdered() ? u"\" ordered=\"true\">"sv : u"\" ordered=\"false\">"sv);
    text.Append(ViewOf(fragment));
    text.Append(u"</"sv);
    text.Append(m_node->GetType());
    text.Append(u">"sv);
    return FAILED(m_node->LoadResourceText(text, false, nullptr)) ? E_FAIL : S_OK;
}

HRESULT ResTreeNodeAdapter::RemoveEntry(LPCWSTR name) {
    m_node->RemoveEntryByName(ViewOf(name));
    return S_OK;
}

HRESULT ResTreeNodeAdapter::GetXml(BSTR* xml) {
    return GiveText(ToXml(*m_node), xml);
}

HRESULT ResTreeNodeAdapter::GetFilteredXml(ULONG nodeNameCount, LPCWSTR* nodeNames, ULONG propertyNameCount,
                                           LPCWSTR* propertyNames, BSTR* xml) {
    return GetFilteredXmlEx(1, nodeNameCount, nodeNames, propertyNameCount, propertyNames, xml);
}

HRESULT ResTreeNodeAdapter::GetFilteredXmlEx(BOOL keep, ULONG nodeNameCount, LPCWSTR* nodeNames,
                                             ULONG propertyNameCount, LPCWSTR* propertyNames, BSTR* xml) {
    const std::unique_ptr<ResTreeNode> copy = m_node->Clone();
    FilterEntries(*copy, {.keep = keep != 0,
                          .nodeNames = NamesOf(nodeNameCount, nodeNames),
                          .propertyNames = NamesOf(propertyNameCount, propertyNames)});
    // Without memory the text is null and the result no other.
    GiveText(ToXml(*copy), xml);
    return S_OK;
}

HRESULT ResTreeNodeAdapter::CloneDetached(LPCWSTR name, IzkhwResourceTreeNode** clone) {
    *clone = nullptr;
    struct SetDeleter {
        void operator()(AdapterObserverSet* set) const { DestroyAdapterObserverSet(set); }
    };
    std::unique_ptr<AdapterObserverSet, SetDeleter> observers(MakeAdapterObserverSet());
    if (!observers) {
        return E_OUTOFMEMORY;
    }
    std::unique_ptr<ResTreeNode> copy;
    try {
        copy = m_node->Clone();
        if (!ViewOf(name).empty()) {
            copy->Rename(ViewOf(name));
        }
    } catch (const std::bad_alloc&) {
        return E_OUTOFMEMORY;
    }
    void* view = nullptr;
    const HRESULT made = CreateNodeAdapter(copy.get(), observers.get(), &view, true);
    if (SUCCEEDED(made)) {
        *clone = static_cast<IzkhwResourceTreeNode4*>(view);
        static_cast<void>(copy.release());
        static_cast<void>(observers.release());
    }
    return made;
}

}  // namespace zkhw
