#ifndef QV_PTP_TLVS_TLOGSYNCINTERVALTLV_H
#define QV_PTP_TLVS_TLOGSYNCINTERVALTLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// LOG_SYNC_INTERVAL: a port's sync interval, log2 seconds.
class tLogSyncIntervalTLV final : public tSingleValueTLV<tLogSyncIntervalTLV, std::int8_t> {
  public:
    static constexpr std::uint16_t kId = kLogSyncInterval;
    static constexpr const char* kLabel = "logSyncInterval: ";
    static constexpr std::int8_t kDefault = 0;

    tLogSyncIntervalTLV() = default;
    tLogSyncIntervalTLV(const tLogSyncIntervalTLV&) = default;
    tLogSyncIntervalTLV& operator=(const tLogSyncIntervalTLV&) = default;

    static std::int8_t get(iManagedClock& clock, std::uint16_t port, tStatus& status) {
        return clock.getLogSyncInterval(port, status);
    }
    static void set(iManagedClock& clock, std::uint16_t port, std::int8_t value, tStatus& status) {
        clock.setLogSyncInterval(port, value, status);
    }
};

}  // namespace nQVPTP000

#endif
