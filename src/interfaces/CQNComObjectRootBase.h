#pragma once

// The root of all objects that cross the boundary: the reference count, and the walk over an interface map.

#include <cstdint>

#include "zkfpga/types.h"

namespace zkhw {

// Stands in a map for a plain entry. A map may hold the address of such a function as well: S_OK ends the walk; a
// failure ends it too, if the entry has an id; otherwise the walk goes on.
using InterfaceMapFunction = HRESULT (*)(void* object, REFIID id, void** result, uint32_t offset);

struct InterfaceMapEntry {
    static constexpr uintptr_t closing = 0;  // Behind the last entry, with a null id.
    static constexpr uintptr_t plain = 1;    // The interface stands at `offset`.

    const IID* id;    // Null matches every id.
    uint32_t offset;  // From the object to the interface's table pointer.
    uintptr_t kind;   // `closing`, `plain`, or the address of an InterfaceMapFunction.
};

class CQNComObjectRootBase {
  protected:
    CQNComObjectRootBase() = default;
    ~CQNComObjectRootBase() = default;

    // Gives the interface `id` of `object` in `*result` with one reference more: S_OK. IUnknown is the interface of the
    // first entry. E_NOINTERFACE and a null `*result` if the map hasn't the id. A null object, a null `result`, or a
    // first entry that isn't plain trap.
    static HRESULT InternalQueryInterface(const volatile void* object, const InterfaceMapEntry* map, REFIID id,
                                          void** result);

    // What a concrete class has to do when its last reference has gone; one that has anything to do hides it by its
    // own. The object is whole here: in the class's destructor the operations of IUnknown are gone already.
    void FinalRelease() {}

    // An object is born at 0: the first QueryInterface takes the first reference.
    int32_t count = 0;
};

}  // namespace zkhw
