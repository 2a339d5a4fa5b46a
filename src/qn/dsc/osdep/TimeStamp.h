#pragma once

// A point in time as a 128-bit fixed-point number: the file times of the system.

#include <compare>
#include <cstdint>

namespace qn::dsc::osdep {

struct TimeStamp {
    // Whole seconds since 1904-01-01 00:00:00 UTC, rounded down.
    int64_t seconds = 0;
    // What is above them, in units of 2^-64 s.
    uint64_t fraction = 0;

    // The time that is `ticks` times 100 ns after 1601-01-01 00:00 UTC. The part below a second goes through double
    // precision.
    static TimeStamp FromFileTime(uint64_t ticks);

    // By the seconds, then by the fraction.
    std::strong_ordering operator<=>(const TimeStamp& other) const {
        // NOLINTNEXTLINE(modernize-use-nullptr): clang-tidy takes the 0 of the rewritten comparison for a pointer.
        return seconds != other.seconds ? seconds <=> other.seconds : fraction <=> other.fraction;
    }
    bool operator==(const TimeStamp& other) const = default;
};

}  // namespace qn::dsc::osdep
