#pragma once

// The name of a node and its type, in one block: every node has both, and they hardly ever change.

#include <string_view>
#include <utility>

#include "restree/TextPair.h"

namespace zkhw {

class NameAndType {
  public:
    // Throws bad_alloc, and OutOfRange for a text that no String can hold.
    NameAndType(std::u16string_view name, std::u16string_view type);
    // What was moved from may only be assigned or destroyed.
    NameAndType(NameAndType&& other) noexcept : texts(std::exchange(other.texts, nullptr)) {}
    NameAndType& operator=(NameAndType&& other) noexcept {
        std::swap(texts, other.texts);
        return *this;
    }
    ~NameAndType();

    // Good until the object is assigned or destroyed; moving it changes nothing.
    std::u16string_view Name() const { return texts->First(); }
    std::u16string_view Type() const { return texts->Second(); }

  private:
    TextPair* texts;
};

}  // namespace zkhw
