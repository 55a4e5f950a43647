#ifndef QV_PTP_TLVS_TLOGMINPDELAYREQINTERVALTLV_H
#define QV_PTP_TLVS_TLOGMINPDELAYREQINTERVALTLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// LOG_MIN_PDELAY_REQ_INTERVAL: a port's peer delay request interval, log2 seconds.
class tLogMinPdelayReqIntervalTLV final
    : public tSingleValueTLV<tLogMinPdelayReqIntervalTLV, std::int8_t> {
  public:
    static constexpr std::uint16_t kId = kLogMinPdelayReqInterval;
    static constexpr const char* kLabel = "logMinPdelayReqInterval: ";
    static constexpr std::int8_t kDefault = 0;

    tLogMinPdelayReqIntervalTLV() = default;
    tLogMinPdelayReqIntervalTLV(const tLogMinPdelayReqIntervalTLV&) = default;
    tLogMinPdelayReqIntervalTLV& operator=(const tLogMinPdelayReqIntervalTLV&) = default;

    static std::int8_t get(iManagedClock& clock, std::uint16_t port, tStatus& status) {
        return clock.getLogMinPdelayReqInterval(port, status);
    }
    static void set(iManagedClock& clock, std::uint16_t port, std::int8_t value, tStatus& status) {
        clock.setLogMinPdelayReqInterval(port, value, status);
    }
};

}  // namespace nQVPTP000

#endif
