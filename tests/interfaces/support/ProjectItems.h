#pragma once

// Items of a host's project, and the host's way of finding them.

#include <map>
#include <string>
#include <utility>
#include <vector>

#include "qn/dsc/Guid.h"
#include "zkfpga/host_interfaces.h"
#include "zkfpga/memory.h"

namespace zkhw {

// On the stack of a test, which asserts that every reference came back.
template <typename Interface>
class StackObject : public Interface {
  public:
    HRESULT STDMETHODCALLTYPE QueryInterface(REFIID, void** result) override {
        *result = nullptr;
        return E_NOINTERFACE;
    }
    ULONG STDMETHODCALLTYPE AddRef() override { return ++references; }
    ULONG STDMETHODCALLTYPE Release() override { return --references; }

    ULONG references = 0;

  protected:
    ~StackObject() = default;
};

inline GUID IdFrom(const char16_t* text) {
    const qn::dsc::Guid id{text};
    GUID result{id.data1, id.data2, id.data3, {}};
    for (int i = 0; i < 8; ++i) {
        result.Data4[i] = id.data4[i];
    }
    return result;
}

class FakeProjectItem final : public StackObject<IzkProjectItem> {
  public:
    explicit FakeProjectItem(const GUID& id) : id(id) {}

    HRESULT STDMETHODCALLTYPE GetItemInfo(ProjectItemRecord* record) override {
        received = *record;
        record->id = id;
        if (givesMemory) {
            record->name = SysAllocString(reinterpret_cast<const OLECHAR*>(u"Item"));
            record->data = CoTaskMemAlloc(8);
        }
        return result;
    }
    HRESULT STDMETHODCALLTYPE GetName(BSTR*) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE GetProject(IUnknown**) override { return E_FAIL; }
    HRESULT STDMETHODCALLTYPE SelectItems(IzkProjectItemSelector*, IUnknown**) override { return E_FAIL; }

    GUID id;
    bool givesMemory = false;
    HRESULT result = S_OK;
    ProjectItemRecord received{};  // As it was handed in.
};

class FakeLocator final : public StackObject<IzkProjectItemLocator> {
  public:
    struct Answer {
        IUnknown* item;
        HRESULT result;
    };

    HRESULT STDMETHODCALLTYPE FindItemById(GUID id, IUnknown** item) override {
        const std::u16string key(qn::dsc::Guid(id.Data1, id.Data2, id.Data3, id.Data4).ToString().CStr());
        asked.push_back(key);
        const auto known = answers.find(key);
        *item = known == answers.end() ? nullptr : known->second.item;
        if (*item != nullptr) {
            (*item)->AddRef();
        }
        return known == answers.end() ? E_FAIL : known->second.result;
    }
    HRESULT STDMETHODCALLTYPE FindItem(ProjectItemRecord*, IUnknown**) override { return E_FAIL; }

    std::map<std::u16string, Answer> answers;  // By the text of the id.
    std::vector<std::u16string> asked;
};

}  // namespace zkhw
