#include "qn/dsc/osdep/TimeStamp.h"

#include <cmath>

namespace qn::dsc::osdep {

TimeStamp TimeStamp::FromFileTime(uint64_t ticks) {
    constexpr uint64_t ticksTo1904 = 0x0153B281E0FB4000;
    constexpr int64_t ticksPerSecond = 10000000;
    const auto ticksSince1904 = static_cast<int64_t>(ticks - ticksTo1904);
    const int64_t wholeSeconds = ticksSince1904 / ticksPerSecond;
    // NOLINTNEXTLINE(bugprone-integer-division): the whole seconds, taken through double precision.
    const auto seconds = static_cast<int64_t>(static_cast<double>(wholeSeconds));
    const double part = static_cast<double>(ticksSince1904 % ticksPerSecond) / static_cast<double>(ticksPerSecond);
    const auto fraction = static_cast<uint64_t>(std::ldexp(std::fabs(part), 64));
    // Before 1904 the part is negative, but the fraction always counts upward from the second below.
    return part < 0 ? TimeStamp{seconds - 1, 0 - fraction} : TimeStamp{seconds, fraction};
}

}  // namespace qn::dsc::osdep
