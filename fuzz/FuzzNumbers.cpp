// Numbers and GUIDs in text: what is written reads back, and any text is read or refused as one would by hand.

#include <string>

#include "FuzzInput.h"
#include "qn/dsc/Guid.h"
#include "qn/dsc/NumericCast.h"
#include "qn/dsc/SafeInteger.h"
#include "qn/dsc/StringBase.h"
#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/IntegerToString.h"
#include "qn/dsc/osdep/StringToInteger.h"

namespace {

using qn::dsc::String;
using qn::dsc::exception::BadGuidString;
using qn::dsc::exception::OutOfRange;
using qn::dsc::exception::UnableToConvert;
using qn::dsc::osdep::IntegerToString;
using qn::dsc::osdep::StringToInteger;

void CheckNumber(uint32_t value, uint32_t radix) {
    const auto signedValue = static_cast<int32_t>(value);
    try {
        const String text = IntegerToString(value, radix);
        fuzz::Require(radix >= 2 && radix <= 36, "only a radix from 2 to 36 is taken");
        bool negative = true;
        // The overflow test is one comparison of products, so a long text of digits may be refused, but none that
        // fits.
        fuzz::Require(StringToInteger(text, radix, negative) == value && !negative, "a number reads back");
        const String signedText = IntegerToString(signedValue, radix);
        fuzz::Require(StringToInteger(signedText, radix) == signedValue, "a signed number reads back");
    } catch (const UnableToConvert&) {
        fuzz::Require(radix < 2 || radix > 36, "a radix from 2 to 36 is taken");
    }
}

void CheckText(const String& text, uint32_t radix) {
    try {
        bool negative = false;
        const uint32_t magnitude = StringToInteger(text, radix, negative);
        fuzz::Require(radix >= 2 && radix <= 36, "only a radix from 2 to 36 is taken");
        const auto value = static_cast<uint32_t>(StringToInteger(text, radix));
        fuzz::Require(value == (negative && radix == 10 ? 0U - magnitude : magnitude),
                      "the sign counts in decimal alone");
    } catch (const UnableToConvert&) {
    }
}

void CheckSafeInteger(uint32_t a, uint32_t b) {
    const uint64_t sum = uint64_t{a} + b;
    try {
        const uint32_t got = (qn::dsc::SafeInteger(a) + qn::dsc::SafeInteger(b)).Value();
        fuzz::Require(got == sum, "a sum is the true sum");
    } catch (const OutOfRange&) {
        fuzz::Require(sum > 0xFFFFFFFF, "a sum that fits is given");
    }
    try {
        fuzz::Require(qn::dsc::SafeInteger(a).Doubled().Value() == uint64_t{a} * 2, "twice is twice");
    } catch (const OutOfRange&) {
        fuzz::Require(a >= 0x80000000, "twice a value that fits is given");
    }
}

void CheckGuid(const String& text) {
    try {
        const qn::dsc::Guid guid(text);
        const String written = guid.ToString();
        fuzz::Require(text.Length() == 38 && written.Length() == 38, "a text has 38 units");
        fuzz::Require(written == text, "what is taken is written alike but for letter case");
        fuzz::Require(qn::dsc::Guid(written).ToString().View() == written.View(), "what is written reads back");
    } catch (const BadGuidString&) {
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    const uint32_t radix = input.TakeByte() % 40;
    const uint32_t a = input.TakeNumber();
    const uint32_t b = input.TakeNumber();
    CheckNumber(a, radix);
    CheckSafeInteger(a, b);
    const String text(input.TakeText());
    CheckText(text, radix);
    CheckGuid(text);
    return 0;
}
