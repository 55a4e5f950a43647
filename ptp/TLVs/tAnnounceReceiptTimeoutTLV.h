#ifndef QV_PTP_TLVS_TANNOUNCERECEIPTTIMEOUTTLV_H
#define QV_PTP_TLVS_TANNOUNCERECEIPTTIMEOUTTLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// ANNOUNCE_RECEIPT_TIMEOUT: a port's announce intervals before a timeout.
class tAnnounceReceiptTimeoutTLV final
    : public tSingleValueTLV<tAnnounceReceiptTimeoutTLV, std::uint8_t> {
  public:
    static constexpr std::uint16_t kId = kAnnounceReceiptTimeout;
    static constexpr const char* kLabel = "announceReceiptTimeout: ";
    static constexpr std::uint8_t kDefault = 0;

    tAnnounceReceiptTimeoutTLV() = default;
    tAnnounceReceiptTimeoutTLV(const tAnnounceReceiptTimeoutTLV&) = default;
    tAnnounceReceiptTimeoutTLV& operator=(const tAnnounceReceiptTimeoutTLV&) = default;

    static std::uint8_t get(iManagedClock& clock, std::uint16_t port, tStatus& status) {
        return clock.getAnnounceReceiptTimeout(port, status);
    }
    static void set(iManagedClock& clock, std::uint16_t port, std::uint8_t value, tStatus& status) {
        clock.setAnnounceReceiptTimeout(port, value, status);
    }
};

}  // namespace nQVPTP000

#endif
