#include "interfaces/BoundaryArrays.h"

#include "interfaces/BoundaryText.h"

namespace zkhw {

HRESULT GiveTexts(const std::vector<String>& texts, ULONG* count, BSTR** array) {
    if (!texts.empty()) {
        return GiveTextsWithBlock(texts, count, array);
    }
    *count = 0;
    *array = nullptr;
    return S_OK;
}

HRESULT GiveTextsWithBlock(const std::vector<String>& texts, ULONG* count, BSTR** array) {
    *count = 0;
    *array = nullptr;
    auto* const made = static_cast<BSTR*>(CoTaskMemAlloc(texts.size() * sizeof(BSTR)));
    if (made == nullptr) {
        return E_OUTOFMEMORY;
    }
    ULONG madeCount = 0;
    for (const String& text : texts) {
        if (FAILED(GiveText(text, &made[madeCount]))) {
            FreeTexts(madeCount, made);
            return E_OUTOFMEMORY;
        }
        ++madeCount;
    }
    *count = madeCount;
    *array = made;
    return S_OK;
}

void FreeTexts(ULONG count, BSTR* array) {
    for (ULONG i = 0; i < count; ++i) {
        SysFreeString(array[i]);
    }
    CoTaskMemFree(array);
}

}  // namespace zkhw
