#include "platform/CalendarTime.h"

namespace qv::dsc {

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

}  // namespace qv::dsc
