#include "ptp/tClockQuality.h"

#include "platform/tTrace.h"

namespace nQVPTP000 {

void tClockQuality::trace(nQVTARN000::tTrace& trace) const {
    trace.appendFormatted("clockClass: %u ", clockClass);
    trace.appendFormatted("clockAccuracy: %#.2x ", clockAccuracy);
    trace.appendFormatted("offsetScaledLogVariance: %#.4x", offsetScaledLogVariance);
}

void tClockQuality::serialize(iSerializableTarget& target, tStatus& status) const {
    target.writeUInteger8(clockClass, status);
    target.writeEnumeration8(static_cast<std::uint8_t>(clockAccuracy), status);
    target.writeUInteger16(offsetScaledLogVariance, status);
}

void tClockQuality::deserialize(iSerializableTarget& source, tStatus& status) {
    std::uint8_t accuracy = 0;
    source.readUInteger8(clockClass, status);
    source.readEnumeration8(accuracy, status);
    if (status.succeeded()) {
        clockAccuracy = accuracy;
    }
    source.readUInteger16(offsetScaledLogVariance, status);
}

}  // namespace nQVPTP000
