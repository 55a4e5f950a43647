#include "platform/tThreadController.h"

#include <gtest/gtest.h>

#include <atomic>
#include <regex>
#include <string>

#include "platform/tTrace.h"
#include "tests/support/TraceCapture.h"

using nQVPTPMGMT000::nQVTARN000::iThread;
using nQVPTPMGMT000::nQVTARN000::tThreadController;

namespace {

// Runs until released, then records `result`.
class tGatedRunnable : public iThread {
  public:
    explicit tGatedRunnable(std::int32_t result = 0) : result_(result) {}
    void run(tStatus& status) override {
        started = true;
        while (!released) {
            std::this_thread::yield();
        }
        if (result_ != 0) {
            QV_STATUS_SET(status, result_, kComponentMgmt);
        }
        runs++;
    }
    std::atomic<bool> started{false};
    std::atomic<bool> released{false};
    std::atomic<int> runs{0};

  private:
    std::int32_t result_;
};

std::string traced(const tThreadController& controller) {
    qvtest::RecordingDestination destination;
    nQVTARN000::tTrace trace(&destination);
    trace.append(controller).endLine();
    return destination.text();
}

TEST(tThreadControllerTest, OneThreadAtATimeRunningUntilJoinedThenStartsAgain) {
    tGatedRunnable runnable;
    tThreadController controller;
    tStatus status;
    controller.start(&runnable, status);
    ASSERT_EQ(status.code, 0);
    controller.start(&runnable, status);
    EXPECT_EQ(status.code, kStatusAlreadyRunning);
    EXPECT_STREQ(status.file, "tThreadController");
    runnable.released = true;
    while (runnable.runs.load() == 0) {
        std::this_thread::yield();
    }
    EXPECT_TRUE(controller.isRunning());
    controller.join();
    EXPECT_FALSE(controller.isRunning());
    EXPECT_EQ(runnable.runs.load(), 1);  // the running thread was left alone
    status.reset();
    controller.start(&runnable, status);
    controller.join();
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(runnable.runs.load(), 2);
}

TEST(tThreadControllerTest, ExitCodeIsTheRecordedErrorOrZero) {
    tThreadController controller;
    tStatus status;
    tGatedRunnable aborted(kStatusAborted);
    aborted.released = true;
    controller.start(&aborted, status);
    controller.join();
    EXPECT_EQ(controller.exitCode(), kStatusAborted);

    tGatedRunnable warning(5);
    warning.released = true;
    controller.start(&warning, status);
    controller.join();
    EXPECT_EQ(controller.exitCode(), 0);
    EXPECT_EQ(status.code, 0);  // the thread's record is its own
}

TEST(tThreadControllerTest, TraceNamesStateAndPriority) {
    tThreadController controller;
    EXPECT_TRUE(std::regex_match(
        traced(controller),
        std::regex(R"(tThreadController \(\*0x[0-9a-f]{16}\) ID 0x00000000 is not running\.\n)")));
    tGatedRunnable runnable;
    tStatus status;
    controller.start(&runnable, status);
    while (!runnable.started) {
        std::this_thread::yield();
    }
    EXPECT_TRUE(std::regex_match(
        traced(controller), std::regex(R"(tThreadController \(\*0x[0-9a-f]{16}\) ID 0x[0-9a-f]{8} )"
                                       R"(is running at default priority\.\n)")));
    runnable.released = true;
    controller.join();  // before the runnable, declared later, goes
}

TEST(tThreadControllerTest, DestructorWaitsForTheThread) {
    tGatedRunnable runnable;
    {
        tThreadController controller;
        tStatus status;
        controller.start(&runnable, status);
        runnable.released = true;
    }
    EXPECT_EQ(runnable.runs.load(), 1);
}

}  // namespace
