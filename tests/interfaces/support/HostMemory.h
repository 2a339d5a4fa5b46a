#pragma once

// What a host receives, as text: the result's name, then what was given. It is freed on the way as a host has to free
// it. What a call left as it was stands as "untouched".
//
//     "S_OK Board"            a string; "S_FALSE untouched", "E_OUTOFMEMORY null"
//     "S_OK [a, b]"           an array of strings, or of nodes by their paths; "S_OK []" for count 0 and null
//     "S_OK [a] [b]"          names and display names
//     "S_OK /a/b"             a node by its path; "S_OK null"

#include <cstdint>
#include <string>

#include "interfaces/BoundaryText.h"
#include "support/ExactText.h"
#include "zkfpga/memory.h"
#include "zkfpga/tree_node.h"

namespace zkhw {

// A literal as a text that goes in.
inline LPCWSTR In(const char16_t* text) {
    return reinterpret_cast<LPCWSTR>(text);
}

inline std::string ResultName(HRESULT result) {
    switch (static_cast<uint32_t>(result)) {
        case 0:
            return "S_OK";
        case 1:
            return "S_FALSE";
        case 0x80004002:
            return "E_NOINTERFACE";
        case 0x80004003:
            return "E_POINTER";
        case 0x80004005:
            return "E_FAIL";
        case 0x8007000E:
            return "E_OUTOFMEMORY";
        default:
            return "result " + std::to_string(static_cast<uint32_t>(result));
    }
}

// Stands where nothing was stored yet.
template <typename Pointer>
Pointer Untouched() {
    return reinterpret_cast<Pointer>(uintptr_t{0x5A5A5A50});
}

inline constexpr ULONG untouchedNumber = 0x5A5A5A5A;

inline std::string TakeText(BSTR text) {
    if (text == nullptr) {
        return "null";
    }
    if (text == Untouched<BSTR>()) {
        return "untouched";
    }
    std::string taken =
        qn::dsc::ExactText(std::u16string_view(reinterpret_cast<const char16_t*>(text), SysStringLen(text)));
    SysFreeString(text);
    return taken;
}

inline std::string TakeTexts(ULONG count, BSTR* array) {
    if (array == Untouched<BSTR*>()) {
        return "untouched";
    }
    if (array == nullptr) {
        return count == 0 ? "[]" : "null";
    }
    std::string taken;
    for (ULONG i = 0; i < count; ++i) {
        taken += (i == 0 ? "" : ", ") + TakeText(array[i]);
    }
    CoTaskMemFree(array);
    return "[" + taken + "]";
}

inline std::string TakeNode(IzkhwResourceTreeNode* node) {
    if (node == nullptr) {
        return "null";
    }
    if (node == Untouched<IzkhwResourceTreeNode*>()) {
        return "untouched";
    }
    BSTR path = nullptr;
    node->GetPath(&path);
    std::string taken = TakeText(path);
    node->Release();
    return taken;
}

inline std::string TakeNodes(ULONG count, IzkhwResourceTreeNode** array) {
    if (array == Untouched<IzkhwResourceTreeNode**>()) {
        return "untouched";
    }
    if (array == nullptr) {
        return count == 0 ? "[]" : "null";
    }
    std::string taken;
    for (ULONG i = 0; i < count; ++i) {
        taken += (i == 0 ? "" : ", ") + TakeNode(array[i]);
    }
    CoTaskMemFree(array);
    return "[" + taken + "]";
}

// `call` gets the out pointers of an operation.
template <typename Call>
std::string GivenText(Call call) {
    auto* text = Untouched<BSTR>();
    const HRESULT result = call(&text);
    return ResultName(result) + " " + TakeText(text);
}

template <typename Call>
std::string GivenTexts(Call call) {
    ULONG count = untouchedNumber;
    auto* array = Untouched<BSTR*>();
    const HRESULT result = call(&count, &array);
    return ResultName(result) + " " + TakeTexts(count, array);
}

template <typename Call>
std::string GivenNode(Call call) {
    auto* node = Untouched<IzkhwResourceTreeNode*>();
    const HRESULT result = call(&node);
    return ResultName(result) + " " + TakeNode(node);
}

template <typename Call>
std::string GivenNodes(Call call) {
    ULONG count = untouchedNumber;
    auto* array = Untouched<IzkhwResourceTreeNode**>();
    const HRESULT result = call(&count, &array);
    return ResultName(result) + " " + TakeNodes(count, array);
}

// "S_OK 3"; "S_FALSE untouched".
template <typename Call>
std::string GivenNumber(Call call) {
    ULONG number = untouchedNumber;
    const HRESULT result = call(&number);
    return ResultName(result) + " " + (number == untouchedNumber ? "untouched" : std::to_string(number));
}

}  // namespace zkhw
