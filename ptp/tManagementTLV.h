#ifndef QV_PTP_TMANAGEMENTTLV_H
#define QV_PTP_TMANAGEMENTTLV_H

#include <cstdint>

#include "ptp/tManagementMessagePayload.h"

namespace nQVPTP000 {

// A MANAGEMENT TLV: managementId, then a dataField that each class supplies. lengthField
// counts the managementId, the dataField and its pad octet.
class tManagementTLV : public tManagementMessagePayload {
  public:
    explicit tManagementTLV(std::uint16_t managementId)
        : tManagementMessagePayload(kManagement), managementId_(managementId) {}

    // "tlvType %u lengthField %u managementId: %#0.4x "
    void trace(nQVTARN000::tTrace& trace) const override;
    // `length` is the dataField's size: the managementId's two octets are added here.
    std::uint16_t setDataLength(std::uint16_t length, tStatus& status,
                                std::uint16_t alignment) override;
    void deserializeValue(iSerializableTarget& source, tStatus& status) override;
    void serializeValue(iSerializableTarget& target, tStatus& status) const override;
    std::uint16_t getManagementId() const override { return managementId_; }
    void setManagementId(std::uint16_t managementId, tStatus& status) override;

    virtual void deserializeDataField(iSerializableTarget& source, tStatus& status) = 0;
    virtual void serializeDataField(iSerializableTarget& target, tStatus& status) const = 0;

  protected:
    tManagementTLV(const tManagementTLV&) = default;
    tManagementTLV& operator=(const tManagementTLV&) = default;

  private:
    std::uint16_t managementId_;
};

}  // namespace nQVPTP000

#endif
