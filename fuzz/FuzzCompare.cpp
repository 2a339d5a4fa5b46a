// Compare orders every sorted container, so it must be a total preorder over all texts: three lines of input, one law
// after the other.

#include <string>

#include "FuzzInput.h"
#include "qn/dsc/osdep/Compare.h"

using qn::dsc::osdep::Compare;
using qn::dsc::osdep::Equal;

namespace {

std::u16string OtherCase(std::u16string text) {
    for (char16_t& unit : text) {
        if ((unit >= u'a' && unit <= u'z') || (unit >= u'A' && unit <= u'Z')) {
            unit = static_cast<char16_t>(unit ^ 0x20);
        }
    }
    return text;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    const std::u16string a = input.TakeText();
    const std::u16string b = input.TakeText();
    const std::u16string c = input.TakeText();

    const int ab = Compare(a, b);
    const int bc = Compare(b, c);
    const int ac = Compare(a, c);
    fuzz::Require(ab >= -1 && ab <= 1, "the result is -1, 0 or 1");
    fuzz::Require(Compare(b, a) == -ab, "antisymmetry");
    fuzz::Require(Compare(c, b) == -bc, "antisymmetry");
    fuzz::Require(Compare(a, a) == 0 && Compare(b, std::u16string(b)) == 0, "reflexivity");
    fuzz::Require(Equal(a, b) == (ab == 0), "Equal is Compare's 0");
    fuzz::Require(!(ab <= 0 && bc <= 0) || ac <= 0, "transitivity");
    fuzz::Require(!(ab >= 0 && bc >= 0) || ac >= 0, "transitivity");
    fuzz::Require(!(ab <= 0 && bc <= 0 && ac == 0) || (ab == 0 && bc == 0), "transitivity of equality");
    fuzz::Require(ab != 0 || ac == bc, "equal texts stand in the same place");
    fuzz::Require(Compare(a, OtherCase(a)) == 0, "letter case does not count");
    fuzz::Require(Compare(OtherCase(a), OtherCase(b)) == ab, "letter case does not count");
    return 0;
}
