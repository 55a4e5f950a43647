#ifndef QV_PTP_TANNOUNCEMESSAGE_H
#define QV_PTP_TANNOUNCEMESSAGE_H

#include <cstdint>
#include <memory>

#include "ptp/tClockIdentity.h"
#include "ptp/tClockQuality.h"
#include "ptp/tPTPMessage.h"
#include "ptp/tTimestamp.h"

namespace nQVPTP000 {

// An Announce message: what a master says about its grandmaster. Only ever received: this
// system decodes it to recognise and drop it.
class tAnnounceMessage final : public tPTPMessage {
  public:
    static constexpr std::uint16_t kBodySize = 30;

    // Reads the body and the TLV suffix after the header already read.
    tAnnounceMessage(std::unique_ptr<tMessageHeader> header, iSerializableTarget& source,
                     tStatus& status);

    void trace(nQVTARN000::tTrace& trace) const override;
    std::uint16_t getSize() const override { return sizeWithBody(kBodySize); }

    const tTimestamp& getOriginTimestamp() const { return originTimestamp_; }
    std::int16_t getCurrentUtcOffset() const { return currentUtcOffset_; }
    std::uint32_t getTimeSource() const { return timeSource_; }
    std::uint16_t getStepsRemoved() const { return stepsRemoved_; }
    const tClockIdentity& getGrandmasterIdentity() const { return grandmasterIdentity_; }
    const tClockQuality& getGrandmasterClockQuality() const { return grandmasterClockQuality_; }
    std::uint8_t getGrandmasterPriority1() const { return grandmasterPriority1_; }
    std::uint8_t getGrandmasterPriority2() const { return grandmasterPriority2_; }

  protected:
    void deserializeBody(iSerializableTarget& source, tStatus& status) override;
    void serializeBody(iSerializableTarget& target, tStatus& status) const override;

  private:
    tTimestamp originTimestamp_;
    std::int16_t currentUtcOffset_ = 0;
    std::uint32_t timeSource_ = 0;  // an enumeration; one octet on the wire
    std::uint16_t stepsRemoved_ = 0;
    tClockIdentity grandmasterIdentity_;
    tClockQuality grandmasterClockQuality_;
    std::uint8_t grandmasterPriority1_ = 0;
    std::uint8_t grandmasterPriority2_ = 0;
};

}  // namespace nQVPTP000

#endif
