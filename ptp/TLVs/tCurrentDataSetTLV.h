#ifndef QV_PTP_TLVS_TCURRENTDATASETTLV_H
#define QV_PTP_TLVS_TCURRENTDATASETTLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"
#include "ptp/tTimeInterval.h"

namespace nQVPTP000 {

// CURRENT_DATA_SET: the clock's distance from its master.
class tCurrentDataSetTLV final : public tDataFieldTLV<tCurrentDataSetTLV> {
  public:
    tCurrentDataSetTLV();
    tCurrentDataSetTLV(const tCurrentDataSetTLV&) = default;
    tCurrentDataSetTLV& operator=(const tCurrentDataSetTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.field(self.stepsRemoved_);
        visitor.field(self.offsetFromMaster_);
        visitor.field(self.meanPathDelay_);
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    std::uint16_t getStepsRemoved() const { return stepsRemoved_; }
    tTimeInterval getOffsetFromMaster() const { return offsetFromMaster_; }
    tTimeInterval getMeanPathDelay() const { return meanPathDelay_; }

  private:
    std::uint16_t stepsRemoved_ = 0;
    tTimeInterval offsetFromMaster_;
    tTimeInterval meanPathDelay_;
};

}  // namespace nQVPTP000

#endif
