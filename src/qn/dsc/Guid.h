#pragma once

// A GUID as 16 bytes, and its text form "{01234567-89AB-CDEF-0123-456789ABCDEF}".

#include <cstdint>

#include "qn/dsc/TextArgument.h"

namespace qn::dsc {

// The standard layout: the first three fields are in the machine's byte order.
struct Guid {
    // All zero.
    constexpr Guid() = default;

    constexpr Guid(uint32_t first, uint16_t second, uint16_t third, const uint8_t (&bytes)[8])
        : data1(first), data2(second), data3(third) {
        for (int i = 0; i < 8; ++i) {
            data4[i] = bytes[i];
        }
    }

    // From the text form: exactly 38 units, digits in either case. exception::BadGuidString for anything else.
    explicit Guid(TextArgument text) { Assign(text); }

    // Takes the value of a text; one that isn't a GUID throws as the constructor does and changes nothing.
    void Assign(TextArgument text);

    // The text form, 38 units with capital digits.
    String ToString() const;

    friend constexpr bool operator==(const Guid&, const Guid&) = default;

    uint32_t data1 = 0;
    uint16_t data2 = 0;
    uint16_t data3 = 0;
    uint8_t data4[8] = {};
};

static_assert(sizeof(Guid) == 16);

}  // namespace qn::dsc
