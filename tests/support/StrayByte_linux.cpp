#include "qn/dsc/StringBase.h"
#include "support/ExactText.h"
#include "support/StrayByte.h"

namespace zkhw {

// A unit of its own, so that the byte can be given back.
std::string StrayByte(unsigned char byte) {
    const char16_t unit = static_cast<char16_t>(0xDC00 + byte);
    return qn::dsc::ExactText(std::u16string_view(&unit, 1));
}

}  // namespace zkhw
