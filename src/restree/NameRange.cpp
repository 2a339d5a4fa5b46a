#include "restree/NameRange.h"

#include <utility>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/IntegerToString.h"
#include "qn/dsc/osdep/StringToInteger.h"
#include "restree/TextList.h"

namespace zkhw {

namespace {

constexpr std::u16string_view digits = u"0123456789";

struct Range {
    std::u16string_view prefix;
    std::u16string_view variable;
    std::u16string_view low;
    std::u16string_view high;
    std::u16string_view suffix;
};

// Cuts an item up; false if it isn't of the form of a range.
bool SplitRange(std::u16string_view item, Range& range) {
    const size_t open = item.find(u'[');
    if (open == std::u16string_view::npos) {
        return false;
    }
    range.prefix = item.substr(0, open);
    size_t number = open + 1;
    const size_t equals = item.find(u'=', number);
    if (equals != std::u16string_view::npos) {
        range.variable = item.substr(number, equals - number);
        number = equals + 1;
    }
    const size_t dots = item.find_first_not_of(digits, number);
    if (dots == std::u16string_view::npos || item.substr(dots, 2) != u"..") {
        return false;
    }
    range.low = item.substr(number, dots - number);
    const size_t close = item.find_first_not_of(digits, dots + 2);
    if (close == std::u16string_view::npos || item[close] != u']') {
        return false;
    }
    range.high = item.substr(dots + 2, close - dots - 2);
    range.suffix = item.substr(close + 1);
    return true;
}

}  // namespace

bool ParseNameRange(const String& item, std::vector<InstanceRecord>& instances) {
    Range range;
    if (!SplitRange(item.View(), range)) {
        return false;
    }
    int64_t low = 0;
    int64_t high = 0;
    try {
        low = qn::dsc::osdep::StringToInteger(String(range.low), 10);
        high = qn::dsc::osdep::StringToInteger(String(range.high), 10);
    } catch (const qn::dsc::exception::UnableToConvert&) {
        return false;
    }
    // In 64 bits, so that a range up to the greatest number ends.
    for (int64_t i = low; i <= high; ++i) {
        const int32_t index = static_cast<int32_t>(i);
        String name(range.prefix);
        name.Append(qn::dsc::osdep::IntegerToString(index, 10).View());
        name.Append(range.suffix);
        instances.push_back({std::move(name), String(range.variable), index});
    }
    return true;
}

void ParseNames(const String& names, std::vector<InstanceRecord>& instances, std::vector<String>& loopVariables) {
    std::vector<String> items;
    SplitList(names.View(), u',', items, true);
    for (String& item : items) {
        const size_t before = instances.size();
        if (!ParseNameRange(item, instances)) {
            instances.push_back({std::move(item), String(), 0});
        } else if (instances.size() > before) {
            const String& variable = instances.back().variable;
            if (!variable.IsEmpty() && (loopVariables.empty() || loopVariables.back() != variable)) {
                loopVariables.push_back(variable);
            }
        }
    }
}

}  // namespace zkhw
