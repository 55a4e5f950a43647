#ifndef QV_PTP_TLVS_TPRIORITY2TLV_H
#define QV_PTP_TLVS_TPRIORITY2TLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// PRIORITY2: the clock's priority2 attribute.
class tPriority2TLV final : public tSingleValueTLV<tPriority2TLV, std::uint8_t> {
  public:
    static constexpr std::uint16_t kId = kPriority2;
    static constexpr const char* kLabel = "priority2: ";
    static constexpr std::uint8_t kDefault = 0;

    tPriority2TLV() = default;
    tPriority2TLV(const tPriority2TLV&) = default;
    tPriority2TLV& operator=(const tPriority2TLV&) = default;

    static std::uint8_t get(iManagedClock& clock, std::uint16_t /*port*/, tStatus& status) {
        return clock.getPriority2(status);
    }
    static void set(iManagedClock& clock, std::uint16_t /*port*/, std::uint8_t value,
                    tStatus& status) {
        clock.setPriority2(value, status);
    }
};

}  // namespace nQVPTP000

#endif
