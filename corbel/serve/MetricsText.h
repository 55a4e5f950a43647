#ifndef QV_CORBEL_SERVE_METRICSTEXT_H
#define QV_CORBEL_SERVE_METRICSTEXT_H

#include <string>

#include "corbel/serve/ServiceCounters.h"
#include "corbel/serve/Snapshot.h"

namespace corbel {

// The metrics in the Prometheus text format 0.0.4, base units (seconds). Each clock's
// series carry the labels item, clock_identity and domain; a clock that vanished keeps only
// ptp_last_read_success (0), so that no old value passes for a current one.
std::string metricsText(const Snapshot& snapshot, const ServiceCounters& counters);

}  // namespace corbel

#endif
