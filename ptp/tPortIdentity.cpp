#include "ptp/tPortIdentity.h"

#include "platform/tTrace.h"

namespace nQVPTP000 {

void tPortIdentity::setClockIdentity(const tClockIdentity& clockIdentity, tStatus& status) {
    if (status.succeeded()) {
        clockIdentity_ = clockIdentity;
    }
}

void tPortIdentity::setPortNumber(std::uint16_t portNumber, tStatus& status) {
    if (status.succeeded()) {
        portNumber_ = portNumber;
    }
}

void tPortIdentity::trace(nQVTARN000::tTrace& trace) const {
    trace.append("clockIdentity: ").append(clockIdentity_);
    trace.appendFormatted(" portNumber: %u\n", portNumber_);
}

void tPortIdentity::serialize(iSerializableTarget& target, tStatus& status) const {
    clockIdentity_.serialize(target, status);
    target.writeUInteger16(portNumber_, status);
}

void tPortIdentity::deserialize(iSerializableTarget& source, tStatus& status) {
    clockIdentity_.deserialize(source, status);
    source.readUInteger16(portNumber_, status);
}

const tPortIdentity& allOnesPortIdentity() {
    static const tPortIdentity identity(allOnesClockIdentity(), tPortIdentity::kAllPorts);
    return identity;
}

}  // namespace nQVPTP000
