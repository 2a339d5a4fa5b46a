#pragma once

// Arrays that the caller gets: a task block of strings or of objects, with a count. An empty one is count 0 and null,
// and no memory is asked for.

#include <vector>

#include "interfaces/InterfacePointer.h"
#include "qn/dsc/StringBase.h"
#include "zkfpga/memory.h"
#include "zkfpga/types.h"

namespace zkhw {

using qn::dsc::String;

// The out pointers are never null: an operation refuses that before it looks anything up.

// Gives copies of the texts, each up to its first NUL. S_OK; E_OUTOFMEMORY, and the count is 0, the array null, and
// nothing is left behind.
HRESULT GiveTexts(const std::vector<String>& texts, ULONG* count, BSTR** array);

// The same; the array is a block also if there are no texts.
HRESULT GiveTextsWithBlock(const std::vector<String>& texts, ULONG* count, BSTR** array);

// Frees such an array and its strings.
void FreeTexts(ULONG count, BSTR* array);

// Gives the references of `objects` to the caller; on failure they stay there. Results as above.
template <typename T>
HRESULT GiveObjects(std::vector<InterfacePointer<T>>& objects, ULONG* count, T*** array) {
    *count = 0;
    *array = nullptr;
    if (objects.empty()) {
        return S_OK;
    }
    *array = static_cast<T**>(CoTaskMemAlloc(objects.size() * sizeof(T*)));
    if (*array == nullptr) {
        return E_OUTOFMEMORY;
    }
    for (InterfacePointer<T>& object : objects) {
        (*array)[(*count)++] = object.Detach();
    }
    return S_OK;
}

}  // namespace zkhw
