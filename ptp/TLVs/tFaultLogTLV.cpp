#include "ptp/TLVs/tFaultLogTLV.h"

#include <new>

#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tFaultLogTLV::tFaultLogTLV() : tDataFieldTLV(kFaultLog) {
    tStatus scratch;
    updatePad(scratch);
}

void tFaultLogTLV::updatePad(tStatus& status) {
    std::uint16_t length = dataFieldSize();
    for (const tFaultRecord& record : faultRecords_) {
        length = static_cast<std::uint16_t>(length + record.getSize());
    }
    padNeeded_ = setDataLength(length, status, 2) != 0;
}

void tFaultLogTLV::deserializeDataField(iSerializableTarget& source, tStatus& status) {
    tFieldReader reader(source, status);
    walk(*this, reader);
    if (status.failed()) {
        return;
    }
    faultRecords_.clear();
    try {
        for (std::uint16_t i = 0; i < numberOfFaultRecords_ && status.succeeded(); ++i) {
            tFaultRecord record;
            record.deserialize(source, status);
            if (status.succeeded()) {
                faultRecords_.push_back(std::move(record));
            }
        }
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
    }
    updatePad(status);
    if (padNeeded_) {
        reader.reserved(1);
    }
}

void tFaultLogTLV::serializeDataField(iSerializableTarget& target, tStatus& status) const {
    tFieldWriter writer(target, status);
    walk(*this, writer);
    for (const tFaultRecord& record : faultRecords_) {
        record.serialize(target, status);
    }
    if (padNeeded_) {
        writer.reserved(1);
    }
}

tManagementMessagePayload* tFaultLogTLV::respondToGet(iManagedClock&, std::uint16_t,
                                                      tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    numberOfFaultRecords_ = 0;
    faultRecords_.clear();
    updatePad(status);
    return this;
}

}  // namespace nQVPTP000
