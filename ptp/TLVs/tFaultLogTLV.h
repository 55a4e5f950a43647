#ifndef QV_PTP_TLVS_TFAULTLOGTLV_H
#define QV_PTP_TLVS_TFAULTLOGTLV_H

#include <cstdint>
#include <vector>

#include "ptp/TLVs/tDataFieldTLV.h"
#include "ptp/TLVs/tFaultRecord.h"

namespace nQVPTP000 {

// FAULT_LOG: the clock's recent faults, padded to an even length. Traces only the common
// header.
//
// The records are decoded one at a time into a growing list, never into room reserved for
// the received count: a count that the octets do not back costs nothing beyond the records
// really present, and the first record cut short ends the decoding with -52012.
class tFaultLogTLV final : public tDataFieldTLV<tFaultLogTLV> {
  public:
    tFaultLogTLV();
    tFaultLogTLV(const tFaultLogTLV&) = default;
    tFaultLogTLV& operator=(const tFaultLogTLV&) = default;

    // The count; the records follow it.
    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.field(self.numberOfFaultRecords_);
    }

    void deserializeDataField(iSerializableTarget& source, tStatus& status) override;
    void serializeDataField(iSerializableTarget& target, tStatus& status) const override;
    // Answered with an empty log: the clocks answered through this codec keep none.
    tManagementMessagePayload* respondToGet(iManagedClock& clock, std::uint16_t port,
                                            tStatus& status) override;

    std::uint16_t getNumberOfFaultRecords() const { return numberOfFaultRecords_; }
    const std::vector<tFaultRecord>& getFaultRecords() const { return faultRecords_; }
    bool getPadNeeded() const { return padNeeded_; }

  private:
    void updatePad(tStatus& status);

    std::uint16_t numberOfFaultRecords_ = 0;
    std::vector<tFaultRecord> faultRecords_;
    bool padNeeded_ = false;
};

}  // namespace nQVPTP000

#endif
