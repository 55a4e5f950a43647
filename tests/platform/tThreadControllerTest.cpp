#include "platform/tThreadController.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>

using nQVPTPMGMT000::nQVTARN000::iThread;
using nQVPTPMGMT000::nQVTARN000::tThreadController;

namespace {

// Runs until released.
struct tGatedRunnable : iThread {
    void run(tStatus&) override {
        while (!released) {
            std::this_thread::yield();
        }
        runs++;
    }
    std::atomic<bool> released{false};
    std::atomic<int> runs{0};
};

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

}  // namespace
