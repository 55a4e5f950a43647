#ifndef QV_PTP_TLVS_TUTCPROPERTIESTLV_H
#define QV_PTP_TLVS_TUTCPROPERTIESTLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"

namespace nQVPTP000 {

// UTC_PROPERTIES: the UTC offset and the leap second flags.
class tUTCPropertiesTLV final : public tDataFieldTLV<tUTCPropertiesTLV> {
  public:
    tUTCPropertiesTLV();
    tUTCPropertiesTLV(const tUTCPropertiesTLV&) = default;
    tUTCPropertiesTLV& operator=(const tUTCPropertiesTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.field(self.currentUtcOffset_);
        visitor.flags8(flagBit(self.currentUtcOffsetValid_, 0x04), flagBit(self.leap59_, 0x02),
                       flagBit(self.leap61_, 0x01));
        visitor.reserved(1);
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;
    tManagementMessagePayload* respondToSet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    std::int16_t getCurrentUtcOffset() const { return currentUtcOffset_; }
    bool getLeap61() const { return leap61_; }
    bool getLeap59() const { return leap59_; }
    bool getCurrentUtcOffsetValid() const { return currentUtcOffsetValid_; }

  private:
    std::int16_t currentUtcOffset_ = 0;
    bool leap61_ = false;
    bool leap59_ = false;
    bool currentUtcOffsetValid_ = false;
};

}  // namespace nQVPTP000

#endif
