#include "expert/CkxDateTimeFields.h"

#include <algorithm>
#include <cstdint>
#include <limits>

#include "platform/LocalDateTime.h"
#include "platform/OutOfRange.h"

using qv::dsc::AbsTime;
using qv::dsc::CalendarTime;

namespace {

enum Field { kYear, kMonth, kDay, kHour, kMinute, kSecond };

struct FieldRange {
    LONG lowest;
    LONG highest;
};

// The calendar's own normalisation would turn month 13 into next January and, with fields
// near the ends of their type, overflow on the way: such fields name no time.
constexpr FieldRange kRanges[CkxDateTimeFields::kCount] = {
    {1904, std::numeric_limits<LONG>::max()}, {1, 12}, {1, 31}, {0, 23}, {0, 59}, {0, 59}};

bool inRanges(const LONG* fields) {
    for (int field = kYear; field <= kSecond; ++field) {
        if (fields[field] < kRanges[field].lowest || fields[field] > kRanges[field].highest) {
            return false;
        }
    }
    return true;
}

}  // namespace

kxSysAttrTimestampUTC CkxDateTimeFields::toTimestamp(const LONG* fields) {
    if (!inRanges(fields)) {
        return kxSysAttrTimestampUTC{};
    }
    CalendarTime local;
    local.yearsSince1900 = fields[kYear] - 1900;
    local.month = fields[kMonth] - 1;
    local.dayOfMonth = fields[kDay];
    local.hour = fields[kHour];
    local.minute = fields[kMinute];
    local.second = fields[kSecond];
    local.daylightSaving = -1;
    try {
        const AbsTime time = qv::dsc::LocalDateTimeToAbsTime(local);
        return kxSysAttrTimestampUTC{time.fraction, time.seconds};
    } catch (const qv::dsc::exception::OutOfRange&) {
        return kxSysAttrTimestampUTC{};
    }
}

void CkxDateTimeFields::toFields(const kxSysAttrTimestampUTC& timestamp, LONG* fields) {
    std::fill_n(fields, kCount, -1);
    if (timestamp.fraction == 0 && timestamp.seconds == 0) {
        return;
    }
    CalendarTime local;
    try {
        local = qv::dsc::AbsTimeToLocalDateTime(AbsTime{timestamp.fraction, timestamp.seconds});
    } catch (const qv::dsc::exception::OutOfRange&) {
        return;
    }
    const std::int64_t year = std::int64_t{local.yearsSince1900} + 1900;
    if (year > std::numeric_limits<LONG>::max()) {
        return;
    }
    fields[kYear] = static_cast<LONG>(year);
    fields[kMonth] = local.month + 1;
    fields[kDay] = local.dayOfMonth;
    fields[kHour] = local.hour;
    fields[kMinute] = local.minute;
    fields[kSecond] = local.second;
}
