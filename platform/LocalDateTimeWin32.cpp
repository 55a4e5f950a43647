#include <ctime>

#include "platform/LocalDateTime.h"
#include "platform/OutOfRange.h"

namespace qv::dsc {

// Windows backend: the run-time's 64-bit local time functions.

AbsTime LocalDateTime::toAbsTime(const CalendarTime& local) {
    std::tm fields = toTm(local);
    const __time64_t unixSeconds = _mktime64(&fields);
    // _mktime64 answers -1 for a time it cannot represent (after the year 3000 too);
    // everything up to the epoch itself is refused as well.
    if (unixSeconds < 1) {
        throw exception::OutOfRange("LocalDateTimeToAbsTime", 44);
    }
    return AbsTime::fromUnixSeconds(unixSeconds);
}

CalendarTime LocalDateTime::fromAbsTime(const AbsTime& time) {
    const __time64_t unixSeconds = time.toUnixSeconds(AbsTime::tFraction::kTruncate);
    std::tm fields{};
    // The run-time's calendar ends with the year 3000, well before the year 10000 at which
    // the host's four-digit years end.
    if (_localtime64_s(&fields, &unixSeconds) != 0) {
        throw exception::OutOfRange("AbsTimeToString", 260);
    }
    return fromTm(fields);
}

}  // namespace qv::dsc
