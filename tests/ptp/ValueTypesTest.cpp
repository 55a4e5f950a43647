#include <gtest/gtest.h>

#include <cstdint>
#include <limits>

#include "ptp/tPTPText.h"
#include "ptp/tPortAddress.h"
#include "ptp/tTimeInterval.h"

using namespace nQVPTP000;

namespace {

// Nanoseconds beyond the 48 bits that scaled nanoseconds hold saturate; the way back rounds
// toward zero.
TEST(tTimeIntervalTest, ScalesSaturatesAndRoundsTowardZero) {
    constexpr std::int64_t kLimit = std::int64_t{1} << 47;
    EXPECT_EQ(tTimeInterval(1).getScaledNanoseconds(), 65536);
    EXPECT_EQ(tTimeInterval(kLimit - 1).getNanoseconds(), kLimit - 1);
    EXPECT_EQ(tTimeInterval(kLimit).getScaledNanoseconds(),
              std::numeric_limits<std::int64_t>::max());
    EXPECT_EQ(tTimeInterval(-kLimit).getNanoseconds(), -kLimit);
    EXPECT_EQ(tTimeInterval(-kLimit - 1).getScaledNanoseconds(),
              std::numeric_limits<std::int64_t>::min());
    tTimeInterval interval;
    interval.setScaledNanoseconds(-1);
    EXPECT_EQ(interval.getNanoseconds(), 0);
    interval.setScaledNanoseconds(-65537);
    EXPECT_EQ(interval.getNanoseconds(), -1);
}

// A PTPText holds 255 octets at most.
TEST(tPTPTextTest, LongestText) {
    tStatus status;
    const tPTPText longest(std::string(255, 'x').c_str(), status);
    EXPECT_TRUE(status.succeeded());
    EXPECT_EQ(longest.getLengthField(), 255);
    const tPTPText tooLong(std::string(256, 'x').c_str(), status);
    EXPECT_EQ(status.code, kStatusUnsupported);
    EXPECT_EQ(tooLong.getLengthField(), 0);
}

// No octets make an empty address; more than 16 are refused.
TEST(tPortAddressTest, GivenAddressOfNoneOrTooManyOctets) {
    tStatus status;
    EXPECT_EQ(tPortAddress(1, 4, nullptr, status).getAddressLength(), 0);
    EXPECT_TRUE(status.succeeded());
    const std::uint8_t octets[20] = {};
    EXPECT_EQ(tPortAddress(1, 20, octets, status).getAddressLength(), 0);
    EXPECT_EQ(status.code, kStatusUnsupported);
}

}  // namespace
