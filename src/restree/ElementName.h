#pragma once

// The name of an element and what it means to the resource language.

#include <string>
#include <string_view>

#include "qn/dsc/StringBase.h"

namespace zkhw {

class ElementName {
  public:
    // Empty: no element.
    bool IsEmpty() const { return text.empty(); }
    void Clear() { text.clear(); }

    // Takes a name from libexpat; one that can't be widened becomes empty.
    void Assign(std::string_view name);

    qn::dsc::String Wide() const;

    bool IsLink() const { return isLink; }
    bool IsInclude() const { return isInclude; }
    bool IsReserves() const { return isReserves; }
    bool EndsInPathOrDir() const { return endsInPathOrDir; }
    bool EndsInList() const { return endsInList; }

  private:
    void ClassifyAscii();
    void ClassifyByCompare();

    std::string text;
    bool isLink = false;
    bool isInclude = false;
    bool isReserves = false;
    bool endsInPathOrDir = false;
    bool endsInList = false;
};

}  // namespace zkhw
