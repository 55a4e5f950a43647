#include "corbel/UtcCalendar.h"

namespace corbel {

bool UtcCalendar::fieldsOf(std::time_t seconds, std::tm& fields) {
    return gmtime_r(&seconds, &fields) != nullptr;
}

std::time_t UtcCalendar::secondsOf(std::tm& fields) {
    return timegm(&fields);
}

}  // namespace corbel
