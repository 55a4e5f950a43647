#include "corbel/serve/EventLog.h"

namespace corbel {

void EventLog::add(Event event) {
    const std::lock_guard guard(lock_);
    event.id = ++lastId_;
    events_.push_back(std::move(event));
    if (events_.size() > kKept) {
        events_.pop_front();
    }
}

std::vector<Event> EventLog::after(std::uint64_t since, std::uint64_t& last) const {
    const std::lock_guard guard(lock_);
    last = lastId_;
    std::vector<Event> result;
    for (const Event& event : events_) {
        if (event.id > since) {
            result.push_back(event);
        }
    }
    return result;
}

}  // namespace corbel
