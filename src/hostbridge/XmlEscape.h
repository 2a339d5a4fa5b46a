#pragma once

// The escapes of XML text: "&", "<" and ">", with `quotes` also the apostrophe and the double quote, become "&amp;",
// "&lt;", "&gt;", "&apos;" and "&quot;". Everything else passes, NUL and control characters included. Linear.

#include <string_view>

#include "qn/dsc/StringBase.h"

namespace zkhw {

qn::dsc::String XmlEscape(std::u16string_view text, bool quotes);

// Appends the escaped text to `out`, of which `text` must not be a part; makes no string of its own.
void AppendXmlEscaped(qn::dsc::String& out, std::u16string_view text, bool quotes);

}  // namespace zkhw
