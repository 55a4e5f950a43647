#ifndef QV_CORBEL_CLI_WATCHVIEW_H
#define QV_CORBEL_CLI_WATCHVIEW_H

#include <nlohmann/json.hpp>
#include <optional>
#include <string>
#include <vector>

#include "corbel/ItemReader.h"
#include "corbel/cli/CommandContext.h"

namespace corbel {

// One clock port under watch: its latest sample and what changed since the one before.
struct WatchedClock {
    ClockPort port;
    std::optional<ItemReading> last;   // none before the first sample
    std::vector<std::string> changes;  // since the sample before
    bool silent = false;               // did not answer: not asked again until the next rediscovery

    // Takes a new sample: the changes are computed against the previous one.
    void update(ItemReading reading);
    bool answered() const;
};

// What watch shows of a sample: a screen for a terminal, a line per clock for a log, an
// object per clock for a program. Values read as everywhere else (ValueWords).
class WatchView {
  public:
    // The tags read each sample (three requests per clock: port, current and parent data).
    static const std::vector<kxSysAttributeTagID>& tags();

    // The changes from `before` (none: the clock is new) to `now`.
    static std::vector<std::string> changesBetween(const ItemReading* before,
                                                   const ItemReading& now);

    static std::string screen(const std::vector<WatchedClock>& clocks, const std::string& heading);
    static std::string line(const WatchedClock& clock, const std::string& time);
    static nlohmann::ordered_json json(const WatchedClock& clock, const std::string& time);
};

}  // namespace corbel

#endif
