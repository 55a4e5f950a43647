#include "ptp/TLVs/tPortDataSetTLV.h"

#include "platform/tTrace.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tPortDataSetTLV::tPortDataSetTLV() : tDataFieldTLV(kPortDataSet) {
    updateLength();
}

void tPortDataSetTLV::trace(nQVTARN000::tTrace& trace) const {
    tManagementTLV::trace(trace);
    trace.append("portIdentity").append(portIdentity_);
    trace.append(" portState").append(portState_);
    trace.append(" logMinDelayReqInterval").append(logMinDelayReqInterval_);
    trace.append(" peerMeanPathDelay").append(peerMeanPathDelay_);
    trace.append(" logAnnounceInterval").append(logAnnounceInterval_);
    trace.append(" announceReceiptTimeout").append(announceReceiptTimeout_);
    trace.append(" logSyncInterval").append(logSyncInterval_);
    trace.append(" delayMechanism").append(delayMechanism_);
    trace.append(" logMinPdelayReqInterval").append(logMinPdelayReqInterval_);
    trace.append(" versionNumber").append(versionNumber_).append("\n");
}

tManagementMessagePayload* tPortDataSetTLV::respondToGet(iManagedClock& clock, std::uint16_t port,
                                                         tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    portIdentity_ = clock.getPortIdentity(port, clockStatus);
    portState_ = clock.getPortState(port, clockStatus);
    logMinDelayReqInterval_ = clock.getLogMinDelayReqInterval(port, clockStatus);
    peerMeanPathDelay_ = clock.getPeerMeanPathDelay(port, clockStatus);
    logAnnounceInterval_ = clock.getLogAnnounceInterval(port, clockStatus);
    announceReceiptTimeout_ = clock.getAnnounceReceiptTimeout(port, clockStatus);
    logSyncInterval_ = clock.getLogSyncInterval(port, clockStatus);
    delayMechanism_ = clock.getDelayMechanism(port, clockStatus);
    logMinPdelayReqInterval_ = clock.getLogMinPdelayReqInterval(port, clockStatus);
    versionNumber_ = clock.getVersionNumber(port, clockStatus);
    return answerGet(clockStatus, status);
}

}  // namespace nQVPTP000
