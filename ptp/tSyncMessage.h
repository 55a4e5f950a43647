#ifndef QV_PTP_TSYNCMESSAGE_H
#define QV_PTP_TSYNCMESSAGE_H

#include <memory>

#include "ptp/tPTPMessage.h"
#include "ptp/tTimestamp.h"

namespace nQVPTP000 {

// A Sync message: the master's origin time of a synchronisation event. Only ever received: this
// system decodes it to recognise and drop it.
class tSyncMessage final : public tPTPMessage {
  public:
    // Reads the body and the TLV suffix after the header already read.
    tSyncMessage(std::unique_ptr<tMessageHeader> header, iSerializableTarget& source,
                 tStatus& status);

    void trace(nQVTARN000::tTrace& trace) const override;
    std::uint16_t getSize() const override { return sizeWithBody(tTimestamp::kSize); }

    const tTimestamp& getOriginTimestamp() const { return originTimestamp_; }

  protected:
    void deserializeBody(iSerializableTarget& source, tStatus& status) override;
    void serializeBody(iSerializableTarget& target, tStatus& status) const override;

  private:
    tTimestamp originTimestamp_;
};

}  // namespace nQVPTP000

#endif
