#ifndef QV_CORBEL_SERVE_POLLER_H
#define QV_CORBEL_SERVE_POLLER_H

#include <chrono>
#include <condition_variable>
#include <deque>
#include <future>
#include <map>
#include <mutex>
#include <string>
#include <thread>
#include <vector>

#include "corbel/serve/ClockSource.h"
#include "corbel/serve/ServiceState.h"
#include "corbel/serve/SettingsWriter.h"

namespace corbel {

struct PollTiming {
    std::chrono::seconds interval{1};     // between two reads of every clock
    std::chrono::seconds rediscover{30};  // between two discoveries
};

// The one thread that talks to the clocks: it discovers on start and every `rediscover`,
// reads every clock every `interval`, keeps each clock's history, notes what changed as
// events and publishes a new snapshot after each round. Writes are queued to it and done
// between two clock reads, so that the wire sees one exchange at a time.
//
// A clock that stops answering is "vanished" and asked again only after the next
// discovery: each request to it waits the expert's whole exchange time-out.
class Poller final : public SettingsWriter {
  public:
    Poller(ClockSource& source, ServiceState& state, PollTiming timing);
    ~Poller() override;
    Poller(const Poller&) = delete;
    Poller& operator=(const Poller&) = delete;

    void start();
    // Ends the thread after the exchange under way; writes still queued are refused.
    void stop();

    // Validates and writes `settings` to `item` on the poller's thread; waits for it. The
    // clock is read again at once, and the write is added to the events.
    WriteOutcome write(const std::string& item, std::vector<Setting> settings) override;

  private:
    struct Tracked {
        ClockStatus status;
        std::vector<std::size_t> unsupported;  // groups the clock does not serve
        bool baseRead = false;
    };
    struct WriteJob {
        std::string item;
        std::vector<Setting> settings;
        std::promise<WriteOutcome> done;
    };

    void run();
    bool stopping();
    void discover();
    void readAll(bool withVanished);
    void read(Tracked& clock);
    void merge(Tracked& clock, ClockReading& reading, WallTime now);
    void noteChanges(const ClockStatus& before, const ClockStatus& after, WallTime now);
    void addEvent(const std::string& item, const char* kind, std::string message,
                  nlohmann::ordered_json detail, WallTime now);
    void serveWrites();
    void serve(WriteJob& job);
    void countFailures(const std::vector<FailureCause>& failures);
    void publish();

    ClockSource& source_;
    ServiceState& state_;
    const PollTiming timing_;
    // The poller thread's own: the clocks by item name and the last discovery.
    std::map<std::string, Tracked> clocks_;
    std::optional<DiscoveryStatus> discovery_;
    std::optional<double> roundSeconds_;

    std::mutex lock_;
    std::condition_variable wake_;
    std::deque<WriteJob> writes_;  // guarded by lock_
    bool stopping_ = false;        // guarded by lock_
    std::thread thread_;
};

}  // namespace corbel

#endif
