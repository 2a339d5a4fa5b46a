#pragma once

// A host's project model: items below an item, each of which may refer to a resource of the tree.

#include <functional>
#include <map>
#include <string>
#include <vector>

#include "interfaces/support/HostObject.h"
#include "zkfpga/host_interfaces.h"
#include "zkfpga/memory.h"

namespace zkhw {

// Strings and blocks that the host has made and that were not freed yet would show as leaks under the sanitizer.
inline BSTR MakeBstr(const char16_t* text) {
    return text == nullptr ? nullptr : SysAllocString(reinterpret_cast<const OLECHAR*>(text));
}

class HostMarker : public HostObject<IzkItemMarker> {};

class HostLink : public HostObject<IzkItemResourceLink> {
  public:
    HRESULT STDMETHODCALLTYPE GetResourcePath(BSTR* result) override {
        ++calls;
        *result = MakeBstr(path);
        return given;
    }

    const char16_t* path = nullptr;
    HRESULT given = S_OK;
    int calls = 0;
};

class HostProject : public HostObject<IzkProject> {
  public:
    HRESULT STDMETHODCALLTYPE GetItemObject(ProjectItemRecord* record, IUnknown** result) override {
        ++calls;
        asked = record->id;
        if (object != nullptr) {
            object->AddRef();
        }
        *result = object;
        return given;
    }

    IUnknown* object = nullptr;
    HRESULT given = S_OK;
    GUID asked{};
    int calls = 0;
};

class HostItem : public HostObject<IzkProjectItem> {
  public:
    HRESULT STDMETHODCALLTYPE GetItemInfo(ProjectItemRecord* record) override {
        const ProjectItemRecord zero{};
        wasZeroed = record->size == sizeof(ProjectItemRecord) && record->name == nullptr && record->id == zero.id &&
                    record->data == nullptr && record->reserved2 == 0;
        for (const ULONG number : record->reserved1) {
            wasZeroed = wasZeroed && number == 0;
        }
        record->name = MakeBstr(u"internal name");
        record->id = id;
        record->data = CoTaskMemAlloc(16);
        return infoGiven;
    }

    HRESULT STDMETHODCALLTYPE GetName(BSTR* result) override {
        *result = MakeBstr(name);
        return nameGiven;
    }

    HRESULT STDMETHODCALLTYPE GetProject(IUnknown** result) override {
        if (project != nullptr) {
            project->AddRef();
        }
        *result = project;
        return projectGiven;
    }

    HRESULT STDMETHODCALLTYPE SelectItems(IzkProjectItemSelector* selector, IUnknown** result) override {
        ++selections;
        if (whenSelecting) {
            whenSelecting(*selector);
        }
        for (IzkProjectItem* item : items) {
            BOOL flag = 7;
            answers.push_back(selector->SelectItem(item, &flag));
            flags.push_back(flag);
        }
        if (selected != nullptr) {
            selected->AddRef();
        }
        *result = selected;
        return E_FAIL;
    }

    GUID id{};
    HRESULT infoGiven = S_OK;
    bool wasZeroed = false;

    const char16_t* name = nullptr;
    HRESULT nameGiven = S_OK;

    IUnknown* project = nullptr;
    HRESULT projectGiven = S_OK;

    std::vector<IzkProjectItem*> items;  // Below this one.
    std::function<void(IzkProjectItemSelector&)> whenSelecting;
    IUnknown* selected = nullptr;  // What SelectItems gives at its end.
    int selections = 0;
    std::vector<HRESULT> answers;  // Of SelectItem, and what it has left in the flag.
    std::vector<BOOL> flags;
};

// Knows items by the first number of their id.
class HostLocator : public HostObject<IzkProjectItemLocator> {
  public:
    HRESULT STDMETHODCALLTYPE FindItemById(GUID, IUnknown** item) override {
        *item = nullptr;
        return E_FAIL;
    }

    HRESULT STDMETHODCALLTYPE FindItem(ProjectItemRecord* record, IUnknown** item) override {
        const auto found = known.find(record->id.Data1);
        *item = found == known.end() ? nullptr : found->second;
        if (*item != nullptr) {
            (*item)->AddRef();
        }
        return given;
    }

    std::map<uint32_t, IUnknown*> known;
    HRESULT given = S_OK;
};

class HostContext : public HostObject<IzkHostContext> {
  public:
    IzkProjectItemLocator* STDMETHODCALLTYPE GetItemLocator() override { return locator; }

    IzkProjectItemLocator* locator = nullptr;
};

// An item that the locator finds and that is linked to a resource, with all that belongs to it.
struct LinkedItem {
    LinkedItem(HostLocator& locator, uint32_t number, const char16_t* path, const char16_t* name) {
        item.id.Data1 = number;
        item.name = name;
        link.path = path;
        found.Answer(IID_IzkItemMarker, &marker);
        found.Answer(IID_IzkItemResourceLink, &link);
        locator.known[number] = &found;
    }

    HostMarker marker;
    HostLink link;
    HostObject<IUnknown> found;
    HostItem item;
};

}  // namespace zkhw
