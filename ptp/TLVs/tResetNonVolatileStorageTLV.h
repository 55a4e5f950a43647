#ifndef QV_PTP_TLVS_TRESETNONVOLATILESTORAGETLV_H
#define QV_PTP_TLVS_TRESETNONVOLATILESTORAGETLV_H

#include <cstdint>

#include "ptp/TLVs/tCommandTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// RESET_NON_VOLATILE_STORAGE: forget the kept data sets. Not offered.
class tResetNonVolatileStorageTLV final : public tCommandTLV<tResetNonVolatileStorageTLV> {
  public:
    static constexpr std::uint16_t kId = kResetNonVolatileStorage;

    tResetNonVolatileStorageTLV() = default;
    tResetNonVolatileStorageTLV(const tResetNonVolatileStorageTLV&) = default;
    tResetNonVolatileStorageTLV& operator=(const tResetNonVolatileStorageTLV&) = default;

    tManagementMessagePayload* respondToCommand(iManagedClock& /*clock*/, std::uint16_t /*port*/,
                                                tStatus& status) override {
        return errorAnswer(tManagementErrorStatusTLV::kNotSupported,
                           "Non-volatile storage is currently unsupported", status);
    }
};

}  // namespace nQVPTP000

#endif
