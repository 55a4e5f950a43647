#ifndef QV_CORBEL_SERVE_EVENTLOG_H
#define QV_CORBEL_SERVE_EVENTLOG_H

#include <cstdint>
#include <deque>
#include <mutex>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

#include "corbel/serve/WallTime.h"

namespace corbel {

// Something that happened to a clock: "appeared", "vanished", "portState", "grandmaster",
// "written", "refused".
struct Event {
    std::uint64_t id = 0;  // increasing from 1
    WallTime time;
    std::string item, kind;
    std::string message;  // in English
    nlohmann::ordered_json detail;
};

// The last kKept events. Added to by the poller, read by HTTP workers.
class EventLog {
  public:
    static constexpr std::size_t kKept = 1000;

    void add(Event event);
    // The events after `since`, oldest first; `last` becomes the id of the newest event
    // kept (0 when there has been none).
    std::vector<Event> after(std::uint64_t since, std::uint64_t& last) const;

  private:
    mutable std::mutex lock_;
    std::deque<Event> events_;  // guarded by lock_
    std::uint64_t lastId_ = 0;  // guarded by lock_
};

}  // namespace corbel

#endif
