#ifndef QV_PTP_TLVS_TPRIORITY1TLV_H
#define QV_PTP_TLVS_TPRIORITY1TLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// PRIORITY1: the clock's priority1 attribute.
class tPriority1TLV final : public tSingleValueTLV<tPriority1TLV, std::uint8_t> {
  public:
    static constexpr std::uint16_t kId = kPriority1;
    static constexpr const char* kLabel = "priority1: ";
    static constexpr std::uint8_t kDefault = 0;

    tPriority1TLV() = default;
    tPriority1TLV(const tPriority1TLV&) = default;
    tPriority1TLV& operator=(const tPriority1TLV&) = default;

    static std::uint8_t get(iManagedClock& clock, std::uint16_t /*port*/, tStatus& status) {
        return clock.getPriority1(status);
    }
    static void set(iManagedClock& clock, std::uint16_t /*port*/, std::uint8_t value,
                    tStatus& status) {
        clock.setPriority1(value, status);
    }
};

}  // namespace nQVPTP000

#endif
