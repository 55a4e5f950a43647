#ifndef QV_PTP_TPORTADDRESS_H
#define QV_PTP_TPORTADDRESS_H

#include <array>
#include <cstdint>

#include "ptp/iPTPSerializable.h"

namespace nQVPTP000 {

// A protocol address: networkProtocol, addressLength and that many address octets, kept
// inside the object. Room for 16 octets covers the longest standard address (IPv6).
class tPortAddress : public iPTPSerializable {
  public:
    static constexpr std::uint16_t kMaxAddressLength = 16;
    static constexpr std::uint16_t kUnknownProtocol = 0xFFFE;

    tPortAddress() = default;
    // An address longer than the room records -52005 and leaves the address empty.
    tPortAddress(std::uint16_t networkProtocol, std::uint16_t addressLength,
                 const std::uint8_t* address, tStatus& status);
    tPortAddress(const tPortAddress& other);
    tPortAddress& operator=(const tPortAddress& other);

    bool operator==(const tPortAddress& other) const;

    std::uint16_t getNetworkProtocol() const { return networkProtocol_; }
    std::uint16_t getAddressLength() const { return addressLength_; }
    const std::uint8_t* getAddressField() const { return addressField_.data(); }

    void trace(nQVTARN000::tTrace& trace) const override;
    void serialize(iSerializableTarget& target, tStatus& status) const override;
    // A received addressLength beyond the room: its octets are skipped and the address
    // becomes the unknown one (networkProtocol 0xFFFE, no octets).
    void deserialize(iSerializableTarget& source, tStatus& status) override;
    std::uint16_t getSize() const override {
        return static_cast<std::uint16_t>(addressLength_ + 4);
    }

  private:
    std::uint16_t networkProtocol_ = kUnknownProtocol;
    std::uint16_t addressLength_ = 0;
    std::array<std::uint8_t, kMaxAddressLength> addressField_{};
};

}  // namespace nQVPTP000

#endif
