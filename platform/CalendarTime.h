#ifndef QV_PLATFORM_CALENDARTIME_H
#define QV_PLATFORM_CALENDARTIME_H

#include <cstdint>
#include <ctime>

namespace qv::dsc {

// A broken-down calendar time, fields as the C library counts them.
struct CalendarTime {
    std::int32_t second = 0;
    std::int32_t minute = 0;
    std::int32_t hour = 0;
    std::int32_t dayOfMonth = 1;  // 1-31
    std::int32_t month = 0;       // 0-11
    std::int32_t yearsSince1900 = 70;
    std::int32_t weekday = 0;          // 0 = Sunday
    std::int32_t dayOfYear = 0;        // 0-365
    std::int32_t daylightSaving = -1;  // > 0 in force, 0 not, < 0 unknown
};

// The C library's form of the same fields, for both local-time backends.
std::tm toTm(const CalendarTime& in);
CalendarTime fromTm(const std::tm& in);

}  // namespace qv::dsc

#endif
