#include "platform/Mutex.h"

#include <map>

// Common to the POSIX and the Windows backend of Mutex.
namespace qv::dsc::osdep {

std::shared_ptr<std::mutex> Mutex::threadLockOf(const std::string& path) {
    static std::mutex guard;
    static std::map<std::string, std::weak_ptr<std::mutex>> locks;
    const std::lock_guard<std::mutex> held(guard);
    std::erase_if(locks, [](const auto& entry) { return entry.second.expired(); });
    std::weak_ptr<std::mutex>& slot = locks[path];
    std::shared_ptr<std::mutex> lock = slot.lock();
    if (!lock) {
        lock = std::make_shared<std::mutex>();
        slot = lock;
    }
    return lock;
}

}  // namespace qv::dsc::osdep
