#ifndef QV_PTP_TPORTIDENTITY_H
#define QV_PTP_TPORTIDENTITY_H

#include <cstdint>

#include "ptp/tClockIdentity.h"

namespace nQVPTP000 {

// A clock identity and the number of one of its ports (10 octets on the wire).
class tPortIdentity : public iPTPSerializable {
  public:
    static constexpr std::uint16_t kAllPorts = 0xFFFF;

    tPortIdentity() = default;
    tPortIdentity(const tClockIdentity& clockIdentity, std::uint16_t portNumber)
        : clockIdentity_(clockIdentity), portNumber_(portNumber) {}
    tPortIdentity(const tPortIdentity&) = default;
    tPortIdentity& operator=(const tPortIdentity&) = default;

    bool operator==(const tPortIdentity& other) const {
        return clockIdentity_ == other.clockIdentity_ && portNumber_ == other.portNumber_;
    }

    tClockIdentity getClockIdentity() const { return clockIdentity_; }
    std::uint16_t getPortNumber() const { return portNumber_; }
    void setClockIdentity(const tClockIdentity& clockIdentity, tStatus& status);
    void setPortNumber(std::uint16_t portNumber, tStatus& status);

    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override { return clockIdentity_.getSize() + 2; }

  private:
    tClockIdentity clockIdentity_;
    std::uint16_t portNumber_ = 0;
};

// The all-ones clock identity with port 0xFFFF: all ports of all clocks.
const tPortIdentity& allOnesPortIdentity();

}  // namespace nQVPTP000

#endif
