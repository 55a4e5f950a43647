#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <optional>
#include <string>

#include "platform/AbsTime.h"
#include "platform/LocalDateTime.h"
#include "platform/OutOfRange.h"

using qv::dsc::AbsTime;
using qv::dsc::CalendarTime;
using qv::dsc::exception::OutOfRange;

namespace {

// Sets TZ for one test and restores the process's own afterwards. POSIX rules, so the
// test needs no time zone database.
class ScopedTimeZone {
  public:
    explicit ScopedTimeZone(const char* zone) {
        if (const char* old = std::getenv("TZ")) {
            saved_ = old;
        }
        setenv("TZ", zone, 1);
        tzset();
    }
    ~ScopedTimeZone() {
        if (saved_) {
            setenv("TZ", saved_->c_str(), 1);
        } else {
            unsetenv("TZ");
        }
        tzset();
    }

  private:
    std::optional<std::string> saved_;
};

CalendarTime calendar(int year, int month, int day, int hour, int minute, int second) {
    CalendarTime t;
    t.yearsSince1900 = year - 1900;
    t.month = month - 1;
    t.dayOfMonth = day;
    t.hour = hour;
    t.minute = minute;
    t.second = second;
    return t;
}

}  // namespace

TEST(AbsTimeTest, FractionTruncatesOrRoundsAtHalf) {
    AbsTime t = AbsTime::fromUnixSeconds(100);
    t.fraction = (std::uint64_t{1} << 63) - 1;  // just under half a second
    EXPECT_EQ(t.toUnixSeconds(AbsTime::tFraction::kRound), 100);
    t.fraction = std::uint64_t{1} << 63;
    EXPECT_EQ(t.toUnixSeconds(AbsTime::tFraction::kRound), 101);
    EXPECT_EQ(t.toUnixSeconds(AbsTime::tFraction::kTruncate), 100);
}

TEST(AbsTimeTest, ValuesThatDoNotFitThrow) {
    EXPECT_THROW(AbsTime::fromUnixSeconds(INT64_MAX), OutOfRange);
    const AbsTime low{0, INT64_MIN};
    EXPECT_THROW(low.toUnixSeconds(AbsTime::tFraction::kTruncate), OutOfRange);
}

TEST(LocalDateTimeTest, NewYorkSummerTimeIsFourHoursBehind) {
    const ScopedTimeZone zone("EST5EDT,M3.2.0,M11.1.0");
    // 2024-07-04 12:00:00 EDT is 16:00:00 UTC = 1720108800.
    const AbsTime t = qv::dsc::LocalDateTimeToAbsTime(calendar(2024, 7, 4, 12, 0, 0));
    EXPECT_EQ(t.toUnixSeconds(AbsTime::tFraction::kTruncate), 1720108800);
    AbsTime withFraction = t;
    withFraction.fraction = 0xFFFFFFFFFFFFFFFFu;  // the calendar shows the second it is in
    const CalendarTime back = qv::dsc::AbsTimeToLocalDateTime(withFraction);
    EXPECT_EQ(back.hour, 12);
    EXPECT_EQ(back.second, 0);
    EXPECT_EQ(back.daylightSaving, 1);
    // In winter the same zone is five hours behind: 2024-01-15 12:00 EST = 17:00 UTC.
    EXPECT_EQ(qv::dsc::LocalDateTimeToAbsTime(calendar(2024, 1, 15, 12, 0, 0))
                  .toUnixSeconds(AbsTime::tFraction::kTruncate),
              1705338000);
}

// The calendar covers the years after the Unix epoch up to 9999.
TEST(LocalDateTimeTest, DatesOutsideTheCalendarAreRefused) {
    const ScopedTimeZone zone("UTC0");
    EXPECT_THROW(qv::dsc::LocalDateTimeToAbsTime(calendar(1970, 1, 1, 0, 0, 0)), OutOfRange);
    EXPECT_THROW(qv::dsc::LocalDateTimeToAbsTime(calendar(1969, 12, 31, 23, 0, 0)), OutOfRange);
    EXPECT_EQ(qv::dsc::LocalDateTimeToAbsTime(calendar(1970, 1, 1, 0, 0, 1)).seconds,
              AbsTime::kUnixEpochSeconds + 1);
    constexpr std::int64_t kYear10000 = 253402300800;  // 10000-01-01 00:00:00 UTC
    EXPECT_EQ(
        qv::dsc::AbsTimeToLocalDateTime(AbsTime::fromUnixSeconds(kYear10000 - 1)).yearsSince1900,
        9999 - 1900);
    EXPECT_THROW(qv::dsc::AbsTimeToLocalDateTime(AbsTime::fromUnixSeconds(kYear10000)), OutOfRange);
}
