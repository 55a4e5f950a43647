#include "ptp/tTLVFactory.h"

#include <new>

#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/tManagementTLVFactory.h"
#include "ptp/tOrganizationExtensionTLVFactory.h"
#include "ptp/tTLVWindow.h"

namespace nQVPTP000 {

std::unique_ptr<tTLV> tTLVFactory::createTLV(iSerializableTarget& source, tStatus& status) {
    std::uint16_t tlvType = 0;
    source.readEnumeration16(tlvType, status);
    if (status.failed()) {
        return nullptr;
    }
    std::unique_ptr<tTLV> tlv = createOfType(tlvType, source, status);
    // Every kind is matched here, so that none is written back with the sender's framing.
    if (tlv) {
        tStatus matched;
        tlv->matchLengthField(matched);
        if (matched.failed()) {
            status = matched;
            return nullptr;
        }
    }
    return tlv;
}

std::unique_ptr<tTLV> tTLVFactory::createOfType(std::uint16_t tlvType, iSerializableTarget& source,
                                                tStatus& status) {
    switch (tlvType) {
        case tTLV::kManagement:
            return tManagementTLVFactory::createManagementTLV(source, status);
        case tTLV::kManagementErrorStatus:
            return createErrorStatusTLV(source, status);
        case tTLV::kOrganizationExtension:
            return tOrganizationExtensionTLVFactory::createOrganizationExtensionTLV(source, status);
        default:
            skipUnsupportedTLV(source, status);
            return nullptr;
    }
}

std::unique_ptr<tTLV> tTLVFactory::createErrorStatusTLV(iSerializableTarget& source,
                                                        tStatus& status) {
    std::unique_ptr<tManagementErrorStatusTLV> tlv;
    try {
        tlv = std::make_unique<tManagementErrorStatusTLV>();
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
    std::uint16_t lengthField = 0;
    source.readUInteger16(lengthField, status);
    tTLVWindow value(source, lengthField);
    if (tlv) {
        tlv->setDataLength(lengthField, status, 1);
        tlv->deserializeValue(value, status);
    }
    const bool fixedFieldsRead = status.succeeded();
    value.close(status);
    if (tlv && fixedFieldsRead && status.code == kStatusNoData) {
        // The datagram ended inside the display text: the clock's refusal still stands, with
        // the text that arrived whole (none, when it was cut). The end of data stays recorded
        // so that this is the last TLV read.
        return tlv;
    }
    if (status.failed()) {
        return nullptr;
    }
    return tlv;
}

void tTLVFactory::skipUnsupportedTLV(iSerializableTarget& source, tStatus& status) {
    std::uint16_t lengthField = 0;
    source.readUInteger16(lengthField, status);
    tTLVWindow value(source, lengthField);
    QV_STATUS_SET(status, kStatusUnsupported, kComponentCodec);
    value.close(status);
}

}  // namespace nQVPTP000
