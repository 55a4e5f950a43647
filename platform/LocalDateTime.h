#ifndef QV_PLATFORM_LOCALDATETIME_H
#define QV_PLATFORM_LOCALDATETIME_H

#include "platform/AbsTime.h"
#include "platform/CalendarTime.h"

namespace qv::dsc {

// Conversions between AbsTime and the calendar time of the process's time zone (TZ).
class LocalDateTime {
  public:
    // The second named by a local calendar time; fields out of their range are normalised
    // (minute 61 is the next hour). A time at or before 1970-01-01 00:00:00 UTC, or one
    // that cannot be represented, throws qv::dsc::exception::OutOfRange.
    static AbsTime toAbsTime(const CalendarTime& local);
    // The local calendar time of the second that contains `time`; a time that the calendar
    // cannot represent, or one in year 10000 or later, throws OutOfRange.
    static CalendarTime fromAbsTime(const AbsTime& time);
};

// The names by which the rest of the system calls the conversions.
inline AbsTime LocalDateTimeToAbsTime(const CalendarTime& local) {
    return LocalDateTime::toAbsTime(local);
}
inline CalendarTime AbsTimeToLocalDateTime(const AbsTime& time) {
    return LocalDateTime::fromAbsTime(time);
}

}  // namespace qv::dsc

#endif
