#ifndef QV_PTP_TMANAGEMENTMESSAGE_H
#define QV_PTP_TMANAGEMENTMESSAGE_H

#include <cstdint>
#include <memory>

#include "ptp/tManagementMessagePayload.h"
#include "ptp/tPTPMessage.h"
#include "ptp/tPortIdentity.h"

namespace nQVPTP000 {

// A management message: target port, hop counts, actionField, and its payload as the first
// TLV of the suffix. The requests that this system sends carry exactly one TLV.
class tManagementMessage final : public tPTPMessage {
  public:
    // Octets of the body after the header.
    static constexpr std::uint16_t kBodySize = 14;

    // A GET request to all ports of all clocks, without payload yet.
    explicit tManagementMessage(tStatus& status);
    // A received message: reads the body and the TLV suffix after the header already read.
    tManagementMessage(std::unique_ptr<tMessageHeader> header, iSerializableTarget& source,
                       tStatus& status);

    void trace(nQVTARN000::tTrace& trace) const override;
    std::uint16_t getSize() const override { return sizeWithBody(kBodySize); }

    std::uint32_t getActionField() const { return actionField_; }
    void setActionField(std::uint32_t actionField, tStatus& status);
    tPortIdentity getTargetPortIdentity() const { return targetPortIdentity_; }
    void setTargetPortIdentity(const tPortIdentity& identity, tStatus& status);
    std::uint8_t getStartingBoundaryHops() const { return startingBoundaryHops_; }
    std::uint8_t getBoundaryHops() const { return boundaryHops_; }

    // Makes `payload` the message's only TLV and brings messageLength up to date.
    void setPayload(std::unique_ptr<tManagementMessagePayload> payload, tStatus& status);
    // The first TLV, owned by the message: -52010 and null without a suffix, -52012 and null
    // without TLVs, -52005 and null when the first TLV is not a management payload.
    tManagementMessagePayload* getPayload(tStatus& status) const;

  protected:
    void deserializeBody(iSerializableTarget& source, tStatus& status) override;
    void serializeBody(iSerializableTarget& target, tStatus& status) const override;

  private:
    tPortIdentity targetPortIdentity_ = allOnesPortIdentity();
    std::uint8_t startingBoundaryHops_ = 0;
    std::uint8_t boundaryHops_ = 0;
    std::uint32_t actionField_ = tManagementMessagePayload::kGet;
};

}  // namespace nQVPTP000

#endif
