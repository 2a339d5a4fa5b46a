#include "qn/dsc/osdep/FolderSearch_linux.h"

#include <algorithm>

#include "qn/dsc/osdep/NameOrder.h"
#include "qn/dsc/osdep/NativeFolder_linux.h"
#include "qn/dsc/osdep/NativePath.h"

namespace qn::dsc::osdep {

int FolderSearch::Read(const std::string& path, std::u16string_view pattern) {
    OpenFolder folder;
    const int error = OpenNativeFolder(path, folder);
    if (error != 0) {
        return error;
    }
    std::u16string upperPattern;
    AppendUpper(pattern, upperPattern);
    Add(".", upperPattern);
    Add("..", upperPattern);
    const auto firstToOrder = static_cast<std::ptrdiff_t>(order.size());
    while (const char* name = NextNativeName(folder.get())) {
        Add(name, upperPattern);
    }
    std::sort(order.begin() + firstToOrder, order.end(),
              [this](const Name& left, const Name& right) { return IsBefore(left, right); });
    return 0;
}

bool FolderSearch::Next(String& name) {
    if (next == order.size()) {
        return false;
    }
    name.Assign(TextOf(order[next]));
    ++next;
    return true;
}

bool FolderSearch::IsBefore(const Name& left, const Name& right) const {
    if (left.start != right.start) {
        return left.start < right.start;
    }
    const int byUpper = UpperOf(left).compare(UpperOf(right));
    return byUpper != 0 ? byUpper < 0 : TextOf(left) < TextOf(right);
}

void FolderSearch::Add(std::string_view name, std::u16string_view upperPattern) {
    const size_t offset = names.size();
    AppendNameUnits(name, names);
    const size_t length = names.size() - offset;
    AppendUpper(std::u16string_view(names).substr(offset), upperNames);
    const std::u16string_view upper = std::u16string_view(upperNames).substr(offset);
    if (!MatchesPattern(upperPattern, upper)) {
        names.resize(offset);
        upperNames.resize(offset);
        return;
    }
    uint64_t start = 0;
    for (size_t i = 0; i < 4; ++i) {
        start = (start << 16) | (i < length ? upper[i] : 0u);
    }
    order.push_back({start, offset, length});
}

}  // namespace qn::dsc::osdep
