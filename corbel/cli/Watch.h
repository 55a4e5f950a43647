#ifndef QV_CORBEL_CLI_WATCH_H
#define QV_CORBEL_CLI_WATCH_H

#include <chrono>
#include <string>
#include <vector>

#include "corbel/cli/CommandContext.h"
#include "corbel/cli/WatchView.h"

namespace corbel {

// corbel watch: discovers once, then reads every clock each interval and shows the sample;
// rediscovers on a longer period to notice clocks that appear. A clock that stops
// answering is asked again only at the next rediscovery, since each unanswered request
// waits the expert's whole exchange time-out. Runs on the calling thread; Ctrl-C
// (StopSignal) ends it between two steps.
class Watch {
  public:
    Watch(const CommandContext& context, const Options& options);

    // The clocks to watch: the named ones, or every one discovered.
    ExitCode start(const std::vector<std::string>& items);
    ExitCode run();

  private:
    void rediscover();
    void sample();
    void show(unsigned number) const;
    // Sleeps until `until`, waking early for Ctrl-C.
    static void sleepUntil(std::chrono::steady_clock::time_point until);

    const CommandContext& context_;
    const Options& options_;
    const bool live_;
    bool named_ = false;
    std::vector<WatchedClock> clocks_;
};

}  // namespace corbel

#endif
