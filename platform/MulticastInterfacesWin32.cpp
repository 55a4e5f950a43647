#include <winsock2.h>
// After winsock2.h, which they need.
#include <iphlpapi.h>
#include <ws2tcpip.h>

#include <cstring>
#include <vector>

#include "platform/CodePage.h"
#include "platform/Exception.h"
#include "platform/MulticastInterfaces.h"

namespace qv::dsc::osdep {

// Windows backend: the IP helper's adapter list with its IPv4 addresses. GetAdaptersInfo
// knows neither the friendly names that people use nor whether an adapter multicasts.

namespace {

// The size that the IP helper's documentation suggests for a first try.
constexpr ULONG kFirstTryOctets = 15 * 1024;
constexpr ULONG kFlags = GAA_FLAG_SKIP_ANYCAST | GAA_FLAG_SKIP_MULTICAST | GAA_FLAG_SKIP_DNS_SERVER;

// The adapter list, grown while the system asks for more (adapters may come between calls).
std::vector<std::uint8_t> adapterList() {
    std::vector<std::uint8_t> buffer(kFirstTryOctets);
    for (int attempt = 0; attempt < 3; ++attempt) {
        ULONG size = static_cast<ULONG>(buffer.size());
        const ULONG result =
            GetAdaptersAddresses(AF_INET, kFlags, nullptr,
                                 reinterpret_cast<IP_ADAPTER_ADDRESSES*>(buffer.data()), &size);
        if (result == ERROR_SUCCESS) {
            return buffer;
        }
        if (result != ERROR_BUFFER_OVERFLOW) {
            break;
        }
        buffer.assign(size, 0);
    }
    return {};
}

// In the process's code page, as getenv gives the names to match (see DiscoveryInterfaces).
std::string narrowOf(const wchar_t* wide) {
    try {
        return CodePage::wideToAnsi(reinterpret_cast<const char16_t*>(wide), "");
    } catch (const exception::Exception&) {
        return {};  // not valid UTF-16: a name that no one can type
    }
}

}  // namespace

std::vector<MulticastInterface> MulticastInterfaces::list() {
    std::vector<std::uint8_t> buffer = adapterList();
    std::vector<MulticastInterface> found;
    if (buffer.empty()) {
        return found;
    }
    for (auto* adapter = reinterpret_cast<const IP_ADAPTER_ADDRESSES*>(buffer.data());
         adapter != nullptr; adapter = adapter->Next) {
        const IP_ADAPTER_UNICAST_ADDRESS* unicast = adapter->FirstUnicastAddress;
        if (adapter->OperStatus != IfOperStatusUp || adapter->IfType == IF_TYPE_SOFTWARE_LOOPBACK ||
            (adapter->Flags & IP_ADAPTER_NO_MULTICAST) != 0 || adapter->IfIndex == 0 ||
            unicast == nullptr || unicast->Address.lpSockaddr->sa_family != AF_INET) {
            continue;
        }
        sockaddr_in address{};
        std::memcpy(&address, unicast->Address.lpSockaddr, sizeof(address));
        found.push_back(
            {narrowOf(adapter->FriendlyName), adapter->IfIndex, address.sin_addr.s_addr});
    }
    return found;
}

}  // namespace qv::dsc::osdep
