#include "platform/tMutex.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>

using nQVPTPMGMT000::nQVTARN000::tMutex;

TEST(tMutexTest, LockIsSkippedAfterAnError) {
    tStatus status;
    tMutex mutex;
    mutex.create(status);
    QV_STATUS_SET(status, kStatusNoData, kComponentMgmt);
    { const tMutex::tGuard guard(mutex, status); }
    // Another thread can take it: the skipped lock was not taken.
    std::thread other([&mutex] {
        tStatus own;
        const tMutex::tGuard guard(mutex, own);
        EXPECT_EQ(own.code, 0);
    });
    other.join();
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST(tMutexTest, UnlockByAnotherThreadDoesNotReleaseTheOwner) {
    tStatus status;
    tMutex mutex;
    mutex.create(status);
    mutex.lock(status);
    std::thread([&mutex] {
        tStatus own;
        mutex.unlock(own);
    }).join();
    std::atomic<bool> taken{false};
    std::thread waiter([&] {
        tStatus own;
        const tMutex::tGuard guard(mutex, own);
        taken = true;
    });
    std::this_thread::sleep_for(std::chrono::milliseconds(50));
    EXPECT_FALSE(taken.load());
    mutex.unlock(status);
    waiter.join();
    EXPECT_TRUE(taken.load());
}

TEST(tMutexTest, FailuresAreRecordedAsLockErrors) {
    tStatus status;
    tMutex never;
    never.lock(status);
    EXPECT_EQ(status.code, kStatusLockError);
    EXPECT_STREQ(status.component, "qvptpmgmt");
    EXPECT_STREQ(status.file, "synchronization");

    tStatus again;
    tMutex mutex;
    mutex.create(again);
    mutex.lock(again);
    mutex.lock(again);  // the same thread would wait for itself
    EXPECT_EQ(again.code, kStatusLockError);
    mutex.unlock(again);
}
