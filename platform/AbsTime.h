#ifndef QV_PLATFORM_ABSTIME_H
#define QV_PLATFORM_ABSTIME_H

#include <cstdint>

namespace qv::dsc {

// An absolute time: signed 64.64 fixed-point seconds since 1904-01-01 00:00:00 UTC, the
// epoch of the host's time stamps.
struct AbsTime {
    // Seconds from 1904-01-01 to 1970-01-01.
    static constexpr std::int64_t kUnixEpochSeconds = 2082844800;

    // How a fraction of a second is resolved to whole seconds.
    enum class tFraction { kTruncate, kRound };

    std::uint64_t fraction = 0;  // units of 2^-64 s
    std::int64_t seconds = 0;

    // Throws qv::dsc::exception::OutOfRange when the result does not fit.
    static AbsTime fromUnixSeconds(std::int64_t unixSeconds);
    // Truncation gives the second that contains the time (towards the past); rounding gives
    // the nearest, half a second rounding up. Throws OutOfRange when it does not fit.
    std::int64_t toUnixSeconds(tFraction mode) const;

    friend bool operator==(const AbsTime&, const AbsTime&) = default;
};

}  // namespace qv::dsc

#endif
