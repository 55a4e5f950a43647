#ifndef QV_PLATFORM_ETHERNETADAPTERS_H
#define QV_PLATFORM_ETHERNETADAPTERS_H

#include <array>
#include <cstdint>
#include <optional>

namespace qv::dsc::osdep {

// The computer's Ethernet adapters as the source of this system's own clock identity.
class EthernetAdapters {
  public:
    using tMacAddress = std::array<std::uint8_t, 6>;
    using tClockIdentity = std::array<std::uint8_t, 8>;

    // The hardware address of the first Ethernet adapter in the order in which the system
    // lists its interfaces (loopback and other link types are passed over); nothing when
    // there is none or the list cannot be read.
    static std::optional<tMacAddress> firstAddress();

    // EUI-64 of a MAC address: its first three octets, FF FE, its last three octets.
    // Without an address, the eight octets "QVPTPCLK".
    static tClockIdentity clockIdentityOf(const std::optional<tMacAddress>& address) {
        if (!address) {
            return {'Q', 'V', 'P', 'T', 'P', 'C', 'L', 'K'};
        }
        const tMacAddress& mac = *address;
        return {mac[0], mac[1], mac[2], 0xFF, 0xFE, mac[3], mac[4], mac[5]};
    }
    static tClockIdentity localClockIdentity() { return clockIdentityOf(firstAddress()); }
};

}  // namespace qv::dsc::osdep

#endif
