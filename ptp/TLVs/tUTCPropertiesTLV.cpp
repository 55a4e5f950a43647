#include "ptp/TLVs/tUTCPropertiesTLV.h"

#include "platform/tTrace.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tUTCPropertiesTLV::tUTCPropertiesTLV() : tDataFieldTLV(kUtcProperties) {
    updateLength();
}

void tUTCPropertiesTLV::trace(nQVTARN000::tTrace& trace) const {
    tManagementTLV::trace(trace);
    trace.appendFormatted("currentUtcOffset: %d ", currentUtcOffset_);
    trace.append("UTCV: ").append(currentUtcOffsetValid_);
    trace.append(" LI59: ").append(leap59_);
    trace.append(" LI61: ").append(leap61_).append("\n");
}

tManagementMessagePayload* tUTCPropertiesTLV::respondToGet(iManagedClock& clock, std::uint16_t,
                                                           tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    currentUtcOffset_ = clock.getCurrentUtcOffset(clockStatus);
    currentUtcOffsetValid_ = clock.getCurrentUtcOffsetValid(clockStatus);
    leap59_ = clock.getLeap59(clockStatus);
    leap61_ = clock.getLeap61(clockStatus);
    return answerGet(clockStatus, status);
}

tManagementMessagePayload* tUTCPropertiesTLV::respondToSet(iManagedClock& clock, std::uint16_t,
                                                           tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    clock.setCurrentUtcOffset(currentUtcOffset_, clockStatus);
    clock.setCurrentUtcOffsetValid(currentUtcOffsetValid_, clockStatus);
    clock.setLeap59(leap59_, clockStatus);
    clock.setLeap61(leap61_, clockStatus);
    return answerSet(clockStatus, status);
}

}  // namespace nQVPTP000
