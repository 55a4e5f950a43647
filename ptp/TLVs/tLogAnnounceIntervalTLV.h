#ifndef QV_PTP_TLVS_TLOGANNOUNCEINTERVALTLV_H
#define QV_PTP_TLVS_TLOGANNOUNCEINTERVALTLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// LOG_ANNOUNCE_INTERVAL: a port's announce interval, log2 seconds.
class tLogAnnounceIntervalTLV final : public tSingleValueTLV<tLogAnnounceIntervalTLV, std::int8_t> {
  public:
    static constexpr std::uint16_t kId = kLogAnnounceInterval;
    static constexpr const char* kLabel = "logAnnounceInterval: ";
    static constexpr std::int8_t kDefault = 0;

    tLogAnnounceIntervalTLV() = default;
    tLogAnnounceIntervalTLV(const tLogAnnounceIntervalTLV&) = default;
    tLogAnnounceIntervalTLV& operator=(const tLogAnnounceIntervalTLV&) = default;

    static std::int8_t get(iManagedClock& clock, std::uint16_t port, tStatus& status) {
        return clock.getLogAnnounceInterval(port, status);
    }
    static void set(iManagedClock& clock, std::uint16_t port, std::int8_t value, tStatus& status) {
        clock.setLogAnnounceInterval(port, value, status);
    }
};

}  // namespace nQVPTP000

#endif
