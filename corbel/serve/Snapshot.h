#ifndef QV_CORBEL_SERVE_SNAPSHOT_H
#define QV_CORBEL_SERVE_SNAPSHOT_H

#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "corbel/serve/ClockSource.h"
#include "corbel/serve/History.h"
#include "corbel/serve/WallTime.h"

namespace corbel {

// A clock port as the poller last saw it.
struct ClockStatus {
    std::string item;           // "02-11-22-FF-FE-33-44-55:1"
    std::string clockIdentity;  // "02-11-22-FF-FE-33-44-55"
    bool present = true;        // false once it stopped answering ("vanished")
    WallTime lastSeen{};        // the last time it answered
    std::optional<WallTime> lastRead;
    bool lastReadOk = false;  // the last read had an answer for every group it asked
    PropertyValues values;    // the base values and every value of the last read
    std::map<kxSysAttributeTagID, FailureCause> unread;
    std::shared_ptr<History> history;  // shared with the poller, which appends to it

    std::optional<std::uint32_t> domain() const;
    // The value of `tag`, when it was read and is of type `T`.
    template <typename T>
    const T* value(kxSysAttributeTagID tag) const {
        const auto found = values.find(tag);
        return found == values.end() ? nullptr : std::get_if<T>(&found->second);
    }
};

struct DiscoveryStatus {
    WallTime time;
    double durationSeconds;
    std::size_t clocks;
};

// What the HTTP workers read: published whole by the poller and never changed after.
struct Snapshot {
    std::optional<DiscoveryStatus> discovery;  // the last one; none before the first ends
    std::optional<double> roundSeconds;        // how long the last round of reads took
    std::vector<ClockStatus> clocks;           // in item-name order

    // By item name in any case; null when there is none.
    const ClockStatus* find(std::string_view item) const;
};

}  // namespace corbel

#endif
