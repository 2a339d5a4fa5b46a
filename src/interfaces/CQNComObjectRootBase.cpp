#include "interfaces/CQNComObjectRootBase.h"

#include <cstring>

#include "qn/dsc/osdep/DebugTrap.h"

namespace zkhw {

using qn::dsc::osdep::DebugTrap;

namespace {

// The id of IUnknown, and its twin with the bytes C0 and 00 in the middle changed about: hosts ask by either.
bool IsUnknownId(REFIID id) {
    uint32_t words[4];
    static_assert(sizeof words == sizeof id);
    std::memcpy(words, &id, sizeof words);
    return words[0] == 0 && words[1] == 0 && (words[2] == 0xC0 || words[2] == 0xC000) && words[3] == 0x46000000;
}

HRESULT GiveInterface(char* object, uint32_t offset, void** result) {
    auto* found = reinterpret_cast<IUnknown*>(object + offset);
    found->AddRef();
    *result = found;
    return S_OK;
}

}  // namespace

HRESULT CQNComObjectRootBase::InternalQueryInterface(const volatile void* object, const InterfaceMapEntry* map,
                                                     REFIID id, void** result) {
    if (object == nullptr || map->kind != InterfaceMapEntry::plain || result == nullptr) {
        DebugTrap();
    }
    char* const start = static_cast<char*>(const_cast<void*>(object));
    *result = nullptr;
    if (IsUnknownId(id)) {
        return GiveInterface(start, map->offset, result);
    }
    for (const InterfaceMapEntry* entry = map; entry->kind != InterfaceMapEntry::closing; ++entry) {
        if (entry->id != nullptr && !(*entry->id == id)) {
            continue;
        }
        if (entry->kind == InterfaceMapEntry::plain) {
            return GiveInterface(start, entry->offset, result);
        }
        const auto function = reinterpret_cast<InterfaceMapFunction>(entry->kind);
        const HRESULT given = function(start, id, result, entry->offset);
        if (given == S_OK || (FAILED(given) && entry->id != nullptr)) {
            return given;
        }
    }
    return E_NOINTERFACE;
}

}  // namespace zkhw
