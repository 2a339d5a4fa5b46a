#pragma once

// What the cases of misuse_host have in hand: the library as a host loads it, views of the tree of the installation,
// objects of a host, and the words in which answers are printed. Every case runs in a process of its own.
//
// The installation (MisuseInstallation.h) has, by types and names,
//     /Kept             Sign = "still here": no case touches it
//     /Rack/S           a Shelf with Height = "7", a localised Label = "Name", and the Slots A and B
//     /Rack/S/A         Width = "1" and the Pin Q, which has Speed = "9"
//     /Rack/S/B         Width = "2"
//     /Rack/T           a Shelf with the link L to /Rack/S/A

#include <functional>
#include <map>
#include <string>
#include <vector>

#include "host/StandInRuntime.h"
#include "zkfpga/host_runtime.h"
#include "zkfpga/zkfpga.h"

namespace misuse {

// --- The library ---

// Its functions, all found by their names, which they bear here too.
// NOLINTBEGIN(readability-identifier-naming)
struct Library {
    decltype(&::gFPGAResTree) gFPGAResTree;
    decltype(&::QueryResourceTreeInterface) QueryResourceTreeInterface;
    decltype(&::FPGAResTree_GetProperty) FPGAResTree_GetProperty;
    decltype(&::FPGAResTree_GetDescendantNames) FPGAResTree_GetDescendantNames;
    decltype(&::FPGAResTree_GetMultipleProperties) FPGAResTree_GetMultipleProperties;
    decltype(&::FPGAResTree_Dump) FPGAResTree_Dump;
    decltype(&::ZkhwResTree_GetNode) ZkhwResTree_GetNode;
    decltype(&::FPGA_mbstowcs) FPGA_mbstowcs;
    decltype(&::FPGA_wcstombs) FPGA_wcstombs;
    decltype(&::FPGA_MbsToUtf8) FPGA_MbsToUtf8;
    decltype(&::FPGA_Utf8ToMbs) FPGA_Utf8ToMbs;
    decltype(&::SetZKRTModule) SetZKRTModule;
    decltype(&::SetZKRTTLSIndex) SetZKRTTLSIndex;
    decltype(&::SetZKRTModuleHook) SetZKRTModuleHook;
    decltype(&::SetZKRTTLSIndexHook) SetZKRTTLSIndexHook;
    decltype(&::CoTaskMemAlloc) CoTaskMemAlloc;
    decltype(&::CoTaskMemRealloc) CoTaskMemRealloc;
    decltype(&::CoTaskMemFree) CoTaskMemFree;
    decltype(&::SysAllocString) SysAllocString;
    decltype(&::SysAllocStringLen) SysAllocStringLen;
    decltype(&::SysStringLen) SysStringLen;
    decltype(&::SysFreeString) SysFreeString;
};
// NOLINTEND(readability-identifier-naming)

extern Library library;

// --- Objects of the host ---

// Lives as long as the process; nothing frees it.
template <typename Interface>
class HostObject : public Interface {
  public:
    virtual ~HostObject() = default;

    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID id, void** result) override {
        *result = nullptr;
        if (!(id == IID_IUnknown)) {
            return E_NOINTERFACE;
        }
        if (givesItself) {
            AddRef();
            *result = static_cast<Interface*>(this);
        }
        return S_OK;
    }
    ULONG STDMETHODCALLTYPE AddRef() override { return ++references; }
    ULONG STDMETHODCALLTYPE Release() override {
        const ULONG left = --references;
        if (left == 0 && whenUnreferenced) {
            whenUnreferenced();
        }
        return left;
    }

    bool givesItself = true;  // False: S_OK all the same, and no object.
    ULONG references = 0;
    std::function<void()> whenUnreferenced;
};

class Observer : public HostObject<IzkhwResourceTreeNodeObserver> {
  public:
    HRESULT STDMETHODCALLTYPE NodeChanged(IzkhwResourceTreeNode* node, ULONG changes, ULONG id) override {
        // The observer may be gone when it returns.
        const auto react = reaction;
        if (react) {
            react(node, changes, id);
        }
        return S_OK;
    }

    std::function<void(IzkhwResourceTreeNode* node, ULONG changes, ULONG id)> reaction;
};

// The item {11223344-5566-7788-99AA-BBCCDDEEFF00}.
class Item : public HostObject<IzkProjectItem> {
  public:
    HRESULT STDMETHODCALLTYPE GetItemInfo(ProjectItemRecord* record) override;
    HRESULT STDMETHODCALLTYPE GetName(BSTR* name) override;
    HRESULT STDMETHODCALLTYPE GetProject(IUnknown** project) override;
    HRESULT STDMETHODCALLTYPE SelectItems(IzkProjectItemSelector* selector, IUnknown** result) override;

    HRESULT projectGiven = S_OK;  // With no project.
    std::function<void(IzkProjectItemSelector*)> whenSelecting;
};

// Knows no item.
class Locator : public HostObject<IzkProjectItemLocator> {
  public:
    HRESULT STDMETHODCALLTYPE FindItemById(GUID id, IUnknown** item) override;
    HRESULT STDMETHODCALLTYPE FindItem(ProjectItemRecord* record, IUnknown** item) override;
};

class Context : public HostObject<IzkHostContext> {
  public:
    IzkProjectItemLocator* STDMETHODCALLTYPE GetItemLocator() override { return nullptr; }
};

// --- What a case starts with ---

// The module of tests/host.
struct Runtime {
    StandInRuntime* standIn = nullptr;
    decltype(&::HostNewHandleClear) newHandle = nullptr;
    decltype(&::HostDisposeHandle) dispose = nullptr;
};

// Context and item are those of the first query, so they count for the whole process.
struct Fixture {
    Context context;
    Item item;
    Locator locator;
    IzkhwResourceTreeNode5* root = nullptr;
    IzkEIOGResourceTree2* tree = nullptr;
    IzkhwResourceTreeNode5* shelf = nullptr;  // /Rack/S
    Runtime runtime;                          // Only for cases of `needsRuntime`.
};

// Never destroyed: the library gives its references back at the exit.
extern Fixture& fixture;

// A new view of the node at that path from the root; ends the host if there is none.
IzkhwResourceTreeNode5* ViewOf(const char16_t* path);

// A string of the run-time with these bytes, and its bytes. The string is given back at the end of its scope.
class HostString {
  public:
    explicit HostString(const std::string& bytes = {});
    HostString(const HostString&) = delete;
    HostString& operator=(const HostString&) = delete;
    ~HostString();

    ZkStringHandle Get() const { return handle; }
    std::string Bytes() const;

  private:
    ZkStringHandle handle;
};

// Takes the strings of an array and the array itself back: "[a,b]".
std::string TakeArray(ZkStringArrayHandle array);

// --- Answers ---

// A line of the output, which is there also if the process ends right behind.
void Say(const std::string& line);

// Eight hexadecimal digits.
std::string Hex(HRESULT result);
std::string Hex(ULONG number);

// A text in UTF-8, with "|" for each line feed.
std::string Narrow(LPCWSTR text);
// The same of a text that the library gave; frees it.
std::string Take(BSTR text);

// The node and all below it: "S{Height=7,Label=Name;A{Width=1;Q{Speed=9;}}B{Width=2;}}".
std::string Describe(IzkhwResourceTreeNode* node);

// --- Cases ---

struct Case {
    std::function<void()> run;
    bool needsRuntime = false;
};

using Cases = std::map<std::string, Case>;

void AddNodeNulls(Cases& cases);
void AddTreeNulls(Cases& cases);
void AddExportNulls(Cases& cases);
void AddNumbers(Cases& cases);
void AddExportNumbers(Cases& cases);
void AddIds(Cases& cases);
void AddNotices(Cases& cases);
void AddBrackets(Cases& cases);
void AddLifetimes(Cases& cases);
void AddWrongKinds(Cases& cases);

}  // namespace misuse
