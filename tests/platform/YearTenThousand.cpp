#include <gtest/gtest.h>

#include "platform/LocalDateTime.h"
#include "platform/OutOfRange.h"

using qv::dsc::AbsTime;

namespace {

// 10000-01-01 00:00:00 UTC; a day either side is on its side in every time zone.
constexpr std::int64_t kYear10000 = 253402300800;
constexpr std::int64_t kDay = 86400;

TEST(YearTenThousand, IsOutOfRangeAndTheDayBeforeItIsNot) {
    const qv::dsc::CalendarTime last =
        qv::dsc::AbsTimeToLocalDateTime(AbsTime::fromUnixSeconds(kYear10000 - kDay));
    EXPECT_EQ(last.yearsSince1900 + 1900, 9999);
    EXPECT_THROW(qv::dsc::AbsTimeToLocalDateTime(AbsTime::fromUnixSeconds(kYear10000 + kDay)),
                 qv::dsc::exception::OutOfRange);
}

}  // namespace
