// The exported conversions of host strings (zkfpga/exports.h says what each does). Texts end at their first NUL.

#include <cstring>
#include <memory>
#include <vector>

#include "hostbridge/HostString.h"
#include "qn/dsc/StringBase.h"
#include "qn/dsc/Utf8ToWide.h"
#include "qn/dsc/WideToUtf8.h"
#include "zkfpga/exports.h"

using namespace zkhw;  // NOLINT(google-build-using-namespace): the functions below belong to no namespace.
using qn::dsc::NarrowString;
using qn::dsc::String;

int32_t FPGA_mbstowcs(ZkStringHandle source, ZkStringHandle destination) {
    const String wide = HostStringToString(source);
    const auto* const bytes = reinterpret_cast<const char*>(wide.CStr());
    StoreInGivenHostString(bytes, static_cast<uint32_t>(wide.Length() * sizeof(char16_t)), destination);
    return 0;
}

int32_t FPGA_wcstombs(ZkStringHandle source, ZkStringHandle destination) {
    const NarrowString bytes = HostStringToNarrow(source);
    // With a NUL unit behind the last; an odd byte at the end is no unit.
    std::vector<char16_t> units(bytes.Length() / sizeof(char16_t) + 1);
    std::memcpy(units.data(), bytes.CStr(), (units.size() - 1) * sizeof(char16_t));
    StoreInGivenHostString(String(units.data()), destination);
    return 0;
}

int32_t FPGA_MbsToUtf8(ZkStringHandle source, ZkStringHandle destination) {
    const String wide = HostStringToString(source);
    uint32_t length = 0;
    const std::unique_ptr<char[]> utf8(qn::dsc::WideToUtf8(wide.CStr(), wide.End(), &length));
    StoreInGivenHostString(utf8.get(), length, destination);
    return 0;
}

int32_t FPGA_Utf8ToMbs(ZkStringHandle source, ZkStringHandle destination) {
    const NarrowString bytes = HostStringToNarrow(source);
    const std::unique_ptr<char16_t[]> wide(qn::dsc::Utf8ToWide(bytes.CStr(), bytes.Length()));
    StoreInGivenHostString(String(wide.get()), destination);
    return 0;
}
