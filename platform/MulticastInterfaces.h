#ifndef QV_PLATFORM_MULTICASTINTERFACES_H
#define QV_PLATFORM_MULTICASTINTERFACES_H

#include <cstdint>
#include <string>
#include <vector>

namespace qv::dsc::osdep {

// One network interface that can carry PTP over IPv4 multicast.
struct MulticastInterface {
    std::string name;           // as the system names it: "eth0"; on Windows the friendly name
    std::uint32_t index = 0;    // the system's interface index, never 0
    std::uint32_t address = 0;  // its first IPv4 address, network byte order
};

// The computer's interfaces that are up, can multicast, are not loopback and have an IPv4
// address: those on which discovery may send and listen.
class MulticastInterfaces {
  public:
    // In the order in which the system lists them; empty when the list cannot be read.
    static std::vector<MulticastInterface> list();
};

}  // namespace qv::dsc::osdep

#endif
