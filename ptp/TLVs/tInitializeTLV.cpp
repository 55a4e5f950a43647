#include "ptp/TLVs/tInitializeTLV.h"

#include "platform/tTrace.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

tInitializeTLV::tInitializeTLV(std::uint16_t initializationKey)
    : tDataFieldTLV(kInitialize), initializationKey_(initializationKey) {
    updateLength();
}

void tInitializeTLV::trace(nQVTARN000::tTrace& trace) const {
    tManagementTLV::trace(trace);
    trace.appendFormatted("initializationKey: %#.4x\n", initializationKey_);
}

tManagementMessagePayload* tInitializeTLV::respondToCommand(iManagedClock& clock,
                                                            std::uint16_t port, tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    if (initializationKey_ != kInitializeEvent) {
        return errorAnswer(tManagementErrorStatusTLV::kWrongValue,
                           "Unknown initialization key value", status);
    }
    tStatus clockStatus;
    clock.initialize(port, clockStatus);
    return answer(clockStatus, "Node failed to initialize", status);
}

}  // namespace nQVPTP000
