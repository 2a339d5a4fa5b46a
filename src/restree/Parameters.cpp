#include "restree/Parameters.h"

#include "qn/dsc/FindUnit.h"
#include "qn/dsc/osdep/Compare.h"
#include "qn/dsc/osdep/IntegerToString.h"
#include "restree/TextList.h"

namespace zkhw {

using qn::dsc::FindUnit;
using qn::dsc::osdep::DecimalText;
using qn::dsc::osdep::Equal;

namespace {

constexpr std::u16string_view openMark = u"#{";
constexpr std::u16string_view nameKey = u"name";

// The offset of the next "#{", or the size. A "#" is looked for by itself: texts hardly ever hold one for anything
// else.
size_t FindOpenMark(std::u16string_view text, size_t from) {
    size_t at = FindUnit(text, openMark[0], from);
    while (at + 1 < text.size() && text[at + 1] != openMark[1]) {
        at = FindUnit(text, openMark[0], at + 1);
    }
    return at + 1 < text.size() ? at : text.size();
}

// Equal, and quicker for names that are spelled alike, as nearly all are.
bool IsSameName(std::u16string_view a, std::u16string_view b) {
    return qn::dsc::HasSameUnits(a, b) || Equal(a, b);
}

}  // namespace

bool MapParameters::AppendValue(std::u16string_view name, TextBuilder& text) const {
    const auto found = values.find(String(name));
    if (found == values.end()) {
        return false;
    }
    text.Append(found->second.View());
    return true;
}

bool InstanceParameters::AppendValue(std::u16string_view name, TextBuilder& text) const {
    if (IsSameName(name, nameKey)) {
        text.Append(instanceName);
    } else if (!variable.empty() && IsSameName(name, variable)) {
        text.Append(DecimalText(index).View());
    } else {
        return false;
    }
    return true;
}

size_t FindVariable(std::u16string_view text) {
    const size_t open = FindOpenMark(text, 0);
    return open == text.size() ? std::u16string_view::npos : open;
}

void ExpandVariables(std::u16string_view text, const Parameters& parameters, TextBuilder& result, size_t from) {
    if (parameters.IsEmpty()) {
        result.Append(text);
        return;
    }
    size_t done = 0;
    size_t open = FindOpenMark(text, from);
    while (open < text.size()) {
        const size_t inside = open + openMark.size();
        const size_t close = FindUnit(text, u'}', inside);
        if (close == text.size()) {
            break;
        }
        result.Append(text.substr(done, open - done));
        const std::u16string_view key = TrimmedPart(text.substr(inside, close - inside));
        if (!parameters.AppendValue(key, result)) {
            result.Append(openMark);
            result.Append(key);
            result.Append(u'}');
        }
        done = close + 1;
        open = FindOpenMark(text, done);
    }
    result.Append(text.substr(done));
}

}  // namespace zkhw
