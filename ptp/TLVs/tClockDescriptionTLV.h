#ifndef QV_PTP_TLVS_TCLOCKDESCRIPTIONTLV_H
#define QV_PTP_TLVS_TCLOCKDESCRIPTIONTLV_H

#include <array>
#include <cstdint>
#include <span>
#include <vector>

#include "ptp/TLVs/tDataFieldTLV.h"
#include "ptp/tPTPText.h"
#include "ptp/tPortAddress.h"

namespace nQVPTP000 {

// CLOCK_DESCRIPTION: what a clock is and who made it. Its data field has variable-length
// parts and ends with a pad octet when their sum is odd; lengthField is recomputed from the
// decoded members. Traces only the common header.
class tClockDescriptionTLV final : public tDataFieldTLV<tClockDescriptionTLV> {
  public:
    tClockDescriptionTLV();
    // A copy whose address array cannot be allocated keeps no address (length 0).
    // A copy that cannot get memory throws std::bad_alloc; moving never allocates.
    tClockDescriptionTLV(const tClockDescriptionTLV& other);
    tClockDescriptionTLV(tClockDescriptionTLV&& other) noexcept = default;
    tClockDescriptionTLV& operator=(const tClockDescriptionTLV&) = delete;

    // The fields before the pad octet.
    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.flags16(flagBit(self.ordinaryClock_, 0x8000), flagBit(self.boundaryClock_, 0x4000),
                        flagBit(self.p2pTransparentClock_, 0x2000),
                        flagBit(self.e2eTransparentClock_, 0x1000),
                        flagBit(self.managementNode_, 0x0800));
        visitor.field(self.physicalLayerProtocol_);
        visitor.field(self.physicalAddressLength_);
        visitor.octetArray(self.physicalAddress_, self.physicalAddressLength_);
        visitor.field(self.protocolAddress_);
        visitor.octets(self.manufacturerIdentity_);
        visitor.reserved(1);
        visitor.field(self.productDescription_);
        visitor.field(self.revisionData_);
        visitor.field(self.userDescription_);
        visitor.octets(self.profileIdentity_);
    }

    void deserializeDataField(iSerializableTarget& source, tStatus& status) override;
    void serializeDataField(iSerializableTarget& target, tStatus& status) const override;
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    bool getManagementNode() const { return managementNode_; }
    bool getOrdinaryClock() const { return ordinaryClock_; }
    bool getP2PTransparentClock() const { return p2pTransparentClock_; }
    bool getE2ETransparentClock() const { return e2eTransparentClock_; }
    bool getBoundaryClock() const { return boundaryClock_; }
    tPTPText getPhysicalLayerProtocol() const { return physicalLayerProtocol_; }
    std::uint16_t getPhysicalAddressLength() const { return physicalAddressLength_; }
    // Empty when the clock has no physical address.
    std::span<const std::uint8_t> getPhysicalAddress() const { return physicalAddress_; }
    tPortAddress getProtocolAddress() const { return protocolAddress_; }
    std::span<const std::uint8_t, 3> getManufacturerIdentity() const {
        return manufacturerIdentity_;
    }
    tPTPText getProductDescription() const { return productDescription_; }
    tPTPText getRevisionData() const { return revisionData_; }
    tPTPText getUserDescription() const { return userDescription_; }
    std::span<const std::uint8_t, 6> getProfileIdentity() const { return profileIdentity_; }
    bool getPadNeeded() const { return padNeeded_; }

  private:
    // lengthField and padNeeded from the members.
    void updatePad(tStatus& status);
    void fillFrom(iManagedClock& clock, std::uint16_t port, tStatus& clockStatus);

    bool managementNode_ = false;
    bool ordinaryClock_ = false;
    bool p2pTransparentClock_ = false;
    bool e2eTransparentClock_ = false;
    bool boundaryClock_ = false;
    tPTPText physicalLayerProtocol_;
    std::uint16_t physicalAddressLength_ = 0;
    std::vector<std::uint8_t> physicalAddress_;  // physicalAddressLength_ octets
    tPortAddress protocolAddress_;
    std::array<std::uint8_t, 3> manufacturerIdentity_{0x02, 0xA5, 0x3C};
    tPTPText productDescription_;
    tPTPText revisionData_;
    tPTPText userDescription_;
    std::array<std::uint8_t, 6> profileIdentity_{};
    bool padNeeded_ = false;
};

}  // namespace nQVPTP000

#endif
