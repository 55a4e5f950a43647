#ifndef QV_PTP_TLVS_TVERSIONNUMBERTLV_H
#define QV_PTP_TLVS_TVERSIONNUMBERTLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// VERSION_NUMBER: a port's PTP version, in the low nibble of the value octet.
class tVersionNumberTLV final
    : public tSingleValueTLV<tVersionNumberTLV, std::uint8_t, tValueForm::kLowNibble> {
  public:
    static constexpr std::uint16_t kId = kVersionNumber;
    static constexpr const char* kLabel = "versionNumber: ";
    static constexpr std::uint8_t kDefault = 0;

    tVersionNumberTLV() = default;
    tVersionNumberTLV(const tVersionNumberTLV&) = default;
    tVersionNumberTLV& operator=(const tVersionNumberTLV&) = default;

    static std::uint8_t get(iManagedClock& clock, std::uint16_t port, tStatus& status) {
        return clock.getVersionNumber(port, status);
    }
    static void set(iManagedClock& clock, std::uint16_t port, std::uint8_t value, tStatus& status) {
        clock.setVersionNumber(port, value, status);
    }
};

}  // namespace nQVPTP000

#endif
