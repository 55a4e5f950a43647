#include <gtest/gtest.h>

#include "corbel/UtcTime.h"

// Times as a user types them for "set ... time=" and as every view prints them: within
// what PTP carries (1970 to 2^48 - 1 s later), sub-seconds only when there are some.
// Expected seconds since 1904: Python's calendar.timegm plus 2082844800.

namespace {

using corbel::UtcError;

TEST(UtcTime, ParsesWhatPtpCarriesAndRefusesTheRest) {
    const struct {
        const char* text;
        UtcError error;
        std::int64_t seconds;
        const char* printed;  // as formatUtc gives it back
    } cases[] = {
        {"2026-12-06T20:15:00Z", UtcError::kNone, 3879432900, "2026-12-06T20:15:00Z"},
        {"2024-02-29 12:00:00", UtcError::kNone, 3792052800, "2024-02-29T12:00:00Z"},
        {"1970-01-01T00:00:00.25z", UtcError::kNone, 2082844800, "1970-01-01T00:00:00.25Z"},
        {"8921556-12-07T10:44:15Z", UtcError::kNone, 281477059555455, "8921556-12-07T10:44:15Z"},
        {"8921556-12-07T10:44:16Z", UtcError::kOutOfRange, 0, ""},
        {"1969-12-31T23:59:59Z", UtcError::kOutOfRange, 0, ""},
        {"2023-02-29T00:00:00Z", UtcError::kNotATime, 0, ""},
        {"2026-13-01T00:00:00Z", UtcError::kNotATime, 0, ""},
        {"2026-12-06T24:00:00Z", UtcError::kNotATime, 0, ""},
        {"2026-12-06T20:15:00.Z", UtcError::kNotATime, 0, ""},
        {"2026-12-06", UtcError::kNotATime, 0, ""},
        {"2026-12-06T20:15:00Z+1", UtcError::kNotATime, 0, ""},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(test.text);
        const corbel::UtcParse parsed = corbel::parseUtc(test.text);
        EXPECT_EQ(parsed.error, test.error);
        if (test.error == UtcError::kNone) {
            ASSERT_TRUE(parsed.time);
            EXPECT_EQ(parsed.time->seconds, test.seconds);
            EXPECT_EQ(corbel::formatUtc(*parsed.time), test.printed);
        }
    }
    EXPECT_EQ(corbel::lastPtpTime(), "8921556-12-07T10:44:15Z");
    // Before 1970 still prints (the host's epoch is 1904).
    EXPECT_EQ(corbel::formatUtc({0, 0}), "1904-01-01T00:00:00Z");
}

}  // namespace
