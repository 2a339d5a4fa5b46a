#include "qn/dsc/osdep/IntegerToString.h"

#include <cstddef>
#include <string_view>

#include "qn/dsc/exception/Exception.h"

namespace qn::dsc::osdep {

namespace {

// Room for a sign and the 32 digits of radix 2.
class Digits {
  public:
    Digits(uint32_t value, uint32_t radix) {
        if (radix < 2 || radix > 36) {
            exception::ThrowAt(exception::UnableToConvert(), "qn/dsc/osdep/IntegerToString", __LINE__);
        }
        do {
            Prepend(u"0123456789ABCDEFGHIJKLMNOPQRSTUVWXYZ"[value % radix]);
            value /= radix;
        } while (value != 0);
    }

    void Prepend(char16_t unit) { *--first = unit; }

    String Text() const { return String(std::u16string_view(first, static_cast<size_t>(units + size - first))); }

  private:
    static constexpr size_t size = 33;

    char16_t units[size];
    char16_t* first = units + size;
};

}  // namespace

String IntegerToString(uint32_t value, uint32_t radix) {
    return Digits(value, radix).Text();
}

String IntegerToString(int32_t value, uint32_t radix) {
    if (value >= 0 || radix != 10) {
        return IntegerToString(static_cast<uint32_t>(value), radix);
    }
    // The negation wraps round, so that the least value too has its magnitude.
    Digits digits(0u - static_cast<uint32_t>(value), radix);
    digits.Prepend(u'-');
    return digits.Text();
}

}  // namespace qn::dsc::osdep
