#ifndef QV_CORBEL_UTCCALENDAR_H
#define QV_CORBEL_UTCCALENDAR_H

#include <ctime>

namespace corbel {

// The UTC calendar of the C library: gmtime_r and timegm, or their Windows run-time twins.
class UtcCalendar {
  public:
    // False when the second has no calendar time.
    static bool fieldsOf(std::time_t seconds, std::tm& fields);
    // Normalises `fields` as timegm does.
    static std::time_t secondsOf(std::tm& fields);
};

}  // namespace corbel

#endif
