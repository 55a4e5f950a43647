#ifndef QV_CORBEL_SERVE_APIJSON_H
#define QV_CORBEL_SERVE_APIJSON_H

#include <nlohmann/json.hpp>
#include <vector>

#include "corbel/serve/EventLog.h"
#include "corbel/serve/Snapshot.h"

namespace corbel {

// The JSON documents of the HTTP API, key order as documented in README.md.

// {"item", "clockIdentity", "domain", "present", "lastSeen", "lastRead", "lastReadOk",
// "values"}: the key values only, or every value the last read gave (`allValues`).
nlohmann::ordered_json clockJson(const ClockStatus& clock, bool allValues);

// {"item", "interval", "samples": [{"time", "t", "offsetFromMaster", "meanPathDelay",
// "portState"}...]}, oldest first.
nlohmann::ordered_json historyJson(const ClockStatus& clock, long intervalSeconds);

// {"id", "time", "item", "kind", "message", "detail"}.
nlohmann::ordered_json eventJson(const Event& event);

// What a write did: {"written", "refused": null or {"name", "reason"}, "notSent"}, or
// {"sentences": {NAME: SENTENCE}} when validation rejected it.
nlohmann::ordered_json writeJson(const WriteOutcome& outcome);

}  // namespace corbel

#endif
