#include "ptp/TLVs/tTraceabilityPropertiesTLV.h"

#include "platform/tTrace.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tTraceabilityPropertiesTLV::tTraceabilityPropertiesTLV() : tDataFieldTLV(kTraceabilityProperties) {
    updateLength();
}

void tTraceabilityPropertiesTLV::trace(nQVTARN000::tTrace& trace) const {
    tManagementTLV::trace(trace);
    trace.append("FTRA: ").append(frequencyTraceable_);
    trace.append(" TTRA: ").append(timeTraceable_).append("\n");
}

tManagementMessagePayload* tTraceabilityPropertiesTLV::respondToGet(iManagedClock& clock,
                                                                    std::uint16_t,
                                                                    tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    timeTraceable_ = clock.getTimeTraceable(clockStatus);
    frequencyTraceable_ = clock.getFrequencyTraceable(clockStatus);
    return answerGet(clockStatus, status);
}

tManagementMessagePayload* tTraceabilityPropertiesTLV::respondToSet(iManagedClock& clock,
                                                                    std::uint16_t,
                                                                    tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    clock.setTimeTraceable(timeTraceable_, clockStatus);
    clock.setFrequencyTraceable(frequencyTraceable_, clockStatus);
    return answerSet(clockStatus, status);
}

}  // namespace nQVPTP000
