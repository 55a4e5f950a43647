#include "tests/support/ptpmgmt/TimedDatagramQueue.h"

namespace qvtest {

void TimedDatagramQueue::push(std::vector<std::uint8_t> octets, tClock::time_point due) {
    {
        std::lock_guard<std::mutex> guard(lock_);
        datagrams_.emplace(due, std::move(octets));  // after others due at the same time
    }
    changed_.notify_all();
}

bool TimedDatagramQueue::pop(std::vector<std::uint8_t>& octets,
                             const std::function<bool()>& interrupted) {
    std::unique_lock<std::mutex> guard(lock_);
    for (;;) {
        if (interrupted()) {
            return false;
        }
        if (datagrams_.empty()) {
            changed_.wait(guard);
            continue;
        }
        const auto first = datagrams_.begin();
        if (first->first <= tClock::now()) {
            octets = std::move(first->second);
            datagrams_.erase(first);
            return true;
        }
        changed_.wait_until(guard, first->first);
    }
}

void TimedDatagramQueue::wake() {
    { std::lock_guard<std::mutex> guard(lock_); }
    changed_.notify_all();
}

void TimedDatagramQueue::clear() {
    std::lock_guard<std::mutex> guard(lock_);
    datagrams_.clear();
}

std::size_t TimedDatagramQueue::size() const {
    std::lock_guard<std::mutex> guard(lock_);
    return datagrams_.size();
}

}  // namespace qvtest
