#ifndef QV_CORBEL_SERVE_WALLTIME_H
#define QV_CORBEL_SERVE_WALLTIME_H

#include <chrono>
#include <cstdint>
#include <string>

namespace corbel {

using WallTime = std::chrono::system_clock::time_point;

// ISO 8601 in UTC to the millisecond, through the formatter of every corbel face.
std::string isoTime(WallTime time);

std::int64_t unixMilliseconds(WallTime time);

}  // namespace corbel

#endif
