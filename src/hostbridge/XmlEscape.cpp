#include "hostbridge/XmlEscape.h"

#include <cstdint>

namespace zkhw {

using qn::dsc::String;

namespace {

// All special characters stand below 64: one bit each.
constexpr uint64_t Bit(char16_t unit) {
    return uint64_t{1} << unit;
}
constexpr uint64_t markup = Bit(u'&') | Bit(u'<') | Bit(u'>');
constexpr uint64_t quoteMarks = Bit(u'\'') | Bit(u'"');

std::u16string_view Replacement(char16_t special) {
    switch (special) {
        case u'&':
            return u"&amp;";
        case u'<':
            return u"&lt;";
        case u'>':
            return u"&gt;";
        case u'\'':
            return u"&apos;";
        default:
            return u"&quot;";
    }
}

}  // namespace

String XmlEscape(std::u16string_view text, bool quotes) {
    String escaped;
    AppendXmlEscaped(escaped, text, quotes);
    return escaped;
}

void AppendXmlEscaped(String& out, std::u16string_view text, bool quotes) {
    const uint64_t specials = quotes ? markup | quoteMarks : markup;
    size_t done = 0;
    for (size_t i = 0; i < text.size(); i++) {
        const char16_t unit = text[i];
        if (unit < 64 && (specials >> unit & 1) != 0) {
            out.Append(text.substr(done, i - done));
            out.Append(Replacement(unit));
            done = i + 1;
        }
    }
    out.Append(text.substr(done));
}

}  // namespace zkhw
