#ifndef QV_CORBEL_UTCTIME_H
#define QV_CORBEL_UTCTIME_H

#include <qv1588/corbel.h>

#include <optional>
#include <string>
#include <string_view>

namespace corbel {

// A time in the host's form (seconds since 1904 and a binary fraction) as ISO 8601 UTC,
// e.g. "2026-12-06T20:15:00Z"; a fraction of the second shows as decimal digits without
// trailing zeros ("...:00.25Z"), and only when there is one.
std::string formatUtc(const kxSysAttrTimestampUTC& time);

// Why a text is not a time that a clock can be set to.
enum class UtcError {
    kNone,
    kNotATime,    // not "YYYY-MM-DDTHH:MM:SS[.digits][Z]", or a day that the month lacks
    kOutOfRange,  // before 1970 or after the last second of PTP's 48-bit seconds
};

struct UtcParse {
    std::optional<kxSysAttrTimestampUTC> time;
    UtcError error = UtcError::kNone;
};

// "YYYY-MM-DDTHH:MM:SS[.digits][Z]" (a space may stand for the "T"), always UTC. The time
// must lie within what PTP carries: from 1970-01-01T00:00:00Z to 2^48 - 1 s later.
UtcParse parseUtc(std::string_view text);

// The first and the last time that parseUtc accepts, as it prints them.
std::string firstPtpTime();
std::string lastPtpTime();

// The host's clock now, to the millisecond (what a log of samples needs).
kxSysAttrTimestampUTC utcNow();

}  // namespace corbel

#endif
