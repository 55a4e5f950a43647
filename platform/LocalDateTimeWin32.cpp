#include <ctime>

#include "platform/LocalDateTime.h"
#include "platform/OutOfRange.h"

namespace qv::dsc {

// Windows backend: the run-time's 64-bit local time functions.

namespace {

std::tm toTm(const CalendarTime& in) {
    std::tm out{};
    out.tm_sec = in.second;
    out.tm_min = in.minute;
    out.tm_hour = in.hour;
    out.tm_mday = in.dayOfMonth;
    out.tm_mon = in.month;
    out.tm_year = in.yearsSince1900;
    out.tm_wday = in.weekday;
    out.tm_yday = in.dayOfYear;
    out.tm_isdst = in.daylightSaving;
    return out;
}

CalendarTime fromTm(const std::tm& in) {
    return CalendarTime{in.tm_sec,  in.tm_min,  in.tm_hour, in.tm_mday, in.tm_mon,
                        in.tm_year, in.tm_wday, in.tm_yday, in.tm_isdst};
}

}  // namespace

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
