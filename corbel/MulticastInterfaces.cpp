#include "corbel/MulticastInterfaces.h"

#include <ifaddrs.h>
#include <net/if.h>
#include <netinet/in.h>

#include <algorithm>

namespace corbel {

std::vector<std::string> MulticastInterfaces::names() {
    std::vector<std::string> names;
    ifaddrs* list = nullptr;
    if (getifaddrs(&list) != 0) {
        return names;
    }
    for (const ifaddrs* entry = list; entry != nullptr; entry = entry->ifa_next) {
        const unsigned flags = entry->ifa_flags;
        if (entry->ifa_addr != nullptr && entry->ifa_addr->sa_family == AF_INET &&
            (flags & IFF_UP) != 0 && (flags & IFF_MULTICAST) != 0 && (flags & IFF_LOOPBACK) == 0 &&
            std::ranges::find(names, entry->ifa_name) == names.end()) {
            names.emplace_back(entry->ifa_name);
        }
    }
    freeifaddrs(list);
    return names;
}

}  // namespace corbel
