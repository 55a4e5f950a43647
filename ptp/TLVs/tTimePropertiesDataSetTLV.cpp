#include "ptp/TLVs/tTimePropertiesDataSetTLV.h"

#include "platform/tTrace.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tTimePropertiesDataSetTLV::tTimePropertiesDataSetTLV() : tDataFieldTLV(kTimePropertiesDataSet) {
    updateLength();
}

void tTimePropertiesDataSetTLV::trace(nQVTARN000::tTrace& trace) const {
    tManagementTLV::trace(trace);
    trace.append("currentUtcOffset: ").append(currentUtcOffset_);
    trace.append(" UTCV: ").append(currentUtcOffsetValid_);
    trace.append(" LI59: ").append(leap59_);
    trace.append(" LI61: ").append(leap61_).append("\n");
}

tManagementMessagePayload* tTimePropertiesDataSetTLV::respondToGet(iManagedClock& clock,
                                                                   std::uint16_t, tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    currentUtcOffset_ = clock.getCurrentUtcOffset(clockStatus);
    frequencyTraceable_ = clock.getFrequencyTraceable(clockStatus);
    timeTraceable_ = clock.getTimeTraceable(clockStatus);
    ptpTimescale_ = clock.getPtpTimescale(clockStatus);
    leap61_ = clock.getLeap61(clockStatus);
    leap59_ = clock.getLeap59(clockStatus);
    currentUtcOffsetValid_ = clock.getCurrentUtcOffsetValid(clockStatus);
    timeSource_ = clock.getTimeSource(clockStatus);
    return answerGet(clockStatus, status);
}

}  // namespace nQVPTP000
