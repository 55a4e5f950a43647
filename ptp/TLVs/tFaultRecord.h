#ifndef QV_PTP_TLVS_TFAULTRECORD_H
#define QV_PTP_TLVS_TFAULTRECORD_H

#include <cstdint>

#include "ptp/iPTPSerializable.h"
#include "ptp/tPTPText.h"
#include "ptp/tTimestamp.h"

namespace nQVPTP000 {

// One entry of a fault log: faultRecordLength, then the time, severity and three texts.
//
// faultRecordLength says how many octets follow it. A record whose length claims more than
// its fields take is read up to that length (the surplus octets are skipped and written back
// as zeros), so the next record starts where the sender put it; a record whose length
// claims less than its fields take is malformed and refused with -52002, which drops the
// fault log that holds it (and nothing else). Either way getSize is the octets the record
// really takes on the wire.
class tFaultRecord : public iPTPSerializable {
  public:
    // Every record is at least this long: length, time, severity and three empty texts.
    static constexpr std::uint16_t kMinimumSize = 16;

    tFaultRecord();
    tFaultRecord(const tFaultRecord&) = default;
    tFaultRecord& operator=(const tFaultRecord&) = default;

    template <typename Self, typename Visitor>
    static void walk(Self& self, Visitor& visitor) {
        visitor.field(self.faultRecordLength_);
        visitor.field(self.faultTime_);
        visitor.field(self.severityCode_);
        visitor.field(self.faultName_);
        visitor.field(self.faultValue_);
        visitor.field(self.faultDescription_);
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override {
        return static_cast<std::uint16_t>(faultRecordLength_ + 2);
    }

    std::uint16_t getFaultRecordLength() const { return faultRecordLength_; }
    tTimestamp getFaultTime() const { return faultTime_; }
    std::uint8_t getSeverityCode() const { return severityCode_; }
    tPTPText getFaultName() const { return faultName_; }
    tPTPText getFaultValue() const { return faultValue_; }
    tPTPText getFaultDescription() const { return faultDescription_; }

  private:
    // The octets after faultRecordLength that the fields take.
    std::uint16_t fieldsLength() const;

    std::uint16_t faultRecordLength_ = 0;
    tTimestamp faultTime_;
    std::uint8_t severityCode_ = 7;  // DEBUG
    tPTPText faultName_;
    tPTPText faultValue_;
    tPTPText faultDescription_;
};

}  // namespace nQVPTP000

#endif
