#include "ptp/TLVs/tDefaultDataSetTLV.h"

#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tDefaultDataSetTLV::tDefaultDataSetTLV() : tDataFieldTLV(kDefaultDataSet) {
    updateLength();
}

tManagementMessagePayload* tDefaultDataSetTLV::respondToGet(iManagedClock& clock, std::uint16_t,
                                                            tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    slaveOnly_ = clock.getSlaveOnly(clockStatus);
    twoStepFlag_ = clock.getTwoStepFlag(clockStatus);
    numberPorts_ = clock.getNumberPorts(clockStatus);
    priority1_ = clock.getPriority1(clockStatus);
    priority2_ = clock.getPriority2(clockStatus);
    domainNumber_ = clock.getDomainNumber(clockStatus);
    clockQuality_ = clock.getClockQuality(clockStatus);
    clockIdentity_ = clock.getClockIdentity(clockStatus);
    return answerGet(clockStatus, status);
}

}  // namespace nQVPTP000
