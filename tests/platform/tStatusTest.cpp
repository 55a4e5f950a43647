#include "platform/tStatus.h"

#include <gtest/gtest.h>

#include <cstring>

namespace {

// An error replaces success or a warning; a warning replaces success only; the first
// error stays, with its details.
TEST(tStatusTest, TheFirstErrorWinsOverWarningsAndLaterErrors) {
    tStatus status;
    EXPECT_TRUE(status.succeeded());
    EXPECT_TRUE(status.set(5, "c", "f", 1));
    EXPECT_FALSE(status.set(7, "c", "f", 2));
    EXPECT_EQ(status.code, 5);
    EXPECT_TRUE(status.set(-52000, "qvptp3u", "first.cpp", 10));
    EXPECT_FALSE(status.set(-52012, "other", "second.cpp", 20));
    EXPECT_FALSE(status.set(0, "c", "f", 4));
    EXPECT_FALSE(status.set(9, "c", "f", 5));
    EXPECT_EQ(status.code, -52000);
    EXPECT_STREQ(status.component, "qvptp3u");
    EXPECT_STREQ(status.file, "first.cpp");
    EXPECT_EQ(status.line, 10U);

    status.extension[0] = 99;
    status.reset();
    EXPECT_EQ(status.code, 0);
    EXPECT_STREQ(status.component, "");
    EXPECT_STREQ(status.file, "");
    EXPECT_EQ(status.line, 0U);
    EXPECT_EQ(status.extension[0], 0U);
}

TEST(tStatusTest, LongNamesAreCutAndTerminated) {
    tStatus status;
    status.set(-1, "qvptpmgmt3u", std::string(150, 'f').c_str(), 1);
    EXPECT_STREQ(status.component, "qvptpmgmt");
    EXPECT_EQ(std::strlen(status.file), 100U);
}

// A caller with an older, shorter record gets the code only, and gives the code only.
TEST(tStatusTest, AShortRecordCarriesTheCodeOnly) {
    tStatus status;
    status.structSize = 8;
    EXPECT_TRUE(status.set(-52003, "qvptp3u", "x.cpp", 9));
    EXPECT_EQ(status.code, -52003);
    EXPECT_STREQ(status.component, "");
    EXPECT_EQ(status.line, 0U);

    tStatus full;
    full.merge(status);
    EXPECT_EQ(full.code, -52003);
    EXPECT_STREQ(full.component, "");
}

TEST(tStatusTest, MergeFollowsTheRecordingRuleAndCopiesExtensions) {
    tStatus other;
    other.set(-52009, "qvptp3u", "net.cpp", 42);
    other.extension[3] = 7;
    tStatus status;
    status.merge(other);
    EXPECT_EQ(status.code, -52009);
    EXPECT_STREQ(status.file, "net.cpp");
    EXPECT_EQ(status.extension[3], 7U);

    tStatus later;
    later.set(-52003, "x", "y", 1);
    status.merge(later);
    EXPECT_EQ(status.code, -52009);
}

}  // namespace
