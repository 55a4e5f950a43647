#include "platform/MulticastInterfaces.h"

#include <ifaddrs.h>
#include <net/if.h>
#include <netinet/in.h>

#include <algorithm>
#include <cstring>
#include <memory>

namespace qv::dsc::osdep {

std::vector<MulticastInterface> MulticastInterfaces::list() {
    ifaddrs* first = nullptr;
    if (getifaddrs(&first) != 0) {
        return {};
    }
    const std::unique_ptr<ifaddrs, void (*)(ifaddrs*)> owned(first, freeifaddrs);
    std::vector<MulticastInterface> found;
    for (const ifaddrs* entry = first; entry != nullptr; entry = entry->ifa_next) {
        const unsigned flags = entry->ifa_flags;
        if (entry->ifa_addr == nullptr || entry->ifa_addr->sa_family != AF_INET ||
            (flags & IFF_UP) == 0 || (flags & IFF_MULTICAST) == 0 || (flags & IFF_LOOPBACK) != 0) {
            continue;
        }
        // An interface with several IPv4 addresses is listed once, with its first.
        const auto known = [entry](const MulticastInterface& i) {
            return i.name == entry->ifa_name;
        };
        const unsigned index = if_nametoindex(entry->ifa_name);
        if (index == 0 || std::ranges::any_of(found, known)) {
            continue;
        }
        sockaddr_in address{};
        std::memcpy(&address, entry->ifa_addr, sizeof(address));
        found.push_back({entry->ifa_name, index, address.sin_addr.s_addr});
    }
    return found;
}

}  // namespace qv::dsc::osdep
