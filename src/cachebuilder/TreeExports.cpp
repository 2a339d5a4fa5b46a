// The exported queries of the process's tree (zkfpga/exports.h says what each does).

#include <string_view>

#include "cachebuilder/FPGAResTree.h"
#include "hostbridge/HostString.h"
#include "hostbridge/HostStringArray.h"
#include "interfaces/BoundaryArrays.h"
#include "interfaces/BoundaryText.h"
#include "interfaces/InterfacePointer.h"
#include "qn/dsc/osdep/DebugTrap.h"
#include "qn/dsc/zk/ThrowIfZKError.h"
#include "restree/TextList.h"
#include "zkfpga/exports.h"
#include "zkfpga/tree_node.h"
#include "zkfpga/tree_root.h"

namespace zkhw {

namespace {

using qn::dsc::zk::ZKErrorException;
using TreePointer = InterfacePointer<IzkEIOGResourceTree>;
using NodePointer = InterfacePointer<IzkhwResourceTreeNode>;

// What the operations of the tree are asked.
struct TreeQuery {
    LPCWSTR Path() const { return ToBoundary(path.CStr()); }
    LPCWSTR Options() const { return ToBoundary(options.CStr()); }

    TreePointer root;
    // Without memory for the owner these are never filled, and nothing may be asked for on their behalf.
    String path = String::WithoutBuffer();
    String options = String::WithoutBuffer();
};

// The first query of the process builds the tree here.
HRESULT PrepareTreeQuery(const char* basePath, const char* subPath, const char* options, TreeQuery& query) {
    FPGAResTree* const owner = gFPGAResTree();
    if (owner == nullptr) {
        return E_OUTOFMEMORY;
    }
    const HRESULT given = owner->QueryTreeInterface(IID_IzkEIOGResourceTree, nullptr, nullptr, query.root.ReceiveAny());
    if (FAILED(given)) {
        return given;
    }
    const String base(basePath);
    const String below(subPath == nullptr || *subPath != '/' ? subPath : subPath + 1);
    // One element of the path, however many slashes it holds.
    query.path = below.IsEmpty() ? base : JoinList(base, below, u"/", true, false);
    query.options = String(options);
    if (!query.options.IsEmpty()) {
        query.options.Append(u",");
    }
    query.options.Append(u"stripPathPrefix=");
    query.options.Append(base);
    return S_OK;
}

// The node that the query names; null, and not a failure, if there is none.
HRESULT FindQueriedNode(const TreeQuery& query, NodePointer& node) {
    NodePointer root;
    const HRESULT given =
        gFPGAResTree()->QueryTreeInterface(IID_IzkhwResourceTreeNode, nullptr, nullptr, root.ReceiveAny());
    if (FAILED(given)) {
        return given;
    }
    const HRESULT found = root->FindNode(query.Path(), nullptr, nullptr, node.Receive());
    return FAILED(found) ? found : S_OK;
}

void StoreFound(bool isFound, unsigned char* found) {
    if (found != nullptr) {
        *found = isFound ? 1 : 0;
    }
}

// Strings that are the caller's of this to free.
class OwnedTexts {
  public:
    OwnedTexts() = default;
    OwnedTexts(const OwnedTexts&) = delete;
    OwnedTexts& operator=(const OwnedTexts&) = delete;
    ~OwnedTexts() { FreeTexts(count, array); }

    ULONG count = 0;
    BSTR* array = nullptr;
};

// After a failure at element i, gives the elements back from there down to the first. Then the index goes on below 0,
// which is out of bounds: that is the error which the host gets to see.
[[noreturn]] void DisposeDownward(HostHandle names, uint32_t i) {
    while (true) {
        DisposeHostStringArrayElement(names, i);
        --i;
    }
}

void StoreStringArray(HostHandle& names, const OwnedTexts& texts) {
    ResizeHostStringArray(static_cast<int32_t>(texts.count), names);
    for (uint32_t i = 0; i < texts.count; ++i) {
        try {
            StoreInHostStringArray(CopyOf(texts.array[i]), names, i);
        } catch (const ZKErrorException&) {
            DisposeDownward(names, i);
        }
    }
}

using ListOperation = HRESULT (STDMETHODCALLTYPE IzkEIOGResourceTree::*)(LPCWSTR, LPCWSTR, ULONG*, BSTR**);

HRESULT StoreList(const char* basePath, const char* subPath, const char* options, ZkStringArrayHandle* names,
                  unsigned char* found, ListOperation operation) {
    if (names == nullptr) {
        return E_POINTER;
    }
    TreeQuery query;
    const HRESULT prepared = PrepareTreeQuery(basePath, subPath, options, query);
    if (FAILED(prepared)) {
        return prepared;
    }
    OwnedTexts texts;
    const HRESULT listed = (query.root.Get()->*operation)(query.Path(), query.Options(), &texts.count, &texts.array);
    if (FAILED(listed)) {
        return listed;
    }
    StoreFound(listed != S_FALSE, found);
    StoreStringArray(*names, texts);
    return S_OK;
}

}  // namespace

}  // namespace zkhw

using namespace zkhw;  // NOLINT(google-build-using-namespace): the functions below belong to no namespace.

HRESULT QueryResourceTreeInterface(const IID* id, IzkHostContext* context, IzkProjectItem* item, void** result) {
    if (id == nullptr) {
        return E_POINTER;
    }
    FPGAResTree* const owner = gFPGAResTree();
    if (owner == nullptr) {
        qn::dsc::osdep::DebugTrap();
    }
    return owner->QueryTreeInterface(*id, context, item, result);
}

HRESULT FPGAResTree_GetProperty(const char* basePath, const char* subPath, const char* options, ZkStringHandle value,
                                unsigned char* found) {
    TreeQuery query;
    const HRESULT prepared = PrepareTreeQuery(basePath, subPath, options, query);
    if (FAILED(prepared)) {
        return prepared;
    }
    OwnedBstr text;
    const HRESULT read = query.root->GetProperty(query.Path(), query.Options(), text.Receive());
    if (FAILED(read)) {
        return read;
    }
    StoreFound(read != S_FALSE, found);
    StoreInGivenHostString(read != S_FALSE ? String(text.View()) : String(), value);
    return S_OK;
}

HRESULT FPGAResTree_GetDescendantNames(const char* basePath, const char* subPath, const char* options,
                                       ZkStringArrayHandle* names, unsigned char* found) {
    return StoreList(basePath, subPath, options, names, found, &IzkEIOGResourceTree::GetDescendantNames);
}

HRESULT FPGAResTree_GetMultipleProperties(const char* basePath, const char* subPath, const char* options,
                                          ZkStringArrayHandle* names, unsigned char* found) {
    return StoreList(basePath, subPath, options, names, found, &IzkEIOGResourceTree::GetMultipleProperties);
}

HRESULT FPGAResTree_Dump(const char* basePath, const char* subPath, const char* options, ZkStringHandle text) {
    TreeQuery query;
    const HRESULT prepared = PrepareTreeQuery(basePath, subPath, options, query);
    if (FAILED(prepared)) {
        return prepared;
    }
    NodePointer node;
    const HRESULT found = FindQueriedNode(query, node);
    if (FAILED(found)) {
        return found;
    }
    if (!node) {
        qn::dsc::osdep::DebugTrap();
    }
    OwnedBstr xml;
    const HRESULT rendered = node->GetXml(xml.Receive());
    if (FAILED(rendered)) {
        return rendered;
    }
    StoreInGivenHostString(String(xml.View()), text);
    return S_OK;
}
