#include "ptp/TLVs/tTimeTLV.h"

#include "platform/tTrace.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tTimeTLV::tTimeTLV() : tDataFieldTLV(kTime) {
    updateLength();
}

void tTimeTLV::trace(nQVTARN000::tTrace& trace) const {
    tManagementTLV::trace(trace);
    trace.append("currentTime: ").append(currentTime_).append("\n");
}

void tTimeTLV::setCurrentTime(const tTimestamp& currentTime, tStatus& status) {
    if (status.succeeded()) {
        currentTime_ = currentTime;
    }
}

tManagementMessagePayload* tTimeTLV::respondToGet(iManagedClock& clock, std::uint16_t,
                                                  tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    const tTimestamp now = clock.getTime(clockStatus);
    if (clockStatus.succeeded()) {
        currentTime_ = now;
    }
    return answerGet(clockStatus, status);
}

tManagementMessagePayload* tTimeTLV::respondToSet(iManagedClock& clock, std::uint16_t,
                                                  tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    const bool grandmaster =
        clock.getClockIdentity(clockStatus) == clock.getGrandmasterIdentity(clockStatus);
    if (clockStatus.succeeded() && !grandmaster) {
        return errorAnswer(tManagementErrorStatusTLV::kNotSupported,
                           "Cannot set time on non-grandmaster clock", status);
    }
    clock.setTime(currentTime_, clockStatus);
    return answerSet(clockStatus, status);
}

}  // namespace nQVPTP000
