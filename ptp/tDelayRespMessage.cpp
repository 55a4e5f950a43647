#include "ptp/tDelayRespMessage.h"

#include "platform/tTrace.h"

namespace nQVPTP000 {

tDelayRespMessage::tDelayRespMessage(std::unique_ptr<tMessageHeader> header,
                                     iSerializableTarget& source, tStatus& status)
    : tPTPMessage(std::move(header), status) {
    deserializeBody(source, status);
    deserializeSuffix(source, status);
}

std::uint16_t tDelayRespMessage::getSize() const {
    return sizeWithBody(static_cast<std::uint16_t>(receiveTimestamp_.getSize() +
                                                   requestingPortIdentity_.getSize()));
}

void tDelayRespMessage::trace(nQVTARN000::tTrace& trace) const {
    trace.append("--- Begin Delay_Resp Message ---\n");
    traceHeader(trace);
    trace.append("receiveTimestamp: ").append(receiveTimestamp_);
    trace.append(" requestingPortIdentity: ").append(requestingPortIdentity_);
    traceSuffix(trace);
    trace.append("--- End Delay_Resp Message ---\n");
}

void tDelayRespMessage::deserializeBody(iSerializableTarget& source, tStatus& status) {
    receiveTimestamp_.deserialize(source, status);
    requestingPortIdentity_.deserialize(source, status);
}

void tDelayRespMessage::serializeBody(iSerializableTarget& target, tStatus& status) const {
    receiveTimestamp_.serialize(target, status);
    requestingPortIdentity_.serialize(target, status);
}

}  // namespace nQVPTP000
