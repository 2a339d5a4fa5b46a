// The exported conversions of host strings (zkfpga/exports.h says what each does). Texts end at their first NUL.

#include <cstring>
#include <memory>
#include <vector>

#include "hostbridge/HostString.h"
#include "qn/dsc/StringBase.h"
#include "qn/dsc/Utf8ToWide.h"
#include "qn/dsc/WideToUtf8.h"
#include "zkfpga/exports.h"

namespace zkhw {

namespace {

using qn::dsc::NarrowString;
using qn::dsc::String;

// A handle that comes by value can't be given back: without one there is nowhere to store.
void StoreBytes(const char* bytes, size_t length, HostHandle destination) {
    if (destination != nullptr) {
        StoreInHostString(bytes, static_cast<uint32_t>(length), destination);
    }
}

void StoreNarrow(const String& text, HostHandle destination) {
    const NarrowString narrow(text);
    StoreBytes(narrow.CStr(), narrow.Length(), destination);
}

}  // namespace

}  // namespace zkhw

using namespace zkhw;  // NOLINT(google-build-using-namespace): the functions below belong to no namespace.

int32_t FPGA_mbstowcs(ZkStringHandle source, ZkStringHandle destination) {
    const String wide = HostStringToString(source);
    StoreBytes(reinterpret_cast<const char*>(wide.CStr()), size_t{wide.Length()} * sizeof(char16_t), destination);
    return 0;
}

int32_t FPGA_wcstombs(ZkStringHandle source, ZkStringHandle destination) {
    const NarrowString bytes = HostStringToNarrow(source);
    // With a NUL unit behind the last; an odd byte at the end is no unit.
    std::vector<char16_t> units(bytes.Length() / sizeof(char16_t) + 1);
    std::memcpy(units.data(), bytes.CStr(), (units.size() - 1) * sizeof(char16_t));
    StoreNarrow(String(units.data()), destination);
    return 0;
}

int32_t FPGA_MbsToUtf8(ZkStringHandle source, ZkStringHandle destination) {
    const String wide = HostStringToString(source);
    uint32_t length = 0;
    const std::unique_ptr<char[]> utf8(qn::dsc::WideToUtf8(wide.CStr(), wide.End(), &length));
    StoreBytes(utf8.get(), length, destination);
    return 0;
}

int32_t FPGA_Utf8ToMbs(ZkStringHandle source, ZkStringHandle destination) {
    const NarrowString bytes = HostStringToNarrow(source);
    const std::unique_ptr<char16_t[]> wide(qn::dsc::Utf8ToWide(bytes.CStr(), bytes.Length()));
    StoreNarrow(String(wide.get()), destination);
    return 0;
}
