#include "misuse/NullCases.h"

namespace misuse {

namespace {

std::string TakeTexts(BSTR* texts, ULONG count) {
    std::string list;
    for (ULONG i = 0; i < count; ++i) {
        list += (i == 0 ? "" : ",") + Take(texts[i]);
    }
    library.CoTaskMemFree(texts);
    return list;
}

std::string TakeName(IzkhwResourceTreeNode* node) {
    BSTR name = nullptr;
    node->GetName(&name);
    node->Release();
    return Take(name);
}

}  // namespace

std::string TakeOutputs() {
    std::string text;
    if (outputs.count != Outputs::untouched) {
        text += " " + std::to_string(outputs.count);
    }
    if (outputs.texts != nullptr) {
        text += " [" + TakeTexts(outputs.texts, outputs.count) + "]";
    }
    if (outputs.displays != nullptr) {
        text += " <" + TakeTexts(outputs.displays, outputs.count) + ">";
    }
    if (outputs.nodes != nullptr) {
        text += " {";
        for (ULONG i = 0; i < outputs.count; ++i) {
            text += (i == 0 ? "" : ",") + TakeName(outputs.nodes[i]);
        }
        library.CoTaskMemFree(outputs.nodes);
        text += "}";
    }
    if (outputs.text != nullptr) {
        text += " \"" + Take(outputs.text) + "\"";
    }
    if (outputs.node != nullptr) {
        text += " @" + TakeName(outputs.node);
    }
    if (outputs.number != Outputs::untouched) {
        text += " number=" + Hex(outputs.number);
    }
    if (outputs.flag != Outputs{}.flag) {
        text += " flag=" + std::to_string(outputs.flag);
    }
    outputs = {};
    return text;
}

void SayResult(HRESULT result) {
    Say(Hex(result) + (FAILED(result) ? "" : TakeOutputs()));
}

}  // namespace misuse
