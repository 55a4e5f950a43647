#include "ptp/tManagementTLVFactory.h"

#include <new>

#include "ptp/tManagementIdTable.h"
#include "ptp/tTLVWindow.h"

namespace nQVPTP000 {

std::unique_ptr<tManagementTLV> tManagementTLVFactory::createManagementTLV(
    iSerializableTarget& source, tStatus& status) {
    std::uint16_t lengthField = 0;
    std::uint16_t managementId = 0;
    source.readUInteger16(lengthField, status);
    tTLVWindow value(source, lengthField);
    value.readEnumeration16(managementId, status);
    std::unique_ptr<tManagementTLV> tlv;
    if (status.succeeded()) {
        const tManagementIdEntry* row = findManagementId(managementId);
        if (row == nullptr) {
            QV_STATUS_SET(status, kStatusUnsupported, kComponentCodec);
        } else {
            try {
                tlv = row->create();
            } catch (const std::bad_alloc&) {
                QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
            }
        }
    }
    if (tlv) {
        // Gives back the received lengthField: the managementId's two octets are added again.
        tlv->setDataLength(static_cast<std::uint16_t>(lengthField - 2), status, 1);
        tlv->deserializeDataField(value, status);
    }
    value.close(status);
    if (status.failed()) {
        return nullptr;
    }
    return tlv;
}

}  // namespace nQVPTP000
