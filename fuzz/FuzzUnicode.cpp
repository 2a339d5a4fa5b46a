// The conversions between bytes and units: what one direction accepts, the other gives back.

#include <memory>
#include <string>

#include "FuzzInput.h"
#include "qn/dsc/StringBase.h"
#include "qn/dsc/Utf8ToWide.h"
#include "qn/dsc/WideToUtf8.h"
#include "qn/dsc/exception/Exception.h"
#include "qn/dsc/osdep/AnsiToWide.h"
#include "qn/dsc/osdep/WideToAnsi.h"

namespace {

using qn::dsc::String;

void CheckUtf8(const std::string& bytes) {
    const auto length = static_cast<uint32_t>(bytes.size());
    String direct(u"untouched");
    const bool taken = String::TryFromUtf8(bytes.data(), length, direct);
    try {
        const std::unique_ptr<char16_t[]> wide(qn::dsc::Utf8ToWide(bytes.data(), length));
        fuzz::Require(taken, "what Utf8ToWide takes, TryFromUtf8 takes");
        const std::u16string_view units = direct.View();
        fuzz::Require(std::u16string_view(wide.get(), units.size()) == units && wide[units.size()] == 0,
                      "both give the same units");
        const std::unique_ptr<char[]> back(qn::dsc::WideToUtf8(units.data(), units.data() + units.size()));
        fuzz::Require(std::string_view(back.get(), bytes.size()) == bytes && back[bytes.size()] == 0,
                      "bytes that were taken come back");
    } catch (const qn::dsc::exception::InvalidSequence&) {
        fuzz::Require(!taken, "what Utf8ToWide refuses, TryFromUtf8 refuses");
        fuzz::Require(direct.View() == u"untouched", "a refusal leaves the text as it was");
    }
}

void CheckUnits(const std::u16string& units) {
    const std::unique_ptr<char[]> bytes(qn::dsc::WideToUtf8(units.data(), units.data() + units.size()));
    size_t length = 0;
    for (const char16_t unit : units) {
        length += unit < 0x80 ? 1U : unit < 0x800 ? 2U : 3U;
    }
    fuzz::Require(bytes[length] == 0, "the length is that of one sequence per unit");
    String back;
    fuzz::Require(String::TryFromUtf8(bytes.get(), static_cast<uint32_t>(length), back), "every unit can be read back");
    fuzz::Require(back.View() == units, "units come back");
}

// Any bytes without a NUL are a native name, and every native name survives the way in and out.
void CheckNative(std::string bytes) {
    std::erase(bytes, '\0');
    const String wide(bytes.data(), static_cast<uint32_t>(bytes.size()));
    const qn::dsc::NarrowString back(wide.CStr(), wide.Length());
    fuzz::Require(back.View() == bytes, "a native name survives");
}

void CheckCodePages(const std::u16string& units) {
    for (const char* locale : {"US-ASCII", "cp932", ""}) {
        const std::unique_ptr<char[]> bytes(
            qn::dsc::osdep::WideToAnsi(units.data(), units.data() + units.size(), locale));
        const std::string_view text(bytes.get());
        const std::unique_ptr<char16_t[]> wide(
            qn::dsc::osdep::AnsiToWide(text.data(), text.data() + text.size(), locale));
        fuzz::Require(wide != nullptr, "every code page reads what it wrote");
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    const std::u16string units = input.TakeText();
    CheckUnits(units);
    CheckCodePages(units);
    const std::string bytes = input.TakeRest();
    CheckUtf8(bytes);
    CheckNative(bytes);
    return 0;
}
