#ifndef QV_PTP_TLVS_TTIMETLV_H
#define QV_PTP_TLVS_TTIMETLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"
#include "ptp/tTimestamp.h"

namespace nQVPTP000 {

// TIME: the clock's current time.
class tTimeTLV final : public tDataFieldTLV<tTimeTLV> {
  public:
    tTimeTLV();
    tTimeTLV(const tTimeTLV&) = default;
    tTimeTLV& operator=(const tTimeTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.field(self.currentTime_);
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;
    // Only a grandmaster (its own clock identity is its grandmaster's) takes a new time.
    tManagementMessagePayload* respondToSet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    tTimestamp getCurrentTime() const { return currentTime_; }
    void setCurrentTime(const tTimestamp& currentTime, tStatus& status);

  private:
    tTimestamp currentTime_;
};

}  // namespace nQVPTP000

#endif
