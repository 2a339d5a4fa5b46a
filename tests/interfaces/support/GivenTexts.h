#pragma once

// An array of strings as a host receives it. Freed at the end.

#include <string>

#include "interfaces/BoundaryArrays.h"
#include "interfaces/BoundaryText.h"
#include "support/ExactText.h"
#include "zkfpga/types.h"

namespace zkhw {

class GivenTexts {
  public:
    GivenTexts() = default;
    GivenTexts(const GivenTexts&) = delete;
    GivenTexts& operator=(const GivenTexts&) = delete;
    ~GivenTexts() { Free(); }

    // Where an operation may store; at first neither zero nor null, so that an operation that doesn't clear shows.
    ULONG* Count() {
        Free();
        count = 77;
        return &count;
    }
    BSTR** Array() {
        array = reinterpret_cast<BSTR*>(&count);
        return &array;
    }

    bool IsCleared() const { return count == 0 && array == nullptr; }
    bool IsEmptyBlock() const { return count == 0 && array != nullptr; }

    // The strings, each behind a line feed.
    std::string Lines() const {
        std::string lines;
        for (ULONG i = 0; i < count; ++i) {
            lines += "\n" + qn::dsc::ExactText(ViewOf(array[i]));
        }
        return lines;
    }

  private:
    void Free() {
        if (array != nullptr && array != reinterpret_cast<BSTR*>(&count)) {
            FreeTexts(count, array);
        }
        array = nullptr;
    }

    ULONG count = 0;
    BSTR* array = nullptr;
};

}  // namespace zkhw
