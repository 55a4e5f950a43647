#ifndef QV_CORBEL_MULTICASTINTERFACES_H
#define QV_CORBEL_MULTICASTINTERFACES_H

#include <string>
#include <vector>

namespace corbel {

// The machine's network interfaces that can carry PTP: up, with an IPv4 address, able to
// multicast, not the loopback. Discovery that finds nothing on a machine with more than
// one of them may have used the wrong one. getifaddrs on POSIX (MulticastInterfaces.cpp),
// GetAdaptersAddresses on Windows (MulticastInterfacesWin32.cpp, the adapters' friendly
// names).
class MulticastInterfaces {
  public:
    static std::vector<std::string> names();
};

}  // namespace corbel

#endif
