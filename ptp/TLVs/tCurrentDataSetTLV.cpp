#include "ptp/TLVs/tCurrentDataSetTLV.h"

#include "platform/tTrace.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tCurrentDataSetTLV::tCurrentDataSetTLV() : tDataFieldTLV(kCurrentDataSet) {
    updateLength();
}

void tCurrentDataSetTLV::trace(nQVTARN000::tTrace& trace) const {
    tManagementTLV::trace(trace);
    trace.append("stepsRemoved").append(stepsRemoved_);
    trace.append(" offsetFromMaster").append(offsetFromMaster_);
    trace.append(" meanPathDelay").append(meanPathDelay_).append("\n");
}

tManagementMessagePayload* tCurrentDataSetTLV::respondToGet(iManagedClock& clock, std::uint16_t,
                                                            tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    stepsRemoved_ = clock.getStepsRemoved(clockStatus);
    offsetFromMaster_ = clock.getOffsetFromMaster(clockStatus);
    meanPathDelay_ = clock.getMeanPathDelay(clockStatus);
    return answerGet(clockStatus, status);
}

}  // namespace nQVPTP000
