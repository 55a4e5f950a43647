#ifndef QV_PTP_TLVS_TNULLMANAGEMENTTLV_H
#define QV_PTP_TLVS_TNULLMANAGEMENTTLV_H

#include "ptp/tManagementTLV.h"

namespace nQVPTP000 {

// NULL_MANAGEMENT: a management TLV with an empty dataField (lengthField 2).
class tNullManagementTLV final : public tManagementTLV {
  public:
    tNullManagementTLV();
    tNullManagementTLV(const tNullManagementTLV&) = default;
    tNullManagementTLV& operator=(const tNullManagementTLV&) = default;

    std::unique_ptr<tTLV> clone(tStatus& status) const override;
    void deserializeDataField(iSerializableTarget&, tStatus&) override {}
    void serializeDataField(iSerializableTarget&, tStatus&) const override {}

    // A NULL_MANAGEMENT request of any action is answered with the TLV itself.
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;
    tManagementMessagePayload* respondToSet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;
    tManagementMessagePayload* respondToCommand(iManagedClock& clock, std::uint16_t port,
                                                tStatus& status) override;
};

}  // namespace nQVPTP000

#endif
