#include <windows.h>

#include <cinttypes>
#include <cstdio>

#include "platform/tThreadController.h"
#include "platform/tTrace.h"

namespace nQVPTPMGMT000::nQVTARN000 {

// Windows backend: the POSIX threads of the MinGW run-time, with the system's thread ids
// and priority levels.

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
    if (runnable == nullptr || pthread_create(&threadHandle_, nullptr, &threadMain, this) != 0) {
        status.set(kStatusOsObjectError, kComponentMgmt, "thread", __LINE__);
        return;
    }
    handleValid_ = true;
    running_ = true;
    // A thread starts at its creator's priority; this one runs at the normal priority.
    const HANDLE thread = pthread_gethandle(threadHandle_);
    if (GetThreadPriority(thread) != THREAD_PRIORITY_NORMAL &&
        SetThreadPriority(thread, THREAD_PRIORITY_NORMAL) == 0) {
        status.set(kStatusOsObjectError, kComponentMgmt, "thread", __LINE__);
    }
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
    self->threadId_.store(GetCurrentThreadId());
    tStatus status;
    self->runnable_->run(status);
    self->exitCode_.store(status.code < 0 ? status.code : 0);
    return nullptr;
}

const char* tThreadController::priorityText(char* buffer, std::size_t size) const {
    const int priority =
        handleValid_ ? GetThreadPriority(pthread_gethandle(threadHandle_)) : THREAD_PRIORITY_NORMAL;
    switch (priority) {
        case THREAD_PRIORITY_IDLE:
            return "lowest priority.";
        case THREAD_PRIORITY_LOWEST:
            return "low priority.";
        case THREAD_PRIORITY_NORMAL:
            return "default priority.";
        case THREAD_PRIORITY_HIGHEST:
            return "high priority.";
        case THREAD_PRIORITY_TIME_CRITICAL:
            return "highest priority.";
        default:
            break;
    }
    std::snprintf(buffer, size, "unknown priority: 0x%08X.", static_cast<unsigned>(priority));
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
