// The words in which the host tells what it got.

#include <cstdio>

#include "misuse/MisuseHost.h"

namespace misuse {

void Say(const std::string& line) {
    std::printf("%s\n", line.c_str());
    std::fflush(stdout);
}

std::string Hex(ULONG number) {
    char text[16];
    std::snprintf(text, sizeof text, "%08lx", static_cast<unsigned long>(number));
    return text;
}

std::string Hex(HRESULT result) {
    return Hex(static_cast<ULONG>(result));
}

std::string Narrow(LPCWSTR text) {
    std::string result;
    for (; text != nullptr && *text != 0; ++text) {
        const unsigned unit = *text;
        // All that the installation holds is ASCII; anything else shows as what it is.
        result += unit == '\n' ? "|" : unit < 0x80 ? std::string(1, static_cast<char>(unit)) : "\\u" + Hex(ULONG{unit});
    }
    return result;
}

std::string Take(BSTR text) {
    const std::string result = Narrow(text);
    library.SysFreeString(text);
    return result;
}

namespace {

std::string DescribeProperties(IzkhwResourceTreeNode* node) {
    std::string text;
    ULONG count = 0;
    BSTR* names = nullptr;
    node->GetPropertyNames(&count, &names);
    for (ULONG i = 0; i < count; ++i) {
        BSTR value = nullptr;
        node->GetPropertyAt(i, &value);
        text += (i == 0 ? "" : ",") + Take(names[i]) + "=" + Take(value);
    }
    library.CoTaskMemFree(names);
    return text;
}

}  // namespace

std::string Describe(IzkhwResourceTreeNode* node) {
    BSTR name = nullptr;
    node->GetName(&name);
    std::string text = Take(name) + "{" + DescribeProperties(node) + ";";
    ULONG count = 0;
    IzkhwResourceTreeNode** children = nullptr;
    node->GetChildren(&count, &children);
    for (ULONG i = 0; i < count; ++i) {
        text += Describe(children[i]);
        children[i]->Release();
    }
    library.CoTaskMemFree(children);
    return text + "}";
}

}  // namespace misuse
