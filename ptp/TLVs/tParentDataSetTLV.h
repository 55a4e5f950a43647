#ifndef QV_PTP_TLVS_TPARENTDATASETTLV_H
#define QV_PTP_TLVS_TPARENTDATASETTLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"
#include "ptp/tClockIdentity.h"
#include "ptp/tClockQuality.h"
#include "ptp/tPortIdentity.h"

namespace nQVPTP000 {

// PARENT_DATA_SET: the clock's parent and grandmaster.
class tParentDataSetTLV final : public tDataFieldTLV<tParentDataSetTLV> {
  public:
    tParentDataSetTLV();
    tParentDataSetTLV(const tParentDataSetTLV&) = default;
    tParentDataSetTLV& operator=(const tParentDataSetTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.field(self.parentPortIdentity_);
        visitor.flags8(flagBit(self.parentStats_, 0x01));
        visitor.reserved(1);
        visitor.field(self.observedParentOffsetScaledLogVariance_);
        visitor.field(self.observedParentClockPhaseChangeRate_);
        visitor.field(self.grandmasterPriority1_);
        visitor.field(self.grandmasterClockQuality_);
        visitor.field(self.grandmasterPriority2_);
        visitor.field(self.grandmasterIdentity_);
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    tPortIdentity getParentPortIdentity() const { return parentPortIdentity_; }
    bool getParentStats() const { return parentStats_; }
    std::uint16_t getObservedParentOffsetScaledLogVariance() const {
        return observedParentOffsetScaledLogVariance_;
    }
    std::int32_t getObservedParentClockPhaseChangeRate() const {
        return observedParentClockPhaseChangeRate_;
    }
    std::uint8_t getGrandmasterPriority1() const { return grandmasterPriority1_; }
    tClockIdentity getGrandmasterIdentity() const { return grandmasterIdentity_; }
    std::uint8_t getGrandmasterPriority2() const { return grandmasterPriority2_; }
    tClockQuality getGrandmasterClockQuality() const { return grandmasterClockQuality_; }

  private:
    tPortIdentity parentPortIdentity_ = allOnesPortIdentity();
    bool parentStats_ = false;
    std::uint16_t observedParentOffsetScaledLogVariance_ = 0xFFFF;
    std::int32_t observedParentClockPhaseChangeRate_ = 0x7FFFFFFF;
    std::uint8_t grandmasterPriority1_ = 0;
    tClockIdentity grandmasterIdentity_;
    std::uint8_t grandmasterPriority2_ = 0;
    tClockQuality grandmasterClockQuality_;
};

}  // namespace nQVPTP000

#endif
