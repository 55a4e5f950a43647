#include "corbel/UtcCalendar.h"

namespace corbel {

bool UtcCalendar::fieldsOf(std::time_t seconds, std::tm& fields) {
    const __time64_t wide = seconds;
    return _gmtime64_s(&fields, &wide) == 0;
}

std::time_t UtcCalendar::secondsOf(std::tm& fields) {
    return _mkgmtime64(&fields);
}

}  // namespace corbel
