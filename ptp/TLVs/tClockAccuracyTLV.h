#ifndef QV_PTP_TLVS_TCLOCKACCURACYTLV_H
#define QV_PTP_TLVS_TCLOCKACCURACYTLV_H

#include <cstdint>

#include "ptp/TLVs/tSingleValueTLV.h"
#include "ptp/tManagementIdTable.h"

namespace nQVPTP000 {

// CLOCK_ACCURACY: the accuracy of the clock's time, an IEEE 1588-2008 enumeration.
class tClockAccuracyTLV final : public tSingleValueTLV<tClockAccuracyTLV, std::uint8_t> {
  public:
    static constexpr std::uint16_t kId = kClockAccuracy;
    static constexpr const char* kLabel = "clockAccuracy: ";
    static constexpr std::uint8_t kDefault = 0xFE;

    tClockAccuracyTLV() = default;
    tClockAccuracyTLV(const tClockAccuracyTLV&) = default;
    tClockAccuracyTLV& operator=(const tClockAccuracyTLV&) = default;

    static std::uint8_t get(iManagedClock& clock, std::uint16_t /*port*/, tStatus& status) {
        return static_cast<std::uint8_t>(clock.getClockQuality(status).clockAccuracy);
    }
    static void set(iManagedClock& clock, std::uint16_t /*port*/, std::uint8_t value,
                    tStatus& status) {
        clock.setClockAccuracy(value, status);
    }

    // The enumerated accuracies 0x20 (25 ns) to 0x31 (over 10 s) and 0xFE (unknown).
    static const char* refusal(std::uint8_t value) {
        return (value >= 0x20 && value <= 0x31) || value == 0xFE
                   ? nullptr
                   : "Unsupported clockAccuracy value";
    }

    // "clockAccuracy: " and the value as two hex digits.
    void trace(nQVTARN000::tTrace& trace) const override {
        tManagementTLV::trace(trace);
        trace.appendFormatted("clockAccuracy: %#.2x\n", value_);
    }
};

}  // namespace nQVPTP000

#endif
