#include "ptp/tFollowUpMessage.h"

#include "platform/tTrace.h"

namespace nQVPTP000 {

tFollowUpMessage::tFollowUpMessage(std::unique_ptr<tMessageHeader> header,
                                   iSerializableTarget& source, tStatus& status)
    : tPTPMessage(std::move(header), status) {
    deserializeBody(source, status);
    deserializeSuffix(source, status);
}

void tFollowUpMessage::trace(nQVTARN000::tTrace& trace) const {
    trace.append("--- Begin Follow_Up Message ---\n");
    traceHeader(trace);
    trace.append("preciseOriginTimestamp: ").append(preciseOriginTimestamp_);
    traceSuffix(trace);
    trace.append("--- End Follow_Up Message ---\n");
}

void tFollowUpMessage::deserializeBody(iSerializableTarget& source, tStatus& status) {
    preciseOriginTimestamp_.deserialize(source, status);
}

void tFollowUpMessage::serializeBody(iSerializableTarget& target, tStatus& status) const {
    preciseOriginTimestamp_.serialize(target, status);
}

}  // namespace nQVPTP000
