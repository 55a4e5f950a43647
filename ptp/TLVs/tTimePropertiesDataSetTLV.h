#ifndef QV_PTP_TLVS_TTIMEPROPERTIESDATASETTLV_H
#define QV_PTP_TLVS_TTIMEPROPERTIESDATASETTLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"

namespace nQVPTP000 {

// TIME_PROPERTIES_DATA_SET: the timescale, UTC offset and leap second flags.
class tTimePropertiesDataSetTLV final : public tDataFieldTLV<tTimePropertiesDataSetTLV> {
  public:
    tTimePropertiesDataSetTLV();
    tTimePropertiesDataSetTLV(const tTimePropertiesDataSetTLV&) = default;
    tTimePropertiesDataSetTLV& operator=(const tTimePropertiesDataSetTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.field(self.currentUtcOffset_);
        visitor.flags8(flagBit(self.frequencyTraceable_, 0x20), flagBit(self.timeTraceable_, 0x10),
                       flagBit(self.ptpTimescale_, 0x08),
                       flagBit(self.currentUtcOffsetValid_, 0x04), flagBit(self.leap59_, 0x02),
                       flagBit(self.leap61_, 0x01));
        visitor.field(self.timeSource_);
    }

    // The other flags and timeSource are not traced.
    void trace(nQVTARN000::tTrace& trace) const override;
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    std::int16_t getCurrentUtcOffset() const { return currentUtcOffset_; }
    bool getFrequencyTraceable() const { return frequencyTraceable_; }
    bool getTimeTraceable() const { return timeTraceable_; }
    bool getPtpTimescale() const { return ptpTimescale_; }
    bool getLeap61() const { return leap61_; }
    bool getLeap59() const { return leap59_; }
    bool getCurrentUtcOffsetValid() const { return currentUtcOffsetValid_; }
    std::uint8_t getTimeSource() const { return timeSource_; }

  private:
    std::int16_t currentUtcOffset_ = 0;
    bool frequencyTraceable_ = false;
    bool timeTraceable_ = false;
    bool ptpTimescale_ = false;
    bool leap61_ = false;
    bool leap59_ = false;
    bool currentUtcOffsetValid_ = false;
    std::uint8_t timeSource_ = 0xA0;  // INTERNAL_OSCILLATOR
};

}  // namespace nQVPTP000

#endif
