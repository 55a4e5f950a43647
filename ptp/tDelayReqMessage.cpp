#include "ptp/tDelayReqMessage.h"

#include "platform/tTrace.h"

namespace nQVPTP000 {

tDelayReqMessage::tDelayReqMessage(std::unique_ptr<tMessageHeader> header,
                                   iSerializableTarget& source, tStatus& status)
    : tPTPMessage(std::move(header), status) {
    deserializeBody(source, status);
    deserializeSuffix(source, status);
}

void tDelayReqMessage::trace(nQVTARN000::tTrace& trace) const {
    trace.append("--- Begin Delay_Req Message ---\n");
    traceHeader(trace);
    trace.append("originTimestamp: ").append(originTimestamp_);
    traceSuffix(trace);
    trace.append("--- End Delay_Req Message ---\n");
}

void tDelayReqMessage::deserializeBody(iSerializableTarget& source, tStatus& status) {
    originTimestamp_.deserialize(source, status);
}

void tDelayReqMessage::serializeBody(iSerializableTarget& target, tStatus& status) const {
    originTimestamp_.serialize(target, status);
}

}  // namespace nQVPTP000
