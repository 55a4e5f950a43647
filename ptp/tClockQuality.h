#ifndef QV_PTP_TCLOCKQUALITY_H
#define QV_PTP_TCLOCKQUALITY_H

#include <cstdint>

#include "ptp/iPTPSerializable.h"

namespace nQVPTP000 {

// clockClass, clockAccuracy and offsetScaledLogVariance (4 octets on the wire). The TLVs
// that hold a quality reach its fields directly.
class tClockQuality : public iPTPSerializable {
  public:
    static constexpr std::uint16_t kSize = 4;

    tClockQuality() = default;
    tClockQuality(const tClockQuality&) = default;
    tClockQuality& operator=(const tClockQuality&) = default;

    bool operator==(const tClockQuality& other) const {
        return clockClass == other.clockClass && clockAccuracy == other.clockAccuracy &&
               offsetScaledLogVariance == other.offsetScaledLogVariance;
    }

    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override { return kSize; }

    std::uint8_t clockClass = 187;
    std::uint32_t clockAccuracy = 0xFE;  // an enumeration; one octet on the wire
    std::uint16_t offsetScaledLogVariance = 0xFFFF;
};

}  // namespace nQVPTP000

#endif
