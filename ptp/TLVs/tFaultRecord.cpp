#include "ptp/TLVs/tFaultRecord.h"

#include "platform/tTrace.h"
#include "ptp/TLVs/tFieldReader.h"
#include "ptp/TLVs/tFieldSizer.h"
#include "ptp/TLVs/tFieldWriter.h"

namespace nQVPTP000 {

tFaultRecord::tFaultRecord() {
    faultRecordLength_ = fieldsLength();
}

std::uint16_t tFaultRecord::fieldsLength() const {
    tFieldSizer sizer;
    walk(*this, sizer);
    return static_cast<std::uint16_t>(sizer.size() - 2);
}

void tFaultRecord::trace(nQVTARN000::tTrace& trace) const {
    trace.appendFormatted("faultRecordLength: %u ", faultRecordLength_);
    trace.append("faultTime: ").append(faultTime_).append(" ");
    trace.appendFormatted("severityCode: %#.2x ", severityCode_);
    trace.append("faultName: ").append(faultName_).append(" ");
    trace.append("faultValue: ").append(faultValue_).append(" ");
    trace.append("faultDescription: ").append(faultDescription_);
}

void tFaultRecord::serialize(iSerializableTarget& target, tStatus& status) const {
    tFieldWriter writer(target, status);
    walk(*this, writer);
    const std::uint16_t fields = fieldsLength();
    if (faultRecordLength_ > fields) {
        writer.reserved(faultRecordLength_ - fields);
    }
}

void tFaultRecord::deserialize(iSerializableTarget& source, tStatus& status) {
    tFieldReader reader(source, status);
    walk(*this, reader);
    if (status.failed()) {
        return;
    }
    const std::uint16_t fields = fieldsLength();
    if (faultRecordLength_ < fields) {
        QV_STATUS_SET(status, kStatusBadContent, kComponentCodec);
        return;
    }
    reader.skip(faultRecordLength_ - fields);
}

}  // namespace nQVPTP000
