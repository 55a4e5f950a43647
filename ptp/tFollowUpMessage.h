#ifndef QV_PTP_TFOLLOWUPMESSAGE_H
#define QV_PTP_TFOLLOWUPMESSAGE_H

#include <memory>

#include "ptp/tPTPMessage.h"
#include "ptp/tTimestamp.h"

namespace nQVPTP000 {

// A Follow_Up message: the precise origin time of the Sync before it. Only ever received: this
// system decodes it to recognise and drop it.
class tFollowUpMessage final : public tPTPMessage {
  public:
    // Reads the body and the TLV suffix after the header already read.
    tFollowUpMessage(std::unique_ptr<tMessageHeader> header, iSerializableTarget& source,
                     tStatus& status);

    void trace(nQVTARN000::tTrace& trace) const override;
    std::uint16_t getSize() const override { return sizeWithBody(tTimestamp::kSize); }

    const tTimestamp& getPreciseOriginTimestamp() const { return preciseOriginTimestamp_; }

  protected:
    void deserializeBody(iSerializableTarget& source, tStatus& status) override;
    void serializeBody(iSerializableTarget& target, tStatus& status) const override;

  private:
    tTimestamp preciseOriginTimestamp_;
};

}  // namespace nQVPTP000

#endif
