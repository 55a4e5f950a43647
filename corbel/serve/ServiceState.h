#ifndef QV_CORBEL_SERVE_SERVICESTATE_H
#define QV_CORBEL_SERVE_SERVICESTATE_H

#include <memory>
#include <mutex>

#include "corbel/serve/EventLog.h"
#include "corbel/serve/ServiceCounters.h"
#include "corbel/serve/Snapshot.h"

namespace corbel {

// What the poller publishes and the HTTP workers read. A snapshot is swapped whole under a
// short lock, so that a reader never sees one half updated and never waits for a read.
class ServiceState {
  public:
    ServiceState() : snapshot_(std::make_shared<const Snapshot>()) {}

    std::shared_ptr<const Snapshot> snapshot() const;
    void publish(std::shared_ptr<const Snapshot> snapshot);

    EventLog& events() { return events_; }
    const EventLog& events() const { return events_; }
    ServiceCounters& counters() { return counters_; }
    const ServiceCounters& counters() const { return counters_; }

  private:
    mutable std::mutex lock_;
    std::shared_ptr<const Snapshot> snapshot_;  // guarded by lock_
    EventLog events_;                           // locks itself
    ServiceCounters counters_;                  // atomic counts
};

}  // namespace corbel

#endif
