#pragma once

// The name of an element and what it means to the resource language.

#include <cstdint>
#include <string_view>
#include <utility>

#include "qn/dsc/StringBase.h"

namespace zkhw {

class ElementName {
  public:
    // Empty: no element.
    bool IsEmpty() const { return text.IsEmpty(); }
    void Clear() { text = qn::dsc::String::WithoutBuffer(); }

    // Takes a name from libexpat; one that can't be widened becomes empty. Throws bad_alloc.
    void Assign(std::string_view name);

    const qn::dsc::String& Text() const { return text; }
    // Gives the text away, and is empty then. Nearly every name ends as that of an entry or a type, so it is widened
    // once, where it comes in.
    qn::dsc::String TakeText() { return std::exchange(text, qn::dsc::String::WithoutBuffer()); }

    // These stay as they are when the text is taken.
    bool IsLink() const { return Has(Link); }
    bool IsInclude() const { return Has(Include); }
    bool IsReserves() const { return Has(Reserves); }
    bool EndsInPathOrDir() const { return Has(PathOrDir); }
    bool EndsInList() const { return Has(List); }

  private:
    enum Meaning : uint8_t { None = 0, Link = 1, Include = 2, Reserves = 4, PathOrDir = 8, List = 16 };

    bool Has(Meaning meaning) const { return (meanings & meaning) != 0; }
    static Meaning MeaningOfAscii(std::string_view name);
    uint8_t MeaningsByCompare() const;

    qn::dsc::String text = qn::dsc::String::WithoutBuffer();
    uint8_t meanings = None;
};

}  // namespace zkhw
