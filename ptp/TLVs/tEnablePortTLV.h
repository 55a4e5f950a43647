#ifndef QV_PTP_TLVS_TENABLEPORTTLV_H
#define QV_PTP_TLVS_TENABLEPORTTLV_H

#include <cstdint>

#include "ptp/TLVs/tCommandTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// ENABLE_PORT: puts a disabled port back into service.
class tEnablePortTLV final : public tCommandTLV<tEnablePortTLV> {
  public:
    static constexpr std::uint16_t kId = kEnablePort;

    tEnablePortTLV() = default;
    tEnablePortTLV(const tEnablePortTLV&) = default;
    tEnablePortTLV& operator=(const tEnablePortTLV&) = default;

    tManagementMessagePayload* respondToCommand(iManagedClock& clock, std::uint16_t port,
                                                tStatus& status) override {
        tStatus clockStatus;
        if (status.succeeded()) {
            clock.enablePort(port, clockStatus);
        }
        return answerCommand(clockStatus, "Failure enabling port", status);
    }
};

}  // namespace nQVPTP000

#endif
