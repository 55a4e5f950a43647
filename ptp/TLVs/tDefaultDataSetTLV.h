#ifndef QV_PTP_TLVS_TDEFAULTDATASETTLV_H
#define QV_PTP_TLVS_TDEFAULTDATASETTLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"
#include "ptp/tClockIdentity.h"
#include "ptp/tClockQuality.h"

namespace nQVPTP000 {

// DEFAULT_DATA_SET: the clock's own attributes. Traces only the common header.
class tDefaultDataSetTLV final : public tDataFieldTLV<tDefaultDataSetTLV> {
  public:
    tDefaultDataSetTLV();
    tDefaultDataSetTLV(const tDefaultDataSetTLV&) = default;
    tDefaultDataSetTLV& operator=(const tDefaultDataSetTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.flags8(flagBit(self.slaveOnly_, 0x02), flagBit(self.twoStepFlag_, 0x01));
        visitor.reserved(1);
        visitor.field(self.numberPorts_);
        visitor.field(self.priority1_);
        visitor.field(self.clockQuality_);
        visitor.field(self.priority2_);
        visitor.field(self.clockIdentity_);
        visitor.field(self.domainNumber_);
        visitor.reserved(1);
    }

    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    bool getSlaveOnly() const { return slaveOnly_; }
    bool getTwoStepFlag() const { return twoStepFlag_; }
    std::uint16_t getNumberPorts() const { return numberPorts_; }
    std::uint8_t getPriority1() const { return priority1_; }
    std::uint8_t getPriority2() const { return priority2_; }
    std::uint8_t getDomainNumber() const { return domainNumber_; }
    tClockQuality getClockQuality() const { return clockQuality_; }
    tClockIdentity getClockIdentity() const { return clockIdentity_; }

  private:
    bool slaveOnly_ = false;
    bool twoStepFlag_ = false;
    std::uint16_t numberPorts_ = 1;
    std::uint8_t priority1_ = 100;
    std::uint8_t priority2_ = 100;
    std::uint8_t domainNumber_ = 0;
    tClockQuality clockQuality_;
    tClockIdentity clockIdentity_;
};

}  // namespace nQVPTP000

#endif
