#pragma once

// Texts on their way in and out. The units are the same on both sides; only their type differs from platform to
// platform.

#include <string_view>

#include "qn/dsc/FindUnit.h"
#include "qn/dsc/StringBase.h"
#include "zkfpga/memory.h"
#include "zkfpga/types.h"

namespace zkhw {

using qn::dsc::String;

// A text of the caller's as it stands; null is the empty text. Lasts as long as the caller's memory.
inline std::u16string_view ViewOf(LPCWSTR text) {
    return text == nullptr ? std::u16string_view() : std::u16string_view(reinterpret_cast<const char16_t*>(text));
}

// A copy of it.
inline String CopyOf(LPCWSTR text) {
    return String(ViewOf(text));
}

inline const OLECHAR* ToBoundary(const char16_t* text) {
    return reinterpret_cast<const OLECHAR*>(text);
}

// A text as it is once it has crossed the boundary: up to its first NUL.
inline String UpToNul(std::u16string_view text) {
    return String(text.substr(0, qn::dsc::FindUnit(text, u'\0')));
}
inline String UpToNul(const String& text) {
    return UpToNul(text.View());
}

// Gives the caller a copy of `text` up to its first NUL. S_OK, or E_OUTOFMEMORY and null.
inline HRESULT GiveText(std::u16string_view text, BSTR* result) {
    *result = SysAllocStringLen(ToBoundary(text.data()), static_cast<unsigned int>(qn::dsc::FindUnit(text, u'\0')));
    return *result != nullptr ? S_OK : E_OUTOFMEMORY;
}

inline HRESULT GiveText(const String& text, BSTR* result) {
    return GiveText(text.View(), result);
}

// A string that was received and is to be freed.
class OwnedBstr {
  public:
    OwnedBstr() = default;
    explicit OwnedBstr(BSTR text) : text(text) {}
    OwnedBstr(const OwnedBstr&) = delete;
    OwnedBstr& operator=(const OwnedBstr&) = delete;
    ~OwnedBstr() { SysFreeString(text); }

    // Where an operation may store a string; only while there is none.
    BSTR* Receive() { return &text; }
    BSTR Get() const { return text; }
    std::u16string_view View() const { return ViewOf(text); }

  private:
    BSTR text = nullptr;
};

}  // namespace zkhw
