#include "platform/EthernetAdapters.h"

#include <ifaddrs.h>
#include <linux/if_arp.h>
#include <linux/if_packet.h>
#include <sys/socket.h>

#include <cstring>

namespace qv::dsc::osdep {

namespace {

// The list of interfaces, freed on every path.
class tInterfaceList {
  public:
    tInterfaceList() {
        if (getifaddrs(&first_) != 0) {
            first_ = nullptr;
        }
    }
    ~tInterfaceList() {
        if (first_ != nullptr) {
            freeifaddrs(first_);
        }
    }
    tInterfaceList(const tInterfaceList&) = delete;
    tInterfaceList& operator=(const tInterfaceList&) = delete;

    const ifaddrs* first() const { return first_; }

  private:
    ifaddrs* first_ = nullptr;
};

}  // namespace

std::optional<EthernetAdapters::tMacAddress> EthernetAdapters::firstAddress() {
    const tInterfaceList list;
    for (const ifaddrs* entry = list.first(); entry != nullptr; entry = entry->ifa_next) {
        if (entry->ifa_addr == nullptr || entry->ifa_addr->sa_family != AF_PACKET) {
            continue;
        }
        sockaddr_ll link{};
        std::memcpy(&link, entry->ifa_addr, sizeof(link));
        if (link.sll_hatype == ARPHRD_ETHER && link.sll_halen == 6) {
            tMacAddress address{};
            std::memcpy(address.data(), link.sll_addr, address.size());
            return address;
        }
    }
    return std::nullopt;
}

}  // namespace qv::dsc::osdep
