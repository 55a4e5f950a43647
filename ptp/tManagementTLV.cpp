#include "ptp/tManagementTLV.h"

#include "platform/tTrace.h"

namespace nQVPTP000 {

void tManagementTLV::trace(nQVTARN000::tTrace& trace) const {
    tTLV::trace(trace);
    trace.appendFormatted("managementId: %#.4x ", managementId_);
}

std::uint16_t tManagementTLV::setDataLength(std::uint16_t length, tStatus& status,
                                            std::uint16_t alignment) {
    return tTLV::setDataLength(static_cast<std::uint16_t>(length + 2), status, alignment);
}

void tManagementTLV::deserializeValue(iSerializableTarget& source, tStatus& status) {
    source.readEnumeration16(managementId_, status);
    deserializeDataField(source, status);
}

void tManagementTLV::serializeValue(iSerializableTarget& target, tStatus& status) const {
    target.writeEnumeration16(managementId_, status);
    serializeDataField(target, status);
}

void tManagementTLV::setManagementId(std::uint16_t managementId, tStatus& status) {
    if (status.succeeded()) {
        managementId_ = managementId;
    }
}

}  // namespace nQVPTP000
