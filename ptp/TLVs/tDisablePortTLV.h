#ifndef QV_PTP_TLVS_TDISABLEPORTTLV_H
#define QV_PTP_TLVS_TDISABLEPORTTLV_H

#include <cstdint>

#include "ptp/TLVs/tCommandTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// DISABLE_PORT: takes a port out of service.
class tDisablePortTLV final : public tCommandTLV<tDisablePortTLV> {
  public:
    static constexpr std::uint16_t kId = kDisablePort;

    tDisablePortTLV() = default;
    tDisablePortTLV(const tDisablePortTLV&) = default;
    tDisablePortTLV& operator=(const tDisablePortTLV&) = default;

    tManagementMessagePayload* respondToCommand(iManagedClock& clock, std::uint16_t port,
                                                tStatus& status) override {
        tStatus clockStatus;
        if (status.succeeded()) {
            clock.disablePort(port, clockStatus);
        }
        return answerCommand(clockStatus, "Failure disabling port", status);
    }
};

}  // namespace nQVPTP000

#endif
