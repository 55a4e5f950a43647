#ifndef QV_PTP_TSIGNALINGMESSAGE_H
#define QV_PTP_TSIGNALINGMESSAGE_H

#include <memory>

#include "ptp/tPTPMessage.h"
#include "ptp/tPortIdentity.h"

namespace nQVPTP000 {

// A Signaling message: a target port identity and TLVs. Only ever received: this system
// decodes it to recognise and drop it.
class tSignalingMessage final : public tPTPMessage {
  public:
    // Reads the body and the TLV suffix after the header already read.
    tSignalingMessage(std::unique_ptr<tMessageHeader> header, iSerializableTarget& source,
                      tStatus& status);

    void trace(nQVTARN000::tTrace& trace) const override;
    std::uint16_t getSize() const override { return sizeWithBody(targetPortIdentity_.getSize()); }

    const tPortIdentity& getTargetPortIdentity() const { return targetPortIdentity_; }

  protected:
    void deserializeBody(iSerializableTarget& source, tStatus& status) override;
    void serializeBody(iSerializableTarget& target, tStatus& status) const override;

  private:
    tPortIdentity targetPortIdentity_ = allOnesPortIdentity();
};

}  // namespace nQVPTP000

#endif
