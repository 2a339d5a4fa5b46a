#include "restree/NameRange.h"

#include <utility>

#include "qn/dsc/FindUnit.h"
#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/IntegerToString.h"
#include "qn/dsc/osdep/StringToInteger.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

using qn::dsc::FindUnit;
using qn::dsc::osdep::DecimalText;

struct Range {
    std::u16string_view prefix;
    std::u16string_view variable;
    std::u16string_view low;
    std::u16string_view high;
    std::u16string_view suffix;
};

// The offset of the first unit from `from` on that is no digit, or the size.
size_t SkipDigits(std::u16string_view text, size_t from) {
    while (from < text.size() && text[from] >= u'0' && text[from] <= u'9') {
        ++from;
    }
    return from;
}

// Cuts an item up; false if it isn't of the form of a range.
bool SplitRange(std::u16string_view item, Range& range) {
    const size_t open = FindUnit(item, u'[');
    if (open == item.size()) {
        return false;
    }
    range.prefix = item.substr(0, open);
    size_t number = open + 1;
    const size_t equals = FindUnit(item, u'=', number);
    if (equals != item.size()) {
        range.variable = item.substr(number, equals - number);
        number = equals + 1;
    }
    const size_t dots = SkipDigits(item, number);
    if (item.substr(dots, 2) != u"..") {
        return false;
    }
    range.low = item.substr(number, dots - number);
    const size_t close = SkipDigits(item, dots + 2);
    if (close == item.size() || item[close] != u']') {
        return false;
    }
    range.high = item.substr(dots + 2, close - dots - 2);
    range.suffix = item.substr(close + 1);
    return true;
}

}  // namespace

bool ParseNameRange(TextArgument item, std::vector<InstanceRecord>& instances) {
    Range range;
    if (!SplitRange(item.View(), range)) {
        return false;
    }
    int64_t low = 0;
    int64_t high = 0;
    try {
        low = qn::dsc::osdep::StringToInteger(range.low, 10);
        high = qn::dsc::osdep::StringToInteger(range.high, 10);
    } catch (const qn::dsc::exception::UnableToConvert&) {
        return false;
    }
    // In 64 bits, so that a range up to the greatest number ends.
    for (int64_t i = low; i <= high; ++i) {
        const int32_t index = static_cast<int32_t>(i);
        instances.push_back(
            {String::Concat({range.prefix, DecimalText(index).View(), range.suffix}), range.variable, index});
    }
    return true;
}

void ParseNames(TextArgument names, std::vector<InstanceRecord>& instances, std::vector<String>& loopVariables) {
    PieceReader items(names.View(), u",", true);
    String unescaped = String::WithoutBuffer();
    while (items.Next()) {
        std::u16string_view item = items.Raw();
        if (items.MayHaveEscapes()) {
            unescaped = UnescapeText(item, u',');
            item = unescaped.View();
        }
        const size_t before = instances.size();
        if (!ParseNameRange(item, instances)) {
            instances.push_back({String(item), {}, 0});
        } else if (instances.size() > before && !instances.back().variable.empty()) {
            const std::u16string_view variable = instances.back().variable;
            if (loopVariables.empty() || loopVariables.back() != variable) {
                loopVariables.emplace_back(variable);
            }
            for (size_t i = before; i < instances.size(); ++i) {
                instances[i].variable = loopVariables.back().View();
            }
        }
    }
}

}  // namespace zkhw
