#include "ptp/tAnnounceMessage.h"

#include "platform/tTrace.h"

namespace nQVPTP000 {

tAnnounceMessage::tAnnounceMessage(std::unique_ptr<tMessageHeader> header,
                                   iSerializableTarget& source, tStatus& status)
    : tPTPMessage(std::move(header), status) {
    deserializeBody(source, status);
    deserializeSuffix(source, status);
}

void tAnnounceMessage::trace(nQVTARN000::tTrace& trace) const {
    trace.append("--- Begin Announce Message ---\n");
    traceHeader(trace);
    trace.append("originTimestamp: ").append(originTimestamp_).append("\n");
    // The offset is shown as the unsigned value of its 32-bit sign extension.
    trace.appendFormatted("currentUTCOffset: %u\n",
                          static_cast<std::uint32_t>(std::int32_t{currentUtcOffset_}));
    trace.appendFormatted("timeSource: %u\n", timeSource_);
    trace.appendFormatted("stepsRemoved: %u\n", stepsRemoved_);
    trace.append("grandmasterIdentity: ").append(grandmasterIdentity_).append("\n");
    trace.append("grandmasterClockQuality: ").append(grandmasterClockQuality_).append("\n");
    trace.appendFormatted("grandmasterPriority1: %u\n", grandmasterPriority1_);
    trace.appendFormatted("grandmasterPriority2: %u\n", grandmasterPriority2_);
    traceSuffix(trace);
    trace.append("--- End Announce Message ---\n");
}

void tAnnounceMessage::deserializeBody(iSerializableTarget& source, tStatus& status) {
    std::uint8_t reserved = 0;
    std::uint8_t timeSource = 0;
    originTimestamp_.deserialize(source, status);
    source.readInteger16(currentUtcOffset_, status);
    source.readOctet(reserved, status);
    source.readUInteger8(grandmasterPriority1_, status);
    grandmasterClockQuality_.deserialize(source, status);
    source.readUInteger8(grandmasterPriority2_, status);
    grandmasterIdentity_.deserialize(source, status);
    source.readUInteger16(stepsRemoved_, status);
    source.readEnumeration8(timeSource, status);
    if (status.succeeded()) {
        timeSource_ = timeSource;
    }
}

void tAnnounceMessage::serializeBody(iSerializableTarget& target, tStatus& status) const {
    originTimestamp_.serialize(target, status);
    target.writeInteger16(currentUtcOffset_, status);
    target.writeOctet(0, status);
    target.writeUInteger8(grandmasterPriority1_, status);
    grandmasterClockQuality_.serialize(target, status);
    target.writeUInteger8(grandmasterPriority2_, status);
    grandmasterIdentity_.serialize(target, status);
    target.writeUInteger16(stepsRemoved_, status);
    target.writeEnumeration8(static_cast<std::uint8_t>(timeSource_), status);
}

}  // namespace nQVPTP000
