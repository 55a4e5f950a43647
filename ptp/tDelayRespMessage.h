#ifndef QV_PTP_TDELAYRESPMESSAGE_H
#define QV_PTP_TDELAYRESPMESSAGE_H

#include <memory>

#include "ptp/tPTPMessage.h"
#include "ptp/tPortIdentity.h"
#include "ptp/tTimestamp.h"

namespace nQVPTP000 {

// A Delay_Resp message: when the master received a Delay_Req, and from which port. Only
// ever received: this system decodes it to recognise and drop it.
class tDelayRespMessage final : public tPTPMessage {
  public:
    // Reads the body and the TLV suffix after the header already read.
    tDelayRespMessage(std::unique_ptr<tMessageHeader> header, iSerializableTarget& source,
                      tStatus& status);

    void trace(nQVTARN000::tTrace& trace) const override;
    std::uint16_t getSize() const override;

    const tTimestamp& getReceiveTimestamp() const { return receiveTimestamp_; }
    const tPortIdentity& getRequestingPortIdentity() const { return requestingPortIdentity_; }

  protected:
    void deserializeBody(iSerializableTarget& source, tStatus& status) override;
    void serializeBody(iSerializableTarget& target, tStatus& status) const override;

  private:
    tTimestamp receiveTimestamp_;
    tPortIdentity requestingPortIdentity_ = allOnesPortIdentity();
};

}  // namespace nQVPTP000

#endif
