#include "ptp/TLVs/tParentDataSetTLV.h"

#include "platform/tTrace.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tParentDataSetTLV::tParentDataSetTLV() : tDataFieldTLV(kParentDataSet) {
    updateLength();
}

void tParentDataSetTLV::trace(nQVTARN000::tTrace& trace) const {
    tManagementTLV::trace(trace);
    trace.append("parent port identity").append(parentPortIdentity_);
    trace.append("PS").append(parentStats_);
    trace.append("observedParentOffsetScaledLogVariance")
        .append(observedParentOffsetScaledLogVariance_);
    trace.append("observedParentClockPhaseChangeRate").append(observedParentClockPhaseChangeRate_);
    trace.append("grandmasterPriority1").append(grandmasterPriority1_);
    trace.append("grandmasterIdentity").append(grandmasterIdentity_);
    trace.append("grandmasterPriority2").append(grandmasterPriority2_);
    trace.append("grandmasterClockQuality").append(grandmasterClockQuality_).append("\n");
}

tManagementMessagePayload* tParentDataSetTLV::respondToGet(iManagedClock& clock, std::uint16_t,
                                                           tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    parentPortIdentity_ = clock.getParentPortIdentity(clockStatus);
    parentStats_ = clock.getParentStats(clockStatus);
    observedParentOffsetScaledLogVariance_ =
        clock.getObservedParentOffsetScaledLogVariance(clockStatus);
    observedParentClockPhaseChangeRate_ = clock.getObservedParentClockPhaseChangeRate(clockStatus);
    grandmasterPriority1_ = clock.getGrandmasterPriority1(clockStatus);
    grandmasterIdentity_ = clock.getGrandmasterIdentity(clockStatus);
    grandmasterPriority2_ = clock.getGrandmasterPriority2(clockStatus);
    grandmasterClockQuality_ = clock.getGrandmasterClockQuality(clockStatus);
    return answerGet(clockStatus, status);
}

}  // namespace nQVPTP000
