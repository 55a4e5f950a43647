#ifndef QV_EXPERT_CKXDATETIMEFIELDS_H
#define QV_EXPERT_CKXDATETIMEFIELDS_H

#include "qv1588/corbel.h"

// The six fields of a local date and time that a bag exchanges with the host (year, month
// 1 to 12, day 1 to 31, hour, minute, second) against the stored timestamp.
class CkxDateTimeFields {
  public:
    static constexpr int kCount = 6;

    // The all-zero timestamp for a year before 1904, for a field outside its range and for a
    // time that the local-time conversion refuses (at or before 1970-01-01 00:00:00 UTC).
    static kxSysAttrTimestampUTC toTimestamp(const LONG* fields);
    // The local time of the timestamp; six -1 for the all-zero timestamp and for a time
    // that the local calendar cannot show.
    static void toFields(const kxSysAttrTimestampUTC& timestamp, LONG* fields);
};

#endif
