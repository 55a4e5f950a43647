#include <gtest/gtest.h>

#include <string>

#include "platform/tStatusReason.h"

namespace {

TEST(StatusReason, AClockTextIsCutAndANewCodeForgetsTheReason) {
    tStatus status;
    tStatusReason::refused(status, 0x0006, "ignored: nothing failed");
    EXPECT_EQ(tStatusReason::kindOf(status), tStatusReason::tKind::kNone);
    status.set(kStatusNoData, "c", "f", 1);
    tStatusReason::refused(status, 0x1234, std::string(100, 'x'));
    EXPECT_EQ(tStatusReason::textOf(status), std::string(63, 'x'));
    EXPECT_EQ(tStatusReason::describe(status).substr(0, 42),
              "refused by the clock: error 0x1234 (xxxxxx");
    status.reset();
    status.set(kStatusNoData, "c", "f", 2);
    EXPECT_EQ(tStatusReason::describe(status), "");
}

}  // namespace
