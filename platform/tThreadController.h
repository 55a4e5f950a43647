#ifndef QV_PLATFORM_TTHREADCONTROLLER_H
#define QV_PLATFORM_TTHREADCONTROLLER_H

#include <pthread.h>

#include <atomic>
#include <cstdint>

#include "platform/iThread.h"
#include "platform/iTraceable.h"
#include "platform/tStatus.h"

namespace nQVPTPMGMT000::nQVTARN000 {

// Starts an iThread on a thread of its own and waits for it. Life: idle -> start ->
// running -> (the runnable's run returns; still "running" until joined) -> join -> idle.
//
// The thread is created at the normal priority (the default time-sharing policy) in one
// step, so there is no thread that exists while its controller counts it as not running.
// The owner stops the runnable and joins before destroying it; should it not, the
// destructor joins, because the thread uses the controller and the runnable until it ends.
class tThreadController : public ::nQVTARN000::iTraceable {
  public:
    tThreadController() = default;
    ~tThreadController() override;
    tThreadController(const tThreadController&) = delete;
    tThreadController& operator=(const tThreadController&) = delete;

    // While running records -52016; a thread that cannot be created records -52008.
    // Skipped when the status holds an error. `runnable` is not owned.
    void start(iThread* runnable, tStatus& status);
    // Waits without limit for the thread to end; does nothing when none was started.
    void join();

    bool isRunning() const { return running_; }
    // The thread's exit code, valid after join: the code that run recorded when negative,
    // otherwise 0.
    std::int32_t exitCode() const { return exitCode_.load(); }

    void trace(::nQVTARN000::tTrace& trace) const override;

  private:
    static void* threadMain(void* controller);
    const char* priorityText(char* buffer, std::size_t size) const;

    std::atomic<std::uint32_t> threadId_{0};  // kernel id, published by the thread itself
    iThread* runnable_ = nullptr;             // not owned
    pthread_t threadHandle_{};
    bool running_ = false;      // started and not yet joined; owner's thread only
    bool handleValid_ = false;  // threadHandle_ names a thread not yet joined
    std::atomic<std::int32_t> exitCode_{0};
};

}  // namespace nQVPTPMGMT000::nQVTARN000

#endif
