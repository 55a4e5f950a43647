#ifndef QV_PTP_TLVS_TSLAVEONLYTLV_H
#define QV_PTP_TLVS_TSLAVEONLYTLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// SLAVE_ONLY: whether the clock may only be a slave. Only the last bit of the
// value octet counts when read.
class tSlaveOnlyTLV final : public tSingleValueTLV<tSlaveOnlyTLV, bool, tValueForm::kLowBit> {
  public:
    static constexpr std::uint16_t kId = kSlaveOnly;
    static constexpr const char* kLabel = "slaveOnly: ";
    static constexpr bool kDefault = false;

    tSlaveOnlyTLV() = default;
    tSlaveOnlyTLV(const tSlaveOnlyTLV&) = default;
    tSlaveOnlyTLV& operator=(const tSlaveOnlyTLV&) = default;

    static bool get(iManagedClock& clock, std::uint16_t /*port*/, tStatus& status) {
        return clock.getSlaveOnly(status);
    }
    static void set(iManagedClock& clock, std::uint16_t /*port*/, bool value, tStatus& status) {
        clock.setSlaveOnly(value, status);
    }
};

}  // namespace nQVPTP000

#endif
