#ifndef QV_CORBEL_SERVE_CLOCKSOURCE_H
#define QV_CORBEL_SERVE_CLOCKSOURCE_H

#include <qv1588/qv1588.h>

#include <map>
#include <string>
#include <vector>

#include "corbel/FailureCause.h"
#include "corbel/PropertyValue.h"
#include "corbel/TagCatalog.h"

namespace corbel {

// One read of a clock port: the values it gave and, for each tag it did not give, why.
struct ClockReading {
    PropertyValues values;
    std::map<kxSysAttributeTagID, FailureCause> unread;
    std::vector<FailureCause> failedExchanges;   // one per request that failed
    std::vector<std::size_t> unsupportedGroups;  // ReadGroups indexes the clock refused for good
    bool answered = false;                       // the clock answered at least one request
};

struct DiscoveryOutcome {
    std::vector<std::string> items;  // every port known, in item-name order
    std::vector<FailureCause> failedExchanges;
};

// One value to write, of the tag's own type.
struct Setting {
    const TagInfo* tag;
    PropertyValue value;
};

// What a write did. rejected: the expert's validation refused values and nothing was sent;
// refused: the clock refused (or did not answer) `refusedTag` part-way.
struct WriteOutcome {
    enum class Result { written, rejected, refused };
    Result result = Result::written;
    std::map<std::string, std::string> sentences;  // by setting name, when rejected
    std::vector<std::string> written, notSent;     // setting names
    std::string refusedTag, reason;
    std::vector<FailureCause> failedExchanges;
};

// What the poller needs of the expert. The poller's thread is the only caller.
class ClockSource {
  public:
    virtual ~ClockSource() = default;

    // Runs a discovery; the ports of every discovery so far.
    virtual DiscoveryOutcome discover() = 0;
    // Reads every group of `item` but those in `skipGroups` (ReadGroups indexes); the base
    // values too when `withBase`.
    virtual ClockReading read(const std::string& item, const std::vector<std::size_t>& skipGroups,
                              bool withBase) = 0;
    // Validates `settings`, then writes them in ascending tag order.
    virtual WriteOutcome write(const std::string& item, const std::vector<Setting>& settings) = 0;
};

}  // namespace corbel

#endif
