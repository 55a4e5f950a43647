#ifndef QV_PLATFORM_TMUTEX_H
#define QV_PLATFORM_TMUTEX_H

#include <atomic>
#include <memory>
#include <mutex>
#include <thread>

#include "platform/tStatus.h"

namespace nQVPTPMGMT000::nQVTARN000 {

// A lock inside the process with the status-record convention of the management client:
// failures are recorded (component "qvptpmgmt3u", source "synchronization"), never thrown.
//
// Callers unlock on every path out of a locked region, also when `lock` was skipped
// because the status already held an error. The lock therefore knows its owner: `unlock`
// by a thread that does not hold it does nothing. Prefer tMutex::tGuard, which pairs them.
class tMutex {
  public:
    static constexpr const char* kSource = "synchronization";

    tMutex() = default;
    ~tMutex() = default;
    tMutex(const tMutex&) = delete;
    tMutex& operator=(const tMutex&) = delete;

    // Skipped when the status holds an error; no memory records -52000.
    void create(tStatus& status);
    bool isCreated() const { return lock_ != nullptr; }

    // Skipped when the status holds an error. A lock never created, or one that the calling
    // thread already holds (waiting would never end), records -52015.
    void lock(tStatus& status);
    // Releases the lock when the calling thread holds it; records nothing.
    void unlock(tStatus& status);

    // Locks for the life of a scope.
    class tGuard {
      public:
        tGuard(tMutex& mutex, tStatus& status) : mutex_(mutex), status_(status) {
            mutex_.lock(status_);
        }
        ~tGuard() { mutex_.unlock(status_); }
        tGuard(const tGuard&) = delete;
        tGuard& operator=(const tGuard&) = delete;

      private:
        tMutex& mutex_;
        tStatus& status_;
    };

  private:
    std::unique_ptr<std::mutex> lock_;
    // The thread that holds lock_; written only by that thread while it holds it.
    std::atomic<std::thread::id> owner_{};
};

}  // namespace nQVPTPMGMT000::nQVTARN000

#endif
