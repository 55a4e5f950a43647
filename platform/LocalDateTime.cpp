#include "platform/LocalDateTime.h"

#include <ctime>

#include "platform/OutOfRange.h"

namespace qv::dsc {

namespace {

constexpr int kFirstYearOutOfRange = 10000;

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
