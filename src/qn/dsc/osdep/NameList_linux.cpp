#include "qn/dsc/osdep/NameList_linux.h"

#include <algorithm>

#include "qn/dsc/osdep/NameOrder.h"
#include "qn/dsc/osdep/NativePath.h"

namespace qn::dsc::osdep {

NamePattern::NamePattern(std::u16string_view pattern) {
    AppendUpper(pattern, upper);
}

bool NamePattern::MayFit(std::string_view native) const {
    if (native.empty() || upper.empty()) {
        return true;
    }
    const char16_t wanted = upper.back();
    const auto last = static_cast<unsigned char>(native.back());
    const bool isComparable = last < 0x80 && wanted < 0x80 && wanted != u'*' && wanted != u'?';
    // A native backslash is another unit, but no pattern for a name has one either.
    return !isComparable || UpperUnit(last) == wanted;
}

void NameList::Clear() {
    units.clear();
    upperUnits.clear();
    natives.clear();
    names.clear();
}

void NameList::Add(std::string_view native, const NamePattern& pattern, bool isKept) {
    if (!isKept && !pattern.MayFit(native)) {
        return;
    }
    const size_t offset = units.size();
    AppendNameUnits(native, units);
    const size_t length = units.size() - offset;
    AppendUpper(std::u16string_view(units).substr(offset), upperUnits);
    const std::u16string_view upper = std::u16string_view(upperUnits).substr(offset);
    const bool isMatch = pattern.MayFit(native) && MatchesPattern(pattern.Upper(), upper);
    if (!isMatch && !isKept) {
        units.resize(offset);
        upperUnits.resize(offset);
        return;
    }
    uint64_t start = 0;
    for (size_t i = 0; i < 4; ++i) {
        start = (start << 16) | (i < length ? upper[i] : 0u);
    }
    names.push_back({start, offset, length, natives.size(), isMatch, isKept});
    natives.append(native);
    natives.push_back('\0');
}

void NameList::Sort(size_t first) {
    const auto begin = names.begin() + static_cast<std::ptrdiff_t>(first);
    std::sort(begin, names.end(), [this](const Name& left, const Name& right) { return IsBefore(left, right); });
}

bool NameList::IsBefore(const Name& left, const Name& right) const {
    if (left.start != right.start) {
        return left.start < right.start;
    }
    const int byUpper = UpperOf(left).compare(UpperOf(right));
    return byUpper != 0 ? byUpper < 0 : TextOf(left) < TextOf(right);
}

}  // namespace qn::dsc::osdep
