#ifndef QV_PTP_TLVS_TTIMESCALEPROPERTIESTLV_H
#define QV_PTP_TLVS_TTIMESCALEPROPERTIESTLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"

namespace nQVPTP000 {

// TIMESCALE_PROPERTIES: whether the clock keeps the PTP timescale, and its time source.
class tTimescalePropertiesTLV final : public tDataFieldTLV<tTimescalePropertiesTLV> {
  public:
    tTimescalePropertiesTLV();
    tTimescalePropertiesTLV(const tTimescalePropertiesTLV&) = default;
    tTimescalePropertiesTLV& operator=(const tTimescalePropertiesTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.flags8(flagBit(self.ptpTimescale_, 0x08));
        visitor.field(self.timeSource_);
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;
    // ptpTimescale is always applied; a timeSource outside the IEEE 1588-2008 list is refused
    // and that refusal wins over a clock failure.
    tManagementMessagePayload* respondToSet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    bool getPtpTimescale() const { return ptpTimescale_; }
    std::uint8_t getTimeSource() const { return timeSource_; }

  private:
    bool ptpTimescale_ = true;
    std::uint8_t timeSource_ = 0xA0;  // INTERNAL_OSCILLATOR
};

}  // namespace nQVPTP000

#endif
