#include "qn/dsc/osdep/CommandLine.h"

#include <string>
#include <string_view>

#include "qn/dsc/osdep/NativePath.h"
#include "qn/dsc/osdep/NativeText.h"

namespace qn::dsc::osdep {

String PathFromArgument(const char* argument) {
    const std::string_view text = argument == nullptr ? std::string_view() : std::string_view(argument);
    const bool isAbsoluteNative = !text.empty() && text.front() == '/';
    if (isAbsoluteNative || text.find('\\') == std::string_view::npos) {
        return SystemPathFromNative(text);
    }
    std::u16string units(text.size(), u'\0');
    units.resize(NativeToUnits(text, units.data()));
    return String(std::u16string_view(units));
}

}  // namespace qn::dsc::osdep
