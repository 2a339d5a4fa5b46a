#pragma once

// What a host can ask a view, beside what the model of its node answers.

#include <string>
#include <string_view>
#include <vector>

#include "TreeModel.h"
#include "interfaces/InterfacePointer.h"
#include "zkfpga/tree_node.h"

namespace zkhw {
class AdapterObserverSet;
}

namespace fuzz {

using View = zkhw::InterfacePointer<IzkhwResourceTreeNode5>;

inline LPCWSTR In(const char16_t* text) {
    return reinterpret_cast<LPCWSTR>(text);
}
inline LPCWSTR In(const std::u16string& text) {
    return In(text.c_str());
}

// Where an operation may store a view; all versions are one object with one table.
inline IzkhwResourceTreeNode** Receive(View& view) {
    return reinterpret_cast<IzkhwResourceTreeNode**>(view.ReceiveAny());
}

// What an operation has given as an array of texts; frees it.
std::vector<std::u16string> TakeTexts(ULONG count, BSTR* array);

View MakeView(zkhw::ResTreeNode& node, zkhw::AdapterObserverSet* observers);

// Asks a view everything that changes nothing. `path` is looked for, `type` filters, `owners` are asked for.
void SameAnswers(model::Node& node, View view, const std::u16string& path, const std::u16string& type,
                 const std::u16string& owners);

}  // namespace fuzz
