// The allocators of the boundary, where the system has none. Task memory is that of the whole system (TaskMemory.h). A
// string is a task block of its own form: a mark and the length in bytes stand in front of the text, so that a string
// that is freed as task memory, or the other way round, is no block of the other family.

#include <cstdint>
#include <cstring>
#include <limits>
#include <string>

#include "qn/dsc/osdep/DebugTrap.h"
#include "qn/dsc/osdep/TaskMemory.h"
#include "zkfpga/memory.h"

using qn::dsc::osdep::TaskMemAlloc;
using qn::dsc::osdep::TaskMemFree;
using qn::dsc::osdep::TaskMemRealloc;

namespace {

struct StringHead {
    static constexpr uint32_t stringMark = 0x42535452;

    uint32_t mark;
    uint32_t byteLength;  // Without the NUL unit.
};

// Task memory aligns to 16 bytes only what is a multiple of them, and no empty block. 0 for a size that can't be
// rounded up.
constexpr size_t RoundUp(size_t size) {
    return (size + 15) & ~size_t{15};
}

StringHead* HeadOf(BSTR string) {
    StringHead* head = reinterpret_cast<StringHead*>(string) - 1;
    if (head->mark != StringHead::stringMark) {
        qn::dsc::osdep::DebugTrap();
    }
    return head;
}

}  // namespace

void* CoTaskMemAlloc(size_t size) {
    const size_t rounded = RoundUp(size == 0 ? 1 : size);
    return rounded < size ? nullptr : TaskMemAlloc(rounded);
}

void* CoTaskMemRealloc(void* block, size_t size) {
    if (block == nullptr) {
        return CoTaskMemAlloc(size);
    }
    const size_t rounded = RoundUp(size);
    return rounded < size ? nullptr : TaskMemRealloc(block, rounded);
}

void CoTaskMemFree(void* block) {
    TaskMemFree(block);
}

BSTR SysAllocString(const OLECHAR* text) {
    if (text == nullptr) {
        return nullptr;
    }
    const size_t length = std::char_traits<OLECHAR>::length(text);
    constexpr size_t longest = std::numeric_limits<unsigned int>::max();
    return length <= longest ? SysAllocStringLen(text, static_cast<unsigned int>(length)) : nullptr;
}

BSTR SysAllocStringLen(const OLECHAR* text, unsigned int length) {
    const size_t byteLength = size_t{length} * sizeof(OLECHAR);
    if (byteLength > std::numeric_limits<uint32_t>::max()) {
        return nullptr;
    }
    auto* const head = static_cast<StringHead*>(TaskMemAlloc(sizeof(StringHead) + byteLength + sizeof(OLECHAR)));
    if (head == nullptr) {
        return nullptr;
    }
    *head = {StringHead::stringMark, static_cast<uint32_t>(byteLength)};
    auto* const string = reinterpret_cast<BSTR>(head + 1);
    if (text != nullptr) {
        std::memcpy(string, text, byteLength);
    }
    string[length] = u'\0';
    return string;
}

unsigned int SysStringLen(BSTR string) {
    return string == nullptr ? 0 : HeadOf(string)->byteLength / static_cast<uint32_t>(sizeof(OLECHAR));
}

void SysFreeString(BSTR string) {
    if (string == nullptr) {
        return;
    }
    StringHead* const head = HeadOf(string);
    head->mark = 0;
    TaskMemFree(head);
}
