#include "hostbridge/HostStringArray.h"

#include <algorithm>

#include "hostbridge/HostString.h"
#include "qn/dsc/zk/ThrowIfZKError.h"

namespace zkhw {

using qn::dsc::String;
using qn::dsc::zk::ThrowIfZKError;

namespace {

// The host's codes for what is found out here.
constexpr int32_t badArgument = 1;
constexpr int32_t noMemory = 2;

HostStringArrayBlock& BlockOf(HostHandle array) {
    return *static_cast<HostStringArrayBlock*>(static_cast<void*>(*array));
}

// In place, also behind the count. Good until the next call of the host.
HostHandle& ElementAt(HostHandle array, int32_t index) {
    HostHandle* const elements = BlockOf(array).elements;
    return elements[index];
}

// Lets `change` work on the string at `index`. It works on a copy of the handle: the host may move the array's block
// while it makes or resizes a string. If `change` throws, the string is as it was.
template <typename Change>
void ChangeElement(HostHandle array, int32_t index, Change change) {
    HostHandle element = ElementAt(array, index);
    change(element);
    ElementAt(array, index) = element;
}

int32_t CheckedIndex(HostHandle array, uint32_t index) {
    const int32_t count = GetHostStringArrayCount(array);
    if (count < 0 || index >= static_cast<uint32_t>(count)) {
        ThrowIfZKError(badArgument, "Array index out of bounds.");
    }
    return static_cast<int32_t>(index);
}

void ResizeBlock(int32_t newSize, bool isNew, HostHandle& array) {
    const size_t size = offsetof(HostStringArrayBlock, elements) + static_cast<size_t>(newSize) * sizeof(HostHandle);
    if (isNew) {
        array = HostNewHandleClear(size);
        ThrowIfZKError(array == nullptr ? noMemory : 0);
    } else {
        ThrowIfZKError(HostSetHandleSizeClear(array, size));
    }
}

// The count doesn't cover these elements yet: nobody but this function could give them back.
void ClearNewElements(HostHandle array, int32_t first, int32_t end) {
    int32_t made = first;
    try {
        for (; made < end; ++made) {
            ChangeElement(array, made, ClearHostString);
        }
    } catch (...) {
        while (made > first) {
            ChangeElement(array, --made, [](HostHandle& element) {
                HostDisposeHandle(element);
                element = nullptr;
            });
        }
        throw;
    }
}

}  // namespace

int32_t GetHostStringArrayCount(HostHandle array) {
    return array == nullptr ? -1 : BlockOf(array).count;
}

HostHandle GetHostStringArrayElement(HostHandle array, uint32_t index) {
    return ElementAt(array, CheckedIndex(array, index));
}

void StoreInHostStringArray(const String& text, HostHandle array, uint32_t index) {
    ChangeElement(array, CheckedIndex(array, index), [&](HostHandle& element) { StoreInHostString(text, element); });
}

void DisposeHostStringArrayElement(HostHandle array, uint32_t index) {
    ChangeElement(array, CheckedIndex(array, index), DisposeHostString);
}

void ResizeHostStringArray(int32_t newSize, HostHandle& array) {
    if (newSize < 0) {
        ThrowIfZKError(badArgument, "Invalid new_size for array.");
    }
    const int32_t current = GetHostStringArrayCount(array);
    if (current == newSize) {
        return;
    }
    for (int32_t index = newSize; index < current; ++index) {
        ChangeElement(array, index, DisposeHostString);
    }
    ResizeBlock(newSize, current < 0, array);
    ClearNewElements(array, std::max(current, 0), newSize);
    BlockOf(array).count = newSize;
}

}  // namespace zkhw
