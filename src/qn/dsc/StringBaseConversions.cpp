// What joins the two instances of StringBase: each is made from the other's text by the system's default code page.

#include <algorithm>
#include <cstring>
#include <memory>

#include "qn/dsc/StringBase.h"
#include "qn/dsc/osdep/AnsiToWide.h"
#include "qn/dsc/osdep/WideToAnsi.h"

namespace qn::dsc {

namespace {

constexpr const char* defaultLocale = "";

// Up to the first NUL; null is the empty text.
template <typename Unit>
std::basic_string_view<Unit> UpToNul(const Unit* text, uint32_t length) {
    if (text == nullptr) {
        return {};
    }
    return std::basic_string_view<Unit>(text, static_cast<size_t>(std::find(text, text + length, Unit()) - text));
}

template <typename Unit>
std::basic_string_view<Unit> WholeText(const Unit* text) {
    return text == nullptr ? std::basic_string_view<Unit>() : std::basic_string_view<Unit>(text);
}

String ToWide(std::string_view text) {
    const std::unique_ptr<char16_t[]> wide(osdep::AnsiToWide(text.data(), text.data() + text.size(), defaultLocale));
    return String(wide.get());
}

NarrowString ToNarrow(std::u16string_view text) {
    const std::unique_ptr<char[]> narrow(osdep::WideToAnsi(text.data(), text.data() + text.size(), defaultLocale));
    return NarrowString(narrow.get());
}

}  // namespace

template <>
StringBase<char16_t>::StringBase(const char* text) : StringBase(ToWide(WholeText(text))) {}

template <>
StringBase<char16_t>::StringBase(const char* text, uint32_t length) : StringBase(ToWide(UpToNul(text, length))) {}

template <>
StringBase<char16_t>::StringBase(const NarrowString& text) : StringBase(text.CStr(), text.Length()) {}

template <>
StringBase<char>::StringBase(const char16_t* text) : StringBase(ToNarrow(WholeText(text))) {}

template <>
StringBase<char>::StringBase(const char16_t* text, uint32_t length) : StringBase(ToNarrow(UpToNul(text, length))) {}

template <>
StringBase<char>::StringBase(const String& text) : StringBase(text.CStr(), text.Length()) {}

}  // namespace qn::dsc
