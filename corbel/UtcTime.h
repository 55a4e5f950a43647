#ifndef QV_CORBEL_UTCTIME_H
#define QV_CORBEL_UTCTIME_H

#include <qv1588/corbel.h>

#include <optional>
#include <string>
#include <string_view>

namespace corbel {

// ISO 8601 in UTC, e.g. "2026-12-06T20:15:00Z"; a fraction of the second shows as
// nanoseconds.
std::string formatUtc(const kxSysAttrTimestampUTC& time);

// "YYYY-MM-DDTHH:MM:SS[.digits][Z]" (a space may stand for the "T"), always UTC; nothing
// when the text is not such a time.
std::optional<kxSysAttrTimestampUTC> parseUtc(std::string_view text);

}  // namespace corbel

#endif
