#include "corbel/UtcTime.h"

#include <cmath>
#include <cstdio>
#include <ctime>

#include "corbel/UtcCalendar.h"

namespace corbel {

namespace {

// Seconds from 1904-01-01 to 1970-01-01, both UTC.
constexpr std::int64_t kUnixEpochSince1904 = 2082844800;

std::uint64_t fractionOfNanoseconds(std::uint32_t nanoseconds) {
    return static_cast<std::uint64_t>(std::ldexp(static_cast<long double>(nanoseconds) / 1e9L, 64));
}

std::uint32_t nanosecondsOfFraction(std::uint64_t fraction) {
    return static_cast<std::uint32_t>(std::ldexp(static_cast<long double>(fraction), -64) * 1e9L);
}

// Nanoseconds from the digits after the decimal point (more than nine are dropped).
std::optional<std::uint32_t> parseFraction(std::string_view digits) {
    std::uint32_t nanoseconds = 0;
    for (std::size_t i = 0; i < 9; ++i) {
        const char digit = i < digits.size() ? digits[i] : '0';
        if (digit < '0' || digit > '9') {
            return std::nullopt;
        }
        nanoseconds = nanoseconds * 10 + static_cast<std::uint32_t>(digit - '0');
    }
    for (char digit : digits) {
        if (digit < '0' || digit > '9') {
            return std::nullopt;
        }
    }
    return nanoseconds;
}

}  // namespace

std::string formatUtc(const kxSysAttrTimestampUTC& time) {
    const auto seconds = static_cast<std::time_t>(time.seconds - kUnixEpochSince1904);
    std::tm fields{};
    if (!UtcCalendar::fieldsOf(seconds, fields)) {
        return "?";
    }
    char text[64];
    std::strftime(text, sizeof text, "%Y-%m-%dT%H:%M:%S", &fields);
    std::string result = text;
    if (time.fraction != 0) {
        std::snprintf(text, sizeof text, ".%09u", nanosecondsOfFraction(time.fraction));
        result += text;
    }
    return result + "Z";
}

std::optional<kxSysAttrTimestampUTC> parseUtc(std::string_view text) {
    if (!text.empty() && (text.back() == 'Z' || text.back() == 'z')) {
        text.remove_suffix(1);
    }
    const std::string whole(text);
    std::tm fields{};
    char separator = 0;
    int used = 0;
    if (std::sscanf(whole.c_str(), "%5d-%2d-%2d%c%2d:%2d:%2d%n", &fields.tm_year, &fields.tm_mon,
                    &fields.tm_mday, &separator, &fields.tm_hour, &fields.tm_min, &fields.tm_sec,
                    &used) != 7 ||
        (separator != 'T' && separator != 't' && separator != ' ')) {
        return std::nullopt;
    }
    const bool inRange = fields.tm_mon >= 1 && fields.tm_mon <= 12 && fields.tm_mday >= 1 &&
                         fields.tm_mday <= 31 && fields.tm_hour <= 23 && fields.tm_min <= 59 &&
                         fields.tm_sec <= 59 && fields.tm_hour >= 0 && fields.tm_min >= 0 &&
                         fields.tm_sec >= 0;
    std::uint32_t nanoseconds = 0;
    const std::string_view rest = text.substr(static_cast<std::size_t>(used));
    if (!rest.empty()) {
        const auto fraction = rest[0] == '.' ? parseFraction(rest.substr(1)) : std::nullopt;
        if (!fraction) {
            return std::nullopt;
        }
        nanoseconds = *fraction;
    }
    const int day = fields.tm_mday;
    fields.tm_year -= 1900;
    fields.tm_mon -= 1;
    const std::time_t seconds = UtcCalendar::secondsOf(fields);
    if (!inRange || fields.tm_mday != day) {  // a day that the month does not have
        return std::nullopt;
    }
    return kxSysAttrTimestampUTC{fractionOfNanoseconds(nanoseconds),
                                 static_cast<std::int64_t>(seconds) + kUnixEpochSince1904};
}

}  // namespace corbel
