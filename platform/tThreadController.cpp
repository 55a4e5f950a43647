#include "platform/tThreadController.h"

#include <sched.h>
#include <unistd.h>

#include <cinttypes>
#include <cstdio>

#include "platform/tTrace.h"

namespace nQVPTPMGMT000::nQVTARN000 {

namespace {

// Thread creation attributes, destroyed on every path.
class tThreadAttributes {
  public:
    tThreadAttributes() { valid_ = pthread_attr_init(&attributes_) == 0; }
    ~tThreadAttributes() {
        if (valid_) {
            pthread_attr_destroy(&attributes_);
        }
    }
    tThreadAttributes(const tThreadAttributes&) = delete;
    tThreadAttributes& operator=(const tThreadAttributes&) = delete;

    // The normal priority: time-sharing policy, static priority 0, not inherited from the
    // creator (which might run at another priority).
    bool setNormalPriority() {
        sched_param normal{};
        normal.sched_priority = 0;
        return valid_ && pthread_attr_setinheritsched(&attributes_, PTHREAD_EXPLICIT_SCHED) == 0 &&
               pthread_attr_setschedpolicy(&attributes_, SCHED_OTHER) == 0 &&
               pthread_attr_setschedparam(&attributes_, &normal) == 0;
    }
    const pthread_attr_t* get() const { return &attributes_; }

  private:
    pthread_attr_t attributes_{};
    bool valid_ = false;
};

}  // namespace

tThreadController::~tThreadController() {
    join();
}

void tThreadController::start(iThread* runnable, tStatus& status) {
    if (running_) {
        status.set(kStatusAlreadyRunning, kComponentMgmt, "tThreadController", __LINE__);
        return;
    }
    if (status.failed()) {
        return;
    }
    runnable_ = runnable;
    exitCode_.store(0);
    threadId_.store(0);
    tThreadAttributes attributes;
    if (runnable == nullptr || !attributes.setNormalPriority() ||
        pthread_create(&threadHandle_, attributes.get(), &threadMain, this) != 0) {
        status.set(kStatusOsObjectError, kComponentMgmt, "thread", __LINE__);
        return;
    }
    handleValid_ = true;
    running_ = true;
}

void tThreadController::join() {
    if (handleValid_) {
        pthread_join(threadHandle_, nullptr);
        handleValid_ = false;
        threadId_.store(0);
    }
    running_ = false;
}

void* tThreadController::threadMain(void* controller) {
    auto* self = static_cast<tThreadController*>(controller);
    self->threadId_.store(static_cast<std::uint32_t>(gettid()));
    tStatus status;
    self->runnable_->run(status);
    self->exitCode_.store(status.code < 0 ? status.code : 0);
    return nullptr;
}

const char* tThreadController::priorityText(char* buffer, std::size_t size) const {
    int policy = SCHED_OTHER;
    sched_param parameters{};
    if (!handleValid_ || pthread_getschedparam(threadHandle_, &policy, &parameters) != 0) {
        return "default priority.";
    }
    // Scheduling classes in the place of the host's priority levels.
    switch (policy) {
        case SCHED_OTHER:
            return "default priority.";
        case SCHED_BATCH:
            return "low priority.";
        case SCHED_IDLE:
            return "lowest priority.";
        default:
            break;
    }
    if (parameters.sched_priority == sched_get_priority_max(policy)) {
        return "highest priority.";
    }
    std::snprintf(buffer, size, "unknown priority: 0x%08X.",
                  static_cast<unsigned>(parameters.sched_priority));
    return buffer;
}

void tThreadController::trace(::nQVTARN000::tTrace& trace) const {
    trace.appendFormatted("tThreadController (*0x%016" PRIx64 ") ",
                          static_cast<std::uint64_t>(reinterpret_cast<std::uintptr_t>(this)));
    trace.appendFormatted("ID 0x%08x ", threadId_.load());
    trace.appendFormatted("is %s", running_ ? "running at " : "not running.");
    if (running_) {
        char buffer[40];
        trace.append(priorityText(buffer, sizeof(buffer)));
    }
}

}  // namespace nQVPTPMGMT000::nQVTARN000
