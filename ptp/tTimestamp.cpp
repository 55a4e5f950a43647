#include "ptp/tTimestamp.h"

#include <cinttypes>

#include "platform/tTrace.h"

namespace nQVPTP000 {

void tTimestamp::trace(nQVTARN000::tTrace& trace) const {
    trace.appendFormatted("secondsField: %" PRIu64, secondsField_);
    trace.appendFormatted(" nanosecondsField: %u", nanosecondsField_);
}

void tTimestamp::serialize(iSerializableTarget& target, tStatus& status) const {
    target.writeUInteger48(secondsField_, status);
    target.writeUInteger32(nanosecondsField_, status);
}

void tTimestamp::deserialize(iSerializableTarget& source, tStatus& status) {
    source.readUInteger48(secondsField_, status);
    source.readUInteger32(nanosecondsField_, status);
}

}  // namespace nQVPTP000
