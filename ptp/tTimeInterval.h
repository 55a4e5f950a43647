#ifndef QV_PTP_TTIMEINTERVAL_H
#define QV_PTP_TTIMEINTERVAL_H

#include <cstdint>

#include "ptp/iPTPSerializable.h"

namespace nQVPTP000 {

// A time interval in units of 2^-16 ns (8 octets, two's complement).
class tTimeInterval : public iPTPSerializable {
  public:
    static constexpr std::uint16_t kSize = 8;

    tTimeInterval() = default;
    // Nanoseconds beyond +-2^47 saturate to the largest or smallest scaled value.
    explicit tTimeInterval(std::int64_t nanoseconds);
    tTimeInterval(const tTimeInterval&) = default;
    tTimeInterval& operator=(const tTimeInterval&) = default;

    bool operator==(const tTimeInterval& other) const {
        return scaledNanoseconds_ == other.scaledNanoseconds_;
    }

    // Whole nanoseconds, rounded toward zero.
    std::int64_t getNanoseconds() const { return scaledNanoseconds_ / 65536; }
    std::int64_t getScaledNanoseconds() const { return scaledNanoseconds_; }
    void setScaledNanoseconds(std::int64_t scaled) { scaledNanoseconds_ = scaled; }

    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override { return kSize; }

  private:
    std::int64_t scaledNanoseconds_ = 0;
};

}  // namespace nQVPTP000

#endif
