#ifndef QV_PTP_TLVS_TDOMAINTLV_H
#define QV_PTP_TLVS_TDOMAINTLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// DOMAIN: the clock's domain number.
class tDomainTLV final : public tSingleValueTLV<tDomainTLV, std::uint8_t> {
  public:
    static constexpr std::uint16_t kId = kDomain;
    static constexpr const char* kLabel = "domainNumber: ";
    static constexpr std::uint8_t kDefault = 0;

    tDomainTLV() = default;
    tDomainTLV(const tDomainTLV&) = default;
    tDomainTLV& operator=(const tDomainTLV&) = default;

    static std::uint8_t get(iManagedClock& clock, std::uint16_t /*port*/, tStatus& status) {
        return clock.getDomainNumber(status);
    }
    static void set(iManagedClock& clock, std::uint16_t /*port*/, std::uint8_t value,
                    tStatus& status) {
        clock.setDomainNumber(value, status);
    }
};

}  // namespace nQVPTP000

#endif
