#include "ptp/tSyncMessage.h"

#include "platform/tTrace.h"

namespace nQVPTP000 {

tSyncMessage::tSyncMessage(std::unique_ptr<tMessageHeader> header, iSerializableTarget& source,
                           tStatus& status)
    : tPTPMessage(std::move(header), status) {
    deserializeBody(source, status);
    deserializeSuffix(source, status);
}

void tSyncMessage::trace(nQVTARN000::tTrace& trace) const {
    trace.append("--- Begin Sync Message ---\n");
    traceHeader(trace);
    trace.append("originTimestamp: ").append(originTimestamp_);
    trace.append("\n");
    traceSuffix(trace);
    trace.append("--- End Sync Message ---\n");
}

void tSyncMessage::deserializeBody(iSerializableTarget& source, tStatus& status) {
    originTimestamp_.deserialize(source, status);
}

void tSyncMessage::serializeBody(iSerializableTarget& target, tStatus& status) const {
    originTimestamp_.serialize(target, status);
}

}  // namespace nQVPTP000
