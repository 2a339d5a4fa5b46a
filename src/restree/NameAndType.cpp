#include "restree/NameAndType.h"

#include <new>

#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/TaskMemory.h"

namespace zkhw {

NameAndType::NameAndType(std::u16string_view name, std::u16string_view type) {
    void* block = qn::dsc::osdep::TaskMemAlloc(TextPair::SizeFor(name, type));
    if (block == nullptr) {
        qn::dsc::exception::ThrowBadAllocation();
    }
    texts = new (block) TextPair(name, type);
}

NameAndType::~NameAndType() {
    if (texts != nullptr) {
        qn::dsc::osdep::TaskMemFree(texts);
    }
}

}  // namespace zkhw
