#include "qn/dsc/osdep/_GetCodePageID.h"

#include <string_view>

#include "qn/dsc/exception/Exception.h"

namespace qn::dsc::osdep {

uint32_t GetCodePageID(const char* locale) {
    const std::string_view name(locale);
    if (name.empty()) {
        return defaultCodePage;
    }
    if (name == "US-ASCII") {
        return asciiCodePage;
    }
    if (name == "cp932") {
        return japaneseCodePage;
    }
    exception::ThrowAt(exception::InvalidLocale(), "qn/dsc/osdep/_GetCodePageID", __LINE__);
}

}  // namespace qn::dsc::osdep
