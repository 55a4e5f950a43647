#ifndef QV_PTP_TLVS_TDELAYMECHANISMTLV_H
#define QV_PTP_TLVS_TDELAYMECHANISMTLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// DELAY_MECHANISM: how a port measures its path delay.
class tDelayMechanismTLV final : public tSingleValueTLV<tDelayMechanismTLV, std::uint8_t> {
  public:
    static constexpr std::uint16_t kId = kDelayMechanism;
    static constexpr const char* kLabel = "delayMechanism: ";
    static constexpr std::uint8_t kDefault = 1;

    tDelayMechanismTLV() = default;
    tDelayMechanismTLV(const tDelayMechanismTLV&) = default;
    tDelayMechanismTLV& operator=(const tDelayMechanismTLV&) = default;

    static std::uint8_t get(iManagedClock& clock, std::uint16_t port, tStatus& status) {
        return clock.getDelayMechanism(port, status);
    }
    static void set(iManagedClock& clock, std::uint16_t port, std::uint8_t value, tStatus& status) {
        clock.setDelayMechanism(port, value, status);
    }

    // E2E, P2P and DISABLED are the mechanisms a port can be set to.
    static const char* refusal(std::uint8_t value) {
        return value == 0x01 || value == 0x02 || value == 0xFE ? nullptr
                                                               : "Unsupported delayMechanism value";
    }
};

}  // namespace nQVPTP000

#endif
