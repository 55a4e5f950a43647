#include "ptp/tSignalingMessage.h"

#include "platform/tTrace.h"

namespace nQVPTP000 {

tSignalingMessage::tSignalingMessage(std::unique_ptr<tMessageHeader> header,
                                     iSerializableTarget& source, tStatus& status)
    : tPTPMessage(std::move(header), status) {
    deserializeBody(source, status);
    deserializeSuffix(source, status);
}

void tSignalingMessage::trace(nQVTARN000::tTrace& trace) const {
    trace.append("--- Begin Signaling Message ---\n");
    traceHeader(trace);
    trace.append("targetPortIdentity: ").append(targetPortIdentity_);
    traceSuffix(trace);
    trace.append("--- End Signaling Message ---\n");
}

void tSignalingMessage::deserializeBody(iSerializableTarget& source, tStatus& status) {
    targetPortIdentity_.deserialize(source, status);
}

void tSignalingMessage::serializeBody(iSerializableTarget& target, tStatus& status) const {
    targetPortIdentity_.serialize(target, status);
}

}  // namespace nQVPTP000
