#include "restree/TextPair.h"

#include "qn/dsc/exception/Exception.h"

namespace zkhw {

void TextPair::ThrowTooLong() {
    qn::dsc::exception::ThrowAt(qn::dsc::exception::OutOfRange(), "restree/TextPair", __LINE__);
}

}  // namespace zkhw
