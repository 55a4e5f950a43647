#include "corbel/serve/WallTime.h"

#include <cmath>

#include "corbel/UtcTime.h"

namespace corbel {

namespace {

// Seconds from 1904-01-01 to 1970-01-01, both UTC: the host's timestamps count from 1904.
constexpr std::int64_t kUnixEpochSince1904 = 2082844800;

}  // namespace

std::int64_t unixMilliseconds(WallTime time) {
    return std::chrono::duration_cast<std::chrono::milliseconds>(time.time_since_epoch()).count();
}

std::string isoTime(WallTime time) {
    const std::int64_t milliseconds = unixMilliseconds(time);
    const std::int64_t seconds = milliseconds / 1000 - (milliseconds % 1000 < 0 ? 1 : 0);
    // Half a nanosecond more, so that the formatter's truncation to nanoseconds gives the
    // milliseconds exactly.
    const std::int64_t rest = milliseconds - seconds * 1000;
    const double nanoseconds = static_cast<double>(rest) * 1e6 + 0.5;
    const kxSysAttrTimestampUTC stamp{
        rest == 0 ? 0 : static_cast<std::uint64_t>(std::ldexp(nanoseconds / 1e9, 64)),
        seconds + kUnixEpochSince1904};
    return formatUtc(stamp);
}

}  // namespace corbel
