#include "platform/tMutex.h"

#include <new>
#include <system_error>

namespace nQVPTPMGMT000::nQVTARN000 {

void tMutex::create(tStatus& status) {
    if (status.failed() || lock_ != nullptr) {
        return;
    }
    try {
        lock_ = std::make_unique<std::mutex>();
    } catch (const std::bad_alloc&) {
        status.set(kStatusNoMemory, kComponentMgmt, kSource, __LINE__);
    }
}

void tMutex::lock(tStatus& status) {
    if (status.failed()) {
        return;
    }
    const std::thread::id self = std::this_thread::get_id();
    if (lock_ == nullptr || owner_.load() == self) {
        status.set(kStatusLockError, kComponentMgmt, kSource, __LINE__);
        return;
    }
    try {
        lock_->lock();
    } catch (const std::system_error&) {
        status.set(kStatusLockError, kComponentMgmt, kSource, __LINE__);
        return;
    }
    owner_.store(self);
}

void tMutex::unlock(tStatus&) {
    if (lock_ == nullptr || owner_.load() != std::this_thread::get_id()) {
        return;
    }
    owner_.store(std::thread::id());
    lock_->unlock();
}

}  // namespace nQVPTPMGMT000::nQVTARN000
