#pragma once

// How a function takes a text that it only reads: as a String, a NUL-terminated text, a counted range or a single unit,
// without a copy of any of them.

#include <string_view>

#include "qn/dsc/StringBase.h"

namespace qn::dsc {

// Only for parameters: it refers to the text it was made from, which must last until the call is over. A null pointer
// is the empty text.
class TextArgument {
  public:
    TextArgument(const String& text) : view(text.View()) {}
    TextArgument(const char16_t* text) : view(text == nullptr ? std::u16string_view() : std::u16string_view(text)) {}
    TextArgument(std::u16string_view text) : view(text) {}
    TextArgument(const char16_t& unit) : view(&unit, 1) {}

    std::u16string_view View() const { return view; }

  private:
    std::u16string_view view;
};

}  // namespace qn::dsc
