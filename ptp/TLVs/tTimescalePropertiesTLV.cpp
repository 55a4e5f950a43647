#include "ptp/TLVs/tTimescalePropertiesTLV.h"

#include <algorithm>
#include <array>

#include "platform/tTrace.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

namespace {
// ATOMIC_CLOCK, GPS, TERRESTRIAL_RADIO, PTP, NTP, HAND_SET, OTHER, INTERNAL_OSCILLATOR.
constexpr std::array<std::uint8_t, 8> kTimeSources = {0x10, 0x20, 0x30, 0x40,
                                                      0x50, 0x60, 0x90, 0xA0};
}  // namespace

tTimescalePropertiesTLV::tTimescalePropertiesTLV() : tDataFieldTLV(kTimescaleProperties) {
    updateLength();
}

void tTimescalePropertiesTLV::trace(nQVTARN000::tTrace& trace) const {
    tManagementTLV::trace(trace);
    trace.append("PTP: ").append(ptpTimescale_);
    trace.append(" timeSource: ").append(timeSource_).append("\n");
}

tManagementMessagePayload* tTimescalePropertiesTLV::respondToGet(iManagedClock& clock,
                                                                 std::uint16_t, tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    tStatus clockStatus;
    ptpTimescale_ = clock.getPtpTimescale(clockStatus);
    timeSource_ = clock.getTimeSource(clockStatus);
    return answerGet(clockStatus, status);
}

tManagementMessagePayload* tTimescalePropertiesTLV::respondToSet(iManagedClock& clock,
                                                                 std::uint16_t, tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    const bool known =
        std::find(kTimeSources.begin(), kTimeSources.end(), timeSource_) != kTimeSources.end();
    tStatus clockStatus;
    clock.setPtpTimescale(ptpTimescale_, clockStatus);
    if (!known) {
        return errorAnswer(tManagementErrorStatusTLV::kWrongValue, "Unknown timeSource value",
                           status);
    }
    clock.setTimeSource(timeSource_, clockStatus);
    return answerSet(clockStatus, status);
}

}  // namespace nQVPTP000
