#ifndef QV_PTP_TCLOCKIDENTITY_H
#define QV_PTP_TCLOCKIDENTITY_H

#include <array>
#include <cstdint>

#include "ptp/iPTPSerializable.h"

namespace nQVPTP000 {

// The eight octets that name a clock, in wire order.
class tClockIdentity : public iPTPSerializable {
  public:
    static constexpr std::uint16_t kSize = 8;

    tClockIdentity() = default;
    explicit tClockIdentity(const std::uint8_t* octets);
    tClockIdentity(const tClockIdentity&) = default;
    tClockIdentity& operator=(const tClockIdentity&) = default;

    bool operator==(const tClockIdentity& other) const { return octets_ == other.octets_; }

    const std::uint8_t* getOctets() const { return octets_.data(); }
    std::uint8_t operator[](std::size_t index) const { return octets_[index]; }

    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override { return kSize; }

  private:
    std::array<std::uint8_t, kSize> octets_{};
};

// All eight octets 0xFF: the identity that addresses every clock.
const tClockIdentity& allOnesClockIdentity();

}  // namespace nQVPTP000

#endif
