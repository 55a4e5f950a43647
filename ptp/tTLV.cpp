#include "ptp/tTLV.h"

#include "platform/tTrace.h"
#include "ptp/tProtocolDataUnit.h"

namespace nQVPTP000 {

void tTLV::trace(nQVTARN000::tTrace& trace) const {
    trace.appendFormatted("tlvType %u ", tlvType_);
    trace.appendFormatted("lengthField %u ", lengthField_);
}

void tTLV::serialize(iSerializableTarget& target, tStatus& status) const {
    target.writeEnumeration16(tlvType_, status);
    target.writeUInteger16(lengthField_, status);
    serializeValue(target, status);
}

void tTLV::deserialize(iSerializableTarget& source, tStatus& status) {
    source.readEnumeration16(tlvType_, status);
    source.readUInteger16(lengthField_, status);
    deserializeValue(source, status);
    matchLengthField(status);
}

std::uint16_t tTLV::setDataLength(std::uint16_t length, tStatus& status, std::uint16_t alignment) {
    if (status.failed()) {
        return 0;
    }
    std::uint16_t pad = 0;
    if (alignment > 1 && length % alignment != 0) {
        pad = static_cast<std::uint16_t>(alignment - length % alignment);
    }
    lengthField_ = static_cast<std::uint16_t>(length + pad);
    return pad;
}

void tTLV::matchLengthField(tStatus& status) {
    if (status.failed()) {
        return;
    }
    tProtocolDataUnit value(status);
    serializeValue(value, status);
    if (status.succeeded()) {
        lengthField_ = static_cast<std::uint16_t>(value.getLength());
    }
}

void tTLV::setTlvType(std::uint16_t tlvType, tStatus& status) {
    if (status.succeeded()) {
        tlvType_ = tlvType;
    }
}

}  // namespace nQVPTP000
