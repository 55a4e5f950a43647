#ifndef QV_PTP_TLVS_TPORTDATASETTLV_H
#define QV_PTP_TLVS_TPORTDATASETTLV_H

#include <cstdint>

#include "ptp/TLVs/tDataFieldTLV.h"
#include "ptp/tPortIdentity.h"
#include "ptp/tTimeInterval.h"

namespace nQVPTP000 {

// PORT_DATA_SET: the state and message intervals of one port.
class tPortDataSetTLV final : public tDataFieldTLV<tPortDataSetTLV> {
  public:
    tPortDataSetTLV();
    tPortDataSetTLV(const tPortDataSetTLV&) = default;
    tPortDataSetTLV& operator=(const tPortDataSetTLV&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.field(self.portIdentity_);
        visitor.field(self.portState_);
        visitor.field(self.logMinDelayReqInterval_);
        visitor.field(self.peerMeanPathDelay_);
        visitor.field(self.logAnnounceInterval_);
        visitor.field(self.announceReceiptTimeout_);
        visitor.field(self.logSyncInterval_);
        visitor.field(self.delayMechanism_);
        visitor.field(self.logMinPdelayReqInterval_);
        visitor.lowNibble(self.versionNumber_);
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    tPortIdentity getPortIdentity() const { return portIdentity_; }
    std::uint8_t getPortState() const { return portState_; }
    std::int8_t getLogMinDelayReqInterval() const { return logMinDelayReqInterval_; }
    tTimeInterval getPeerMeanPathDelay() const { return peerMeanPathDelay_; }
    std::int8_t getLogAnnounceInterval() const { return logAnnounceInterval_; }
    std::uint8_t getAnnounceReceiptTimeout() const { return announceReceiptTimeout_; }
    std::int8_t getLogSyncInterval() const { return logSyncInterval_; }
    std::uint8_t getDelayMechanism() const { return delayMechanism_; }
    std::int8_t getLogMinPdelayReqInterval() const { return logMinPdelayReqInterval_; }
    std::uint8_t getVersionNumber() const { return versionNumber_; }

  private:
    tPortIdentity portIdentity_ = allOnesPortIdentity();
    std::uint8_t portState_ = 1;  // INITIALIZING
    std::int8_t logMinDelayReqInterval_ = 1;
    tTimeInterval peerMeanPathDelay_{1};
    std::int8_t logAnnounceInterval_ = 1;
    std::uint8_t announceReceiptTimeout_ = 1;
    std::int8_t logSyncInterval_ = 1;
    std::uint8_t delayMechanism_ = 1;  // E2E
    std::int8_t logMinPdelayReqInterval_ = 0;
    std::uint8_t versionNumber_ = 2;
};

}  // namespace nQVPTP000

#endif
