#ifndef QV_PTP_TLVS_TFAULTLOGRESETTLV_H
#define QV_PTP_TLVS_TFAULTLOGRESETTLV_H

#include <cstdint>

#include "ptp/TLVs/tCommandTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// FAULT_LOG_RESET: asks a clock to empty its fault log. The clocks answered through this
// codec keep no fault log, so the request is acknowledged with the TLV itself.
class tFaultLogResetTLV final : public tCommandTLV<tFaultLogResetTLV> {
  public:
    static constexpr std::uint16_t kId = kFaultLogReset;

    tFaultLogResetTLV() = default;
    tFaultLogResetTLV(const tFaultLogResetTLV&) = default;
    tFaultLogResetTLV& operator=(const tFaultLogResetTLV&) = default;

    tManagementMessagePayload* respondToCommand(iManagedClock& /*clock*/, std::uint16_t /*port*/,
                                                tStatus& status) override {
        return status.failed() ? nullptr : this;
    }
};

}  // namespace nQVPTP000

#endif
