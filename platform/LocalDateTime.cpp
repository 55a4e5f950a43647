#include "platform/LocalDateTime.h"

#include <ctime>

#include "platform/OutOfRange.h"

namespace qv::dsc {

namespace {

constexpr int kFirstYearOutOfRange = 10000;

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

static_assert(sizeof(std::time_t) == 8, "local time conversions need a 64-bit time_t");

AbsTime LocalDateTime::toAbsTime(const CalendarTime& local) {
    std::tm fields = toTm(local);
    const std::time_t unixSeconds = std::mktime(&fields);
    // mktime answers -1 for a time it cannot represent; everything up to the epoch itself
    // is refused as well.
    if (unixSeconds < 1) {
        throw exception::OutOfRange("LocalDateTimeToAbsTime", 44);
    }
    return AbsTime::fromUnixSeconds(unixSeconds);
}

CalendarTime LocalDateTime::fromAbsTime(const AbsTime& time) {
    const std::time_t unixSeconds = time.toUnixSeconds(AbsTime::tFraction::kTruncate);
    std::tm fields{};
    if (localtime_r(&unixSeconds, &fields) == nullptr) {
        throw exception::OutOfRange("AbsTimeToString", 260);
    }
    // The calendar ends with year 9999: a five-digit year has no place in the host's texts.
    if (fields.tm_year >= kFirstYearOutOfRange - 1900) {
        throw exception::OutOfRange("AbsTimeToString", 245);
    }
    return fromTm(fields);
}

}  // namespace qv::dsc
