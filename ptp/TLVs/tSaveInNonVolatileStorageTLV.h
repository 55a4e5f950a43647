#ifndef QV_PTP_TLVS_TSAVEINNONVOLATILESTORAGETLV_H
#define QV_PTP_TLVS_TSAVEINNONVOLATILESTORAGETLV_H

#include <cstdint>

#include "ptp/TLVs/tCommandTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// SAVE_IN_NON_VOLATILE_STORAGE: keep the current data sets across a restart. Not offered.
class tSaveInNonVolatileStorageTLV final : public tCommandTLV<tSaveInNonVolatileStorageTLV> {
  public:
    static constexpr std::uint16_t kId = kSaveInNonVolatileStorage;

    tSaveInNonVolatileStorageTLV() = default;
    tSaveInNonVolatileStorageTLV(const tSaveInNonVolatileStorageTLV&) = default;
    tSaveInNonVolatileStorageTLV& operator=(const tSaveInNonVolatileStorageTLV&) = default;

    tManagementMessagePayload* respondToCommand(iManagedClock& /*clock*/, std::uint16_t /*port*/,
                                                tStatus& status) override {
        return errorAnswer(tManagementErrorStatusTLV::kNotSupported,
                           "Non-volatile storage is currently unsupported", status);
    }
};

}  // namespace nQVPTP000

#endif
