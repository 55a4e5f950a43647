#include "corbel/UtcTime.h"

#include <algorithm>
#include <chrono>
#include <cmath>
#include <cstdint>
#include <cstdio>

namespace corbel {

namespace {

// Seconds from 1904-01-01 to 1970-01-01, both UTC.
constexpr std::int64_t kUnixEpochSince1904 = 2082844800;
// PTP carries seconds since 1970 in 48 bits.
constexpr std::int64_t kLastPtpSecond = (std::int64_t{1} << 48) - 1;
constexpr std::int64_t kSecondsPerDay = 86400;

// The proleptic Gregorian calendar counted in 400-year eras that start on 0000-03-01, so
// that the leap day ends a year; own code rather than the C library's, whose years end
// long before PTP's last second (year 8921556) and differ between systems.
struct Date {
    std::int64_t year;
    unsigned month, day;
    bool operator==(const Date&) const = default;
};

std::int64_t daysSince1970(const Date& date) {
    const std::int64_t year = date.year - (date.month <= 2 ? 1 : 0);
    const std::int64_t era = (year >= 0 ? year : year - 399) / 400;
    const auto yearOfEra = static_cast<unsigned>(year - era * 400);
    const unsigned dayOfYear =
        (153 * (date.month > 2 ? date.month - 3 : date.month + 9) + 2) / 5 + date.day - 1;
    const unsigned dayOfEra = yearOfEra * 365 + yearOfEra / 4 - yearOfEra / 100 + dayOfYear;
    return era * 146097 + dayOfEra - 719468;
}

Date dateOf(std::int64_t daysSince1970) {
    const std::int64_t days = daysSince1970 + 719468;
    const std::int64_t era = (days >= 0 ? days : days - 146096) / 146097;
    const auto dayOfEra = static_cast<unsigned>(days - era * 146097);
    const unsigned yearOfEra =
        (dayOfEra - dayOfEra / 1460 + dayOfEra / 36524 - dayOfEra / 146096) / 365;
    const unsigned dayOfYear = dayOfEra - (365 * yearOfEra + yearOfEra / 4 - yearOfEra / 100);
    const unsigned shifted = (5 * dayOfYear + 2) / 153;
    const unsigned month = shifted < 10 ? shifted + 3 : shifted - 9;
    return {static_cast<std::int64_t>(yearOfEra) + era * 400 + (month <= 2 ? 1 : 0), month,
            dayOfYear - (153 * shifted + 2) / 5 + 1};
}

std::uint64_t fractionOfNanoseconds(std::uint32_t nanoseconds) {
    return static_cast<std::uint64_t>(std::ldexp(static_cast<long double>(nanoseconds) / 1e9L, 64));
}

// To the nearest nanosecond, so that a fraction made from nanoseconds gives them back.
std::uint32_t nanosecondsOfFraction(std::uint64_t fraction) {
    const long double nanoseconds = std::ldexp(static_cast<long double>(fraction), -64) * 1e9L;
    return static_cast<std::uint32_t>(std::min(std::round(nanoseconds), 999999999.0L));
}

// Takes `minimum` to `maximum` decimal digits from the front of `text`.
std::optional<std::int64_t> takeDigits(std::string_view& text, std::size_t minimum,
                                       std::size_t maximum) {
    std::size_t count = 0;
    std::int64_t value = 0;
    while (count < text.size() && count < maximum && text[count] >= '0' && text[count] <= '9') {
        value = value * 10 + (text[count++] - '0');
    }
    if (count < minimum) {
        return std::nullopt;
    }
    text.remove_prefix(count);
    return value;
}

bool takeOneOf(std::string_view& text, std::string_view characters) {
    if (text.empty() || characters.find(text.front()) == std::string_view::npos) {
        return false;
    }
    text.remove_prefix(1);
    return true;
}

// Nanoseconds from the digits after the decimal point (more than nine are dropped).
std::optional<std::uint32_t> takeFraction(std::string_view& text) {
    const std::string_view digits = text.substr(0, text.find_first_not_of("0123456789"));
    if (digits.empty()) {
        return std::nullopt;
    }
    std::uint32_t nanoseconds = 0;
    for (std::size_t i = 0; i < 9; ++i) {
        nanoseconds = nanoseconds * 10 +
                      (i < digits.size() ? static_cast<std::uint32_t>(digits[i] - '0') : 0u);
    }
    text.remove_prefix(digits.size());
    return nanoseconds;
}

struct Fields {
    Date date{};
    std::int64_t hour = 0, minute = 0, second = 0;
    std::uint32_t nanoseconds = 0;
};

std::optional<Fields> fieldsOf(std::string_view text) {
    Fields fields;
    const auto year = takeDigits(text, 4, 7);
    const bool dash1 = takeOneOf(text, "-");
    const auto month = takeDigits(text, 2, 2);
    const bool dash2 = takeOneOf(text, "-");
    const auto day = takeDigits(text, 2, 2);
    const bool separator = takeOneOf(text, "Tt ");
    const auto hour = takeDigits(text, 2, 2);
    const bool colon1 = takeOneOf(text, ":");
    const auto minute = takeDigits(text, 2, 2);
    const bool colon2 = takeOneOf(text, ":");
    const auto second = takeDigits(text, 2, 2);
    if (!year || !dash1 || !month || !dash2 || !day || !separator || !hour || !colon1 || !minute ||
        !colon2 || !second || *hour > 23 || *minute > 59 || *second > 59) {
        return std::nullopt;
    }
    if (takeOneOf(text, ".")) {
        const auto nanoseconds = takeFraction(text);
        if (!nanoseconds) {
            return std::nullopt;
        }
        fields.nanoseconds = *nanoseconds;
    }
    takeOneOf(text, "Zz");
    fields.date = {*year, static_cast<unsigned>(*month), static_cast<unsigned>(*day)};
    // A day that the month lacks comes back as another date.
    if (!text.empty() || fields.date.month < 1 || fields.date.month > 12 ||
        dateOf(daysSince1970(fields.date)) != fields.date) {
        return std::nullopt;
    }
    fields.hour = *hour;
    fields.minute = *minute;
    fields.second = *second;
    return fields;
}

}  // namespace

std::string formatUtc(const kxSysAttrTimestampUTC& time) {
    const std::int64_t seconds = time.seconds - kUnixEpochSince1904;
    const std::int64_t days =
        (seconds >= 0 ? seconds : seconds - kSecondsPerDay + 1) / kSecondsPerDay;
    const std::int64_t ofDay = seconds - days * kSecondsPerDay;
    const Date date = dateOf(days);
    char text[80];
    std::snprintf(text, sizeof text, "%04lld-%02u-%02uT%02lld:%02lld:%02lld",
                  static_cast<long long>(date.year), date.month, date.day,
                  static_cast<long long>(ofDay / 3600), static_cast<long long>(ofDay / 60 % 60),
                  static_cast<long long>(ofDay % 60));
    std::string result = text;
    if (time.fraction != 0) {
        std::snprintf(text, sizeof text, ".%09u", nanosecondsOfFraction(time.fraction));
        std::string digits = text;
        digits.erase(digits.find_last_not_of('0') + 1);
        result += digits.size() > 1 ? digits : "";  // less than a nanosecond
    }
    return result + "Z";
}

UtcParse parseUtc(std::string_view text) {
    const auto fields = fieldsOf(text);
    if (!fields) {
        return {std::nullopt, UtcError::kNotATime};
    }
    const std::int64_t seconds = daysSince1970(fields->date) * kSecondsPerDay +
                                 fields->hour * 3600 + fields->minute * 60 + fields->second;
    if (seconds < 0 || seconds > kLastPtpSecond) {
        return {std::nullopt, UtcError::kOutOfRange};
    }
    return {kxSysAttrTimestampUTC{fractionOfNanoseconds(fields->nanoseconds),
                                  seconds + kUnixEpochSince1904},
            UtcError::kNone};
}

std::string firstPtpTime() {
    return formatUtc({0, kUnixEpochSince1904});
}

std::string lastPtpTime() {
    return formatUtc({0, kLastPtpSecond + kUnixEpochSince1904});
}

kxSysAttrTimestampUTC utcNow() {
    const auto since1970 = std::chrono::system_clock::now().time_since_epoch();
    const auto seconds = std::chrono::floor<std::chrono::seconds>(since1970);
    const auto nanoseconds = std::chrono::duration_cast<std::chrono::nanoseconds>(
                                 std::chrono::floor<std::chrono::milliseconds>(since1970 - seconds))
                                 .count();
    return {fractionOfNanoseconds(static_cast<std::uint32_t>(nanoseconds)),
            seconds.count() + kUnixEpochSince1904};
}

}  // namespace corbel
