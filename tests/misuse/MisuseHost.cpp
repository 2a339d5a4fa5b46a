#include "misuse/MisuseHost.h"

#include <cstdlib>
#include <cstring>

namespace misuse {

Library library{};
Fixture& fixture = *new Fixture;

// --- Objects of the host ---

HRESULT Item::GetItemInfo(ProjectItemRecord* record) {
    record->id = {0x11223344, 0x5566, 0x7788, {0x99, 0xAA, 0xBB, 0xCC, 0xDD, 0xEE, 0xFF, 0x00}};
    return S_OK;
}

HRESULT Item::GetName(BSTR* name) {
    *name = nullptr;
    return S_OK;
}

HRESULT Item::GetProject(IUnknown** project) {
    *project = nullptr;
    return projectGiven;
}

HRESULT Item::SelectItems(IzkProjectItemSelector* selector, IUnknown** result) {
    *result = nullptr;
    if (whenSelecting) {
        whenSelecting(selector);
    }
    return S_OK;
}

HRESULT Locator::FindItemById(GUID, IUnknown** item) {
    *item = nullptr;
    return S_OK;
}

HRESULT Locator::FindItem(ProjectItemRecord*, IUnknown** item) {
    *item = nullptr;
    return S_OK;
}

// --- What a case starts with ---

IzkhwResourceTreeNode5* ViewOf(const char16_t* path) {
    IzkhwResourceTreeNode* node = nullptr;
    if (fixture.root->FindNode(path, nullptr, nullptr, &node) != S_OK) {
        Say("no node " + Narrow(path));
        std::exit(2);
    }
    // All versions are one table.
    return static_cast<IzkhwResourceTreeNode5*>(node);
}

HostString::HostString(const std::string& bytes) : handle(nullptr) {
    const auto length = static_cast<int32_t>(bytes.size());
    handle = fixture.runtime.newHandle(sizeof length + bytes.size());
    std::memcpy(*handle, &length, sizeof length);
    std::memcpy(*handle + sizeof length, bytes.data(), bytes.size());
}

HostString::~HostString() {
    fixture.runtime.dispose(handle);
}

std::string HostString::Bytes() const {
    int32_t length = 0;
    std::memcpy(&length, *handle, sizeof length);
    return {*handle + sizeof length, static_cast<size_t>(length)};
}

std::string TakeArray(ZkStringArrayHandle array) {
    if (array == nullptr) {
        return "no array";
    }
    int32_t count = 0;
    std::memcpy(&count, *array, sizeof count);
    std::string text;
    for (int32_t i = 0; i < count; ++i) {
        ZkStringHandle element = nullptr;
        std::memcpy(&element, *array + sizeof(void*) * static_cast<size_t>(i + 1), sizeof element);
        int32_t length = 0;
        std::memcpy(&length, *element, sizeof length);
        text += (i == 0 ? "" : ",") + std::string(*element + sizeof length, static_cast<size_t>(length));
        fixture.runtime.dispose(element);
    }
    fixture.runtime.dispose(array);
    return "[" + text + "]";
}

}  // namespace misuse
