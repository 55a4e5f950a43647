#ifndef QV_PTP_TLVS_TTRACEABILITYPROPERTIESTLV_H
#define QV_PTP_TLVS_TTRACEABILITYPROPERTIESTLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"

namespace nQVPTP000 {

// TRACEABILITY_PROPERTIES: whether time and frequency are traceable to a primary reference.
class tTraceabilityPropertiesTLV final : public tDataFieldTLV<tTraceabilityPropertiesTLV> {
  public:
    tTraceabilityPropertiesTLV();
    tTraceabilityPropertiesTLV(const tTraceabilityPropertiesTLV&) = default;
    tTraceabilityPropertiesTLV& operator=(const tTraceabilityPropertiesTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.flags8(flagBit(self.frequencyTraceable_, 0x20), flagBit(self.timeTraceable_, 0x10));
        visitor.reserved(1);
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;
    tManagementMessagePayload* respondToSet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    bool getFrequencyTraceable() const { return frequencyTraceable_; }
    bool getTimeTraceable() const { return timeTraceable_; }

  private:
    bool frequencyTraceable_ = false;
    bool timeTraceable_ = false;
};

}  // namespace nQVPTP000

#endif
